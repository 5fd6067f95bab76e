#include "settings/NavigatorSettings.h"
#include "app/ApplicationInfo.h"
#include "libs/toolwell/CHarborUtils.h"
#include "settings/ISettingsWindow.h"
#include "support/AmbrelTest.h"

#include <QStringList>

namespace {

class NavigatorSettingsTest : public AmbrelTest {
protected:
    static NavigatorSettings* Settings() { return NavigatorSettings::Instance(); }

    // The five type filters, in the order notes, qmd, doc, pdf, all.
    static QList<bool> TypeFilters() {
        NavigatorSettings* s = Settings();
        return {s->GetShowNotes(), s->GetShowQmd(), s->GetShowDoc(), s->GetShowPdf(),
                s->GetShowAllTypes()};
    }
};

class RecordingWindow final : public ISettingsWindow {
public:
    void SetKeepOnTop(bool onTop) override { calls.append(Call(u"top", onTop)); }
    void ShowFrame(bool show) override { calls.append(Call(u"frame", show)); }
    void ShowMessageCentre(bool show) override { calls.append(Call(u"centre", show)); }

    static QString Call(const char16_t* what, bool value) {
        return QString::fromUtf16(what) + (value ? u'+' : u'-');
    }
    QStringList calls;
};

// A utility engine that offers the message centre.
class MessageCentreUtils final : public IHarborUtils {
public:
    bool IsReady() override { return true; }
    bool IsEnabled() override { return true; }
    void* GetMessageCenter() override { return nullptr; }
    int IsFeatureAvailable(int featureId) override { return featureId == 6 ? 1 : 0; }
    void ShowMessageArchive() override {}
    void CheckForUpdates() override {}
    void SetStartupBubbleEnabled(bool) override {}
    int IsStartupBubbleEnabled() override { return 0; }
    void SetNavigatorRect(const QRect&) override {}
    void OnNavigatorClosing() override {}
    void GetMessageCenterSize(int*, int*) override {}
    void SetShuttingDown(bool) override {}
    void RunQmoStartAction() override {}
};

} // namespace

TEST_F(NavigatorSettingsTest, ChoosingATypeFilterClearsTheOthers) {
    int refreshes = 0;
    Settings()->SetFilterChangedHandler([&refreshes] { ++refreshes; });

    Settings()->SetShowPdf(true);
    EXPECT_EQ(TypeFilters(), (QList<bool>{false, false, false, true, false}));
    EXPECT_TRUE(Settings()->IsDirty());
    EXPECT_EQ(refreshes, 1);

    Settings()->SaveIfDirty();
    Settings()->SetShowPdf(false);
    Settings()->SetShowAllTypes(false);
    EXPECT_EQ(TypeFilters(), (QList<bool>{false, false, false, true, false}))
        << "un-choosing a filter changes nothing";
    EXPECT_FALSE(Settings()->IsDirty());
    EXPECT_EQ(refreshes, 1);

    Settings()->SetShowOpenedItemsOnly(true);
    Settings()->SetShowNotes(true);
    EXPECT_EQ(TypeFilters(), (QList<bool>{true, false, false, false, false}));
    EXPECT_TRUE(Settings()->GetShowOpenedItemsOnly()) << "independent of the type filters";
    EXPECT_EQ(refreshes, 3);
}

