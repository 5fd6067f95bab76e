#include "app/CNavigatorApp.h"
#include "catalog/IDataStoreService.h"
#include "dataexchange/WProperties.h"
#include "libs/toolwell/CHarborUtils.h"
#include "navigator/WNavDS.h"
#include "settings/NavigatorSettings.h"
#include "support/AmbrelTest.h"
#include "support/RecordingProcessLauncher.h"

#include <QApplication>
#include <QFile>

namespace {

// A utility engine whose readiness the test chooses.
class FakeHarborUtils final : public IHarborUtils {
public:
    bool IsReady() override { return ready; }
    bool IsEnabled() override { return enabled; }
    void* GetMessageCenter() override { return nullptr; }
    int IsFeatureAvailable(int) override { return 0; }
    void ShowMessageArchive() override {}
    void CheckForUpdates() override {}
    void SetStartupBubbleEnabled(bool) override {}
    int IsStartupBubbleEnabled() override { return 0; }
    void SetNavigatorRect(const QRect&) override {}
    void OnNavigatorClosing() override {}
    void GetMessageCenterSize(int*, int*) override {}
    void SetShuttingDown(bool flag) override { shuttingDownCalls.append(flag); }
    void RunQmoStartAction() override {}

    bool ready = true;
    bool enabled = true;
    QList<bool> shuttingDownCalls;
};

class NavigatorAppTest : public AmbrelTest {
protected:
    // A settings file holding just these pipe-delimited pairs, as UTF-16 little-endian.
    void WriteSettings(const QString& pairs) {
        QByteArray bytes;
        for (const QChar c : pairs) {
            bytes.append(static_cast<char>(c.unicode() & 0xFF));
            bytes.append(static_cast<char>(c.unicode() >> 8));
        }
        WriteFile(QStringLiteral("data/Brindle/Quillmark Ambrel/NavSettings.dat"), bytes);
    }

