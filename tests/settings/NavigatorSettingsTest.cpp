#include "settings/NavigatorSettings.h"
#include "app/ApplicationInfo.h"
#include "libs/toolwell/CHarborUtils.h"
#include "settings/ISettingsWindow.h"
#include "support/AmbrelTest.h"
#include "support/FakeHarborUtils.h"

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

} // namespace

TEST_F(NavigatorSettingsTest, ChoosingATypeFilterClearsTheOthers) {
    int refreshes = 0;
    Settings()->SetFilterChangedHandler([&refreshes] { ++refreshes; });

    Settings()->SetShowPdf(true);
    EXPECT_EQ(TypeFilters(), (QList<bool>{false, false, false, true, false}));
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

TEST_F(NavigatorSettingsTest, WindowOptionsReachTheWindowAtOnce) {
    Settings()->SetKeepOnTop(true); // no window yet: only stored
    RecordingWindow window;
    Settings()->SetFrame(&window);
    Settings()->SetKeepOnTop(false);
    Settings()->SetShowFrame(false);
    Settings()->SetShowMessageCentre(true); // no message centre on this engine: hidden
    EXPECT_FALSE(Settings()->GetShowMessageCentre());

    FakeHarborUtils utils;
    utils.messageCentre = true;
    SetHarborUtilsForTesting(&utils);
    EXPECT_FALSE(Settings()->GetShowMessageCentre()) << "choosing it without one stored false";
    Settings()->SetShowMessageCentre(true);
    EXPECT_TRUE(Settings()->GetShowMessageCentre());
    Settings()->SetShowMessageCentre(false);
    EXPECT_EQ(window.calls, (QStringList{QStringLiteral("top-"), QStringLiteral("frame-"),
                                         QStringLiteral("centre-"), QStringLiteral("centre+"),
                                         QStringLiteral("centre-")}));
    Settings()->SetFrame(nullptr);
    SetHarborUtilsForTesting(nullptr);
}

TEST_F(NavigatorSettingsTest, KeepsItsOwnReferencesUntilDestroyed) {
    ApplicationInfo* info = CreateApplicationInfo(QStringLiteral("/opt/P/Bin"));
    Settings()->SetApplicationInfo(info);
    NavigatorSettings::DestroyInstance();
    EXPECT_EQ(info->Release(), 0u) << "the settings released their reference";

    IDataStoreHost* host = GetDataStoreHost();
    Settings()->SetDataStoreHost(host);
    Settings()->SetDataStoreHost(host);
    EXPECT_EQ(host->AddRef(), 3u) << "a second hand-over does not add a reference";
    host->Release();
    NavigatorSettings::DestroyInstance();
    EXPECT_EQ(host->Release(), 0u);
}