TEST_F(NavigatorSettingsTest, EverySetterMarksDirty) {
    const QList<std::function<void(NavigatorSettings*)>> setters{
        [](NavigatorSettings* s) {
            s->SetApplicationPosition({1, 2, 3, 4});
        },
        [](NavigatorSettings* s) { s->SetMaxLinkedDocuments(5); },
        [](NavigatorSettings* s) { s->SetCleanDeletedOnClose(true); },
        [](NavigatorSettings* s) { s->SetLaunchAppOnStart(true); },
        [](NavigatorSettings* s) { s->SetShowQmd(true); },
        [](NavigatorSettings* s) { s->SetShowDoc(true); },
        [](NavigatorSettings* s) { s->SetShowOpenedItemsOnly(false); },
        [](NavigatorSettings* s) { s->SetLastSelectedItemId(QStringLiteral("root")); },
        [](NavigatorSettings* s) { s->SetDefaultFontSize(9); },
        [](NavigatorSettings* s) { s->SetDefaultFont(QStringLiteral("Arial")); },
        [](NavigatorSettings* s) { s->SetDefaultBackgroundColor(QStringLiteral("1,2,3")); },
        [](NavigatorSettings* s) { s->SetDefaultBackgroundImage(QStringLiteral("/a.png")); },
        [](NavigatorSettings* s) { s->SetShowMessageCentre(true); },
        [](NavigatorSettings* s) { s->SetKeepOnTop(false); },
        [](NavigatorSettings* s) { s->SetShowFrame(true); },
    };
    for (qsizetype i = 0; i < setters.size(); ++i) {
        NavigatorSettings::DestroyInstance();
        ASSERT_FALSE(Settings()->IsDirty());
        setters[i](Settings());
        EXPECT_TRUE(Settings()->IsDirty()) << "setter " << i;
    }
}

TEST_F(NavigatorSettingsTest, WindowOptionsReachTheWindowAtOnce) {
    Settings()->SetKeepOnTop(true); // no window yet: only stored
    RecordingWindow window;
    Settings()->SetFrame(&window);
    Settings()->SetKeepOnTop(false);
    Settings()->SetShowFrame(false);
    Settings()->SetShowMessageCentre(true);
    EXPECT_EQ(window.calls, (QStringList{QStringLiteral("top-"), QStringLiteral("frame-"),
                                         QStringLiteral("centre-")}))
        << "no message centre on this engine, so the bar is hidden";
    EXPECT_FALSE(Settings()->GetKeepOnTop());
    EXPECT_FALSE(Settings()->GetShowFrame());
    EXPECT_FALSE(Settings()->GetShowMessageCentre());
    Settings()->SetFrame(nullptr);
}

TEST_F(NavigatorSettingsTest, MessageCentreFollowsTheEngine) {
    MessageCentreUtils utils;
    SetHarborUtilsForTesting(&utils);
    RecordingWindow window;
    Settings()->SetFrame(&window);
    EXPECT_TRUE(Settings()->GetShowMessageCentre()) << "the default";
    Settings()->SetShowMessageCentre(false);
    EXPECT_FALSE(Settings()->GetShowMessageCentre());
    Settings()->SetShowMessageCentre(true);
    EXPECT_TRUE(Settings()->GetShowMessageCentre());
    EXPECT_EQ(window.calls, (QStringList{QStringLiteral("centre-"), QStringLiteral("centre+")}));
    Settings()->SetFrame(nullptr);

    // Where the engine has none, the stored choice is not shown...
    SetHarborUtilsForTesting(nullptr);
    EXPECT_FALSE(Settings()->GetShowMessageCentre());
    // ...and choosing it stores false.
    Settings()->SetShowMessageCentre(true);
    SetHarborUtilsForTesting(&utils);
    EXPECT_FALSE(Settings()->GetShowMessageCentre());
    SetHarborUtilsForTesting(nullptr);
}

TEST_F(NavigatorSettingsTest, KeepsItsOwnReferencesUntilDestroyed) {
    ApplicationInfo* info = CreateApplicationInfo(QStringLiteral("/opt/P/Bin"));
    Settings()->SetApplicationInfo(info);
    EXPECT_EQ(Settings()->GetApplicationInfo(), info);
    EXPECT_EQ(info->AddRef(), 3u);
    info->Release();

    NavigatorSettings::DestroyInstance();
    EXPECT_EQ(info->AddRef(), 2u) << "the settings released their reference";
    info->Release();
    info->Release();

    IDataStoreHost* host = GetDataStoreHost();
    Settings()->SetDataStoreHost(host);
    Settings()->SetDataStoreHost(host);
    EXPECT_EQ(host->AddRef(), 3u) << "a second hand-over does not add a reference";
    host->Release();
    NavigatorSettings::DestroyInstance();
    EXPECT_EQ(host->Release(), 0u);
}