    QString ReadSettings() const {
        QFile file(AppDataFolder() + QStringLiteral("/NavSettings.dat"));
        if (!file.open(QIODevice::ReadOnly))
            return {};
        const QByteArray bytes = file.readAll();
        return QString::fromUtf16(reinterpret_cast<const char16_t*>(bytes.constData()),
                                  bytes.size() / 2);
    }
};

TEST_F(NavigatorAppTest, StartUpStopsCleanlyWhenTheUtilityEngineIsNotReady) {
    for (const bool ready : {false, true}) {
        FakeHarborUtils utils;
        utils.ready = ready;
        utils.enabled = false; // also covers IsEnabled when ready
        SetHarborUtilsForTesting(&utils);

        CNavigatorApp app({QStringLiteral("ambrel-navigator")});
        EXPECT_EQ(app.Run(), 0);
        EXPECT_EQ(app.MainWindow(), nullptr) << "no window may be left behind";
        EXPECT_TRUE(QApplication::topLevelWidgets().isEmpty());
        EXPECT_TRUE(utils.shuttingDownCalls.isEmpty());
        EXPECT_NE(GetHarborUtilsInterface(), &utils) << "the utility engine was not released";
        ReleaseHarborUtilsInterface();
    }
}

TEST_F(NavigatorAppTest, StartUpShowsTheWindowAtItsDefaultPlace) {
    FakeHarborUtils utils;
    SetHarborUtilsForTesting(&utils);
    CNavigatorApp app({QStringLiteral("ambrel-navigator")});
    ASSERT_TRUE(app.InitInstance());
    ASSERT_NE(app.MainWindow(), nullptr);
    EXPECT_TRUE(app.MainWindow()->isVisible());
    EXPECT_EQ(app.MainWindow()->frameGeometry().topLeft(), QPoint(0, 0));
    EXPECT_EQ(app.MainWindow()->size(), QSize(280, 650));
    EXPECT_EQ(utils.shuttingDownCalls, QList<bool>{false});

    // With the window gone the next idle pass ends the program.
    delete app.MainWindow();
    EXPECT_FALSE(app.OnIdle(0));
    EXPECT_EQ(app.ExitInstance(), 0);
    EXPECT_NE(GetHarborUtilsInterface(), &utils);
}

TEST_F(NavigatorAppTest, TheWindowStartsAtItsStoredPlace) {
    WriteSettings(QStringLiteral("applicationposition|100,50,400,300|"));
    CNavigatorApp app({QStringLiteral("ambrel-navigator")});
    ASSERT_TRUE(app.InitInstance());
    EXPECT_EQ(app.MainWindow()->geometry(), QRect(100, 50, 400, 300));
    delete app.MainWindow();
    app.ExitInstance();
}

TEST_F(NavigatorAppTest, AStoredWidthOfZeroKeepsTheDefaultWidthButNotThePlace) {
    WriteSettings(QStringLiteral("applicationposition|30,40,0,500|"));
    CNavigatorApp app({QStringLiteral("ambrel-navigator")});
    ASSERT_TRUE(app.InitInstance());
    EXPECT_EQ(app.MainWindow()->geometry(), QRect(30, 40, 280, 500));
    delete app.MainWindow();
    app.ExitInstance();
}

TEST_F(NavigatorAppTest, MovesAreWrittenToTheSettingsAtTheNextIdlePass) {
    CNavigatorApp app({QStringLiteral("ambrel-navigator")});
    ASSERT_TRUE(app.InitInstance());
    NavigatorSettings* settings = NavigatorSettings::Instance();
    EXPECT_TRUE(app.OnIdle(0)) << "the first pass asks for one more";
    EXPECT_FALSE(settings->IsDirty());
    EXPECT_FALSE(ReadSettings().isEmpty()) << "applying the window options marks them dirty";

    app.MainWindow()->setGeometry(120, 80, 300, 600);
    EXPECT_TRUE(settings->IsDirty());
    EXPECT_EQ(settings->GetApplicationPosition(), (WindowRect{120, 80, 420, 680}));
    app.OnIdle(0);
    EXPECT_FALSE(settings->IsDirty());

    EXPECT_TRUE(ReadSettings().startsWith(QStringLiteral("applicationposition|120,80,300,600|")))
        << ReadSettings().toStdString();

    // A change after the last idle pass still reaches the file at shut-down.
    settings->SetKeepOnTop(true);
    delete app.MainWindow();
    app.ExitInstance();
    EXPECT_TRUE(ReadSettings().contains(QStringLiteral("|keepontop|true|")));
}

TEST_F(NavigatorAppTest, AFreshStartMakesTheCatalogAndABrokenOneIsLeftAlone) {
    const QString catalog = AppDataFolder() + QStringLiteral("/Catalog/catalog.xml");
    {
        CNavigatorApp app({QStringLiteral("ambrel-navigator")});
        ASSERT_TRUE(app.InitInstance());
        delete app.MainWindow();
        app.ExitInstance();
    }
    QFile made(catalog);
    ASSERT_TRUE(made.open(QIODevice::ReadOnly));
    EXPECT_TRUE(made.readAll().startsWith("\xFF\xFE<\0?\0x\0m\0l\0"));

    const QByteArray broken = "<?xml version=\"1.0\"?><archive><items><item uuid=\"root\"";
    WriteFile(QStringLiteral("data/Brindle/Quillmark Ambrel/Catalog/catalog.xml"), broken);
    {
        CNavigatorApp app({QStringLiteral("ambrel-navigator")});
        ASSERT_TRUE(app.InitInstance());
        app.OnIdle(0);
        delete app.MainWindow();
        app.ExitInstance();
    }
    QFile kept(catalog);
    ASSERT_TRUE(kept.open(QIODevice::ReadOnly));
    EXPECT_EQ(kept.readAll(), broken);
}

TEST_F(NavigatorAppTest, ClosingTheWindowLeavesNothingRecordedOpen) {
    RecordingProcessLauncher launcher;
    Platform::SetProcessLauncher(&launcher);
    FakeHarborUtils utils;
    SetHarborUtilsForTesting(&utils);
    CNavigatorApp app({QStringLiteral("ambrel-navigator")});
    ASSERT_TRUE(app.InitInstance());
    QString noteId;
    UnicodeStringPtr idSink(&noteId);
    WNavDS::Instance()->NewNote(nullptr, &idSink);
    ASSERT_TRUE(WNavDS::Instance()->FindItem(noteId)->IsOpen());
    ASSERT_EQ(launcher.starts.size(), 1) << "the note tool was not started";

    app.MainWindow()->close();
    EXPECT_FALSE(WNavDS::Instance()->FindItem(noteId)->IsOpen());
    ReleasePtr<DataExchange::IProperties> properties(DataExchange::CreateProperties());
    ASSERT_EQ(GetDataStoreService()->GetProperties(noteId, properties.get()), S_OK);
    QString open;
    UnicodeStringPtr openSink(&open);
    properties->GetProperty(QStringLiteral("open"), &openSink);
    EXPECT_EQ(open, QStringLiteral("false"));
    EXPECT_EQ(utils.shuttingDownCalls, (QList<bool>{false, true}));
    app.ExitInstance();
}

} // namespace
