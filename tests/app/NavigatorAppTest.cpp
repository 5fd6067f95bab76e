#include "app/CNavigatorApp.h"
#include "catalog/IDataStoreService.h"
#include "dataexchange/WProperties.h"
#include "libs/toolwell/CHarborUtils.h"
#include "navigator/WNavDS.h"
#include "settings/NavigatorSettings.h"
#include "support/AmbrelTest.h"
#include "support/FakeHarborUtils.h"
#include "support/FileSizeLimit.h"
#include "support/FileWatch.h"
#include "support/RecordingMessageBox.h"
#include "support/RecordingProcessLauncher.h"

#include <QApplication>
#include <QDir>
#include <QFile>
#include <QPointer>
#include <QStringDecoder>
#include <QStringEncoder>
#include <QTest>
#include <QTimer>

#include <tuple>

namespace {

using namespace Qt::StringLiterals;

class NavigatorAppTest : public AmbrelTest {
protected:
    // A file in the application data folder.
    QByteArray Read(const QString& name) const {
        QFile file(AppDataFolder() + u'/' + name);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }
    QString ReadSettings() const {
        return QStringDecoder(QStringConverter::Utf16LE).decode(Read(u"NavSettings.dat"_s));
    }

    static void StartAndEnd() {
        CNavigatorApp app({u"ambrel-navigator"_s});
        ASSERT_TRUE(app.InitInstance());
        app.OnIdle(0);
        delete app.MainWindow();
        EXPECT_EQ(app.ExitInstance(), 0);
    }
};

TEST_F(NavigatorAppTest, StartUpStopsCleanlyWhenTheUtilityEngineIsNotReady) {
    for (const bool ready : {false, true}) {
        FakeHarborUtils utils;
        utils.ready = ready;
        utils.enabled = false; // also covers IsEnabled when ready
        SetHarborUtilsForTesting(&utils);

        CNavigatorApp app({u"ambrel-navigator"_s});
        EXPECT_EQ(app.Run(), 0);
        EXPECT_EQ(app.MainWindow(), nullptr) << "no window may be left behind";
        EXPECT_TRUE(QApplication::topLevelWidgets().isEmpty());
        EXPECT_TRUE(utils.shuttingDownCalls.isEmpty());
        EXPECT_NE(GetHarborUtilsInterface(), &utils) << "the utility engine was not released";
        ReleaseHarborUtilsInterface();
    }
}

TEST_F(NavigatorAppTest, TheWindowStartsAtItsStoredPlaceOrTheDefaultOneAndKeepsIt) {
    // The rectangle is the window's outer one, decorations included.
    const std::tuple<const char16_t*, QRect, const char16_t*> cases[] = {
        {nullptr, {0, 0, 280, 650}, u"applicationposition|0,0,280,650|"},
        {u"applicationposition|100,50,400,300|",
         {100, 50, 400, 300},
         u"applicationposition|100,50,400,300|"},
        // A stored width of 0 keeps the default width, not the default place.
        {u"applicationposition|30,40,0,500|",
         {30, 40, 280, 500},
         u"applicationposition|30,40,280,500|"},
    };
    for (const auto& [stored, expected, written] : cases) {
        if (stored)
            WriteFile(u"data/Brindle/Quillmark Ambrel/NavSettings.dat"_s,
                      QStringEncoder(QStringConverter::Utf16LE).encode(QString::fromUtf16(stored)));
        CNavigatorApp app({u"ambrel-navigator"_s});
        ASSERT_TRUE(app.InitInstance());
        QWidget* window = app.MainWindow();
        EXPECT_TRUE(window->isVisible());
        EXPECT_EQ(window->frameGeometry(), expected);
        EXPECT_NE(window->geometry(), expected) << "the window has no decorations to include";
        delete window;
        app.ExitInstance();
        EXPECT_TRUE(ReadSettings().startsWith(QString::fromUtf16(written)))
            << ReadSettings().toStdString();
        ResetSingletons();
    }
}

TEST_F(NavigatorAppTest, MovesAreWrittenToTheSettingsAtTheNextIdlePass) {
    CNavigatorApp app({u"ambrel-navigator"_s});
    ASSERT_TRUE(app.InitInstance());
    NavigatorSettings* settings = NavigatorSettings::Instance();
    EXPECT_TRUE(app.OnIdle(0)) << "the first pass asks for one more";
    EXPECT_FALSE(settings->IsDirty());
    EXPECT_TRUE(ReadSettings().startsWith(u"applicationposition|0,0,280,650|"_s));

    WMainFrame* window = app.MainWindow();
    window->move(120, 80);
    EXPECT_TRUE(settings->IsDirty());
    EXPECT_EQ(settings->GetApplicationPosition(), (WindowRect{120, 80, 400, 730}));
    app.OnIdle(0);
    EXPECT_FALSE(settings->IsDirty());
    EXPECT_TRUE(ReadSettings().startsWith(u"applicationposition|120,80,280,650|"_s));

    // A maximised or minimised window keeps the place it returns to.
    window->showMaximized();
    QCoreApplication::processEvents();
    ASSERT_TRUE(window->isMaximized());
    window->showMinimized();
    QCoreApplication::processEvents();
    EXPECT_EQ(settings->GetApplicationPosition(), (WindowRect{120, 80, 400, 730}));
    window->showNormal();
    QCoreApplication::processEvents();
    window->move(50, 60);
    EXPECT_EQ(settings->GetApplicationPosition(), (WindowRect{50, 60, 330, 710}));

    // A change after the last idle pass still reaches the file at shut-down.
    settings->SetKeepOnTop(true);
    delete app.MainWindow();
    app.ExitInstance();
    EXPECT_TRUE(ReadSettings().contains(u"|keepontop|true|"_s));
}

TEST_F(NavigatorAppTest, AFreshStartMakesTheCatalogAndABrokenOneIsLeftAlone) {
    StartAndEnd();
    EXPECT_TRUE(
        Read(u"Catalog/catalog.xml"_s).startsWith(QByteArrayLiteral("\xFF\xFE<\0?\0x\0m\0l\0")));

    const QByteArray broken = "<?xml version=\"1.0\"?><archive><items><item uuid=\"root\"";
    WriteFile(u"data/Brindle/Quillmark Ambrel/Catalog/catalog.xml"_s, broken);
    StartAndEnd();
    EXPECT_EQ(Read(u"Catalog/catalog.xml"_s), broken);
}

TEST_F(NavigatorAppTest, TheIdlePassWritesTheCatalogOnlyAfterItChanged) {
    const QString folder = u"0F8FAD5B-D9CB-469F-A165-70867728950E"_s;
    const QString note = u"7C9E6679-7425-40DE-944B-E07FC1F90AE7"_s;
    for (const char* open : {"false", "true"}) {
        SCOPED_TRACE(open);
        const QString catalog =
            WriteFile(u"data/Brindle/Quillmark Ambrel/Catalog/catalog.xml"_s,
                      QStringLiteral(
                          "<?xml version=\"1.0\" encoding=\"UTF-8\"?><archive><organization>"
                          "<root><child uuidref=\"%1\"><child uuidref=\"%2\"/></child></root>"
                          "</organization><items><folder uuid=\"%1\"><properties><type>folder"
                          "</type><expanded>true</expanded></properties></folder><note uuid=\"%2\">"
                          "<properties><type>note</type><open>%3</open><title>Old</title>"
                          "</properties></note></items></archive>")
                          .arg(folder, note, QString::fromLatin1(open))
                          .toUtf8());
        const FileWatch start(catalog);
        CNavigatorApp app({u"ambrel-navigator"_s});
        ASSERT_TRUE(app.InitInstance());
        app.OnIdle(0);
        EXPECT_EQ(start.Untouched(), QByteArray(open) == "false")
            << "closing an item recorded open is the only change a start makes";

        const FileWatch select(catalog);
        WNavDS::Instance()->SelectById(note);
        app.OnIdle(0);
        EXPECT_TRUE(select.Untouched()) << "a selection is not a change";

        ReleasePtr<DataExchange::IProperties> title(DataExchange::CreateProperties());
        title->SetProperty(u"title"_s, u"Renamed"_s);
        WNavDS::Instance()->UpdateItem(note, title.get(), false);
        app.OnIdle(0);
        EXPECT_TRUE(
            QString(
                QStringDecoder(QStringConverter::Utf16LE).decode(Read(u"Catalog/catalog.xml"_s)))
                .contains(u"<title>Renamed</title>"_s))
            << "the idle pass did not write the catalog";
        delete app.MainWindow();
        app.ExitInstance();
        ResetSingletons();
    }
}

TEST_F(NavigatorAppTest, AFullDiskIsToldOncePerFileAndTheSavesAreTriedAgainUntilTheyWork) {
    CNavigatorApp app({u"ambrel-navigator"_s});
    ASSERT_TRUE(app.InitInstance());
    RecordingMessageBox box;
    Platform::SetMessageBox(&box);
    app.OnIdle(0);
    const QByteArray catalog = Read(u"Catalog/catalog.xml"_s);
    const QByteArray settings = Read(u"NavSettings.dat"_s);
    ASSERT_FALSE(catalog.isEmpty());
    ASSERT_FALSE(settings.isEmpty());
    WNavDS* navigator = WNavDS::Instance();
    const QString catalogPath = AppDataFolder() + u"/Catalog/catalog.xml"_s;
    const QString settingsPath = AppDataFolder() + u"/NavSettings.dat"_s;

    // Both files change at every pass, and every save fails.
    const auto changeAndPass = [&](int round) {
        navigator->NewFolder(nullptr);
        app.MainWindow()->move(10 + round, 20);
        app.OnIdle(0);
        QCoreApplication::processEvents(); // the posted messages
    };
    {
        const FileSizeLimit full(static_cast<rlim_t>(settings.size() / 2));
        for (int round = 0; round < 5; ++round)
            changeAndPass(round);
    }
    EXPECT_EQ(Read(u"Catalog/catalog.xml"_s), catalog);
    EXPECT_EQ(Read(u"NavSettings.dat"_s), settings);
    EXPECT_EQ(QDir(AppDataFolder()).entryList(QDir::Files), QStringList{u"NavSettings.dat"_s});
    ASSERT_EQ(box.shown.size(), 2) << "one message for each file";
    for (const auto& [index, path] : {std::pair{0, catalogPath}, std::pair{1, settingsPath}}) {
        EXPECT_TRUE(box.shown[index].text.contains(path)) << box.shown[index].text.toStdString();
        EXPECT_TRUE(box.shown[index].text.contains(u"File too large"_s));
    }
    EXPECT_TRUE(NavigatorSettings::Instance()->IsDirty()) << "the settings change was dropped";

    // With room again, the next pass writes both without a new change.
    app.OnIdle(0);
    EXPECT_NE(Read(u"Catalog/catalog.xml"_s), catalog) << "the catalog was not tried again";
    EXPECT_TRUE(ReadSettings().startsWith(u"applicationposition|14,20,"_s));

    // A save that worked lets the next failure be told again.
    {
        const FileSizeLimit full(static_cast<rlim_t>(settings.size() / 2));
        changeAndPass(9);
        changeAndPass(10);
    }
    EXPECT_EQ(box.shown.size(), 4);
    delete app.MainWindow();
    app.ExitInstance();
}

TEST_F(NavigatorAppTest, ClosingTheWindowLeavesNothingRecordedOpen) {
    RecordingProcessLauncher launcher;
    Platform::SetProcessLauncher(&launcher);
    FakeHarborUtils utils;
    SetHarborUtilsForTesting(&utils);
    CNavigatorApp app({u"ambrel-navigator"_s});
    ASSERT_TRUE(app.InitInstance());
    QString text;
    UnicodeStringPtr sink(&text);
    WNavDS::Instance()->NewNote(nullptr, &sink);
    const QString noteId = text;
    ASSERT_TRUE(WNavDS::Instance()->FindItem(noteId)->IsOpen());
    ASSERT_EQ(launcher.starts.size(), 1) << "the note tool was not started";

    // The window fades out, disabled, before the other programs' windows are closed.
    const QPointer<WMainFrame> window = app.MainWindow();
    window->close();
    ASSERT_TRUE(window) << "the window went without fading out";
    EXPECT_FALSE(window->isEnabled());
    EXPECT_TRUE(WNavDS::Instance()->FindItem(noteId)->IsOpen());
    ASSERT_TRUE(QTest::qWaitFor([&] { return window.isNull(); }, 5000));
    EXPECT_FALSE(WNavDS::Instance()->FindItem(noteId)->IsOpen());
    ReleasePtr<DataExchange::IProperties> properties(DataExchange::CreateProperties());
    ASSERT_EQ(GetDataStoreService()->GetProperties(noteId, properties.get()), S_OK);
    properties->GetProperty(u"open"_s, &sink);
    EXPECT_EQ(text, u"false"_s) << "the catalog still has the note open";
    EXPECT_EQ(utils.shuttingDownCalls, (QList<bool>{false, true}));
    app.ExitInstance();
}

TEST_F(NavigatorAppTest, TheQmoSwitchRunsTheEnginesStartActionOnce) {
    for (const int runs : {0, 1}) {
        FakeHarborUtils utils;
        SetHarborUtilsForTesting(&utils);
        QStringList arguments{u"ambrel-navigator"_s};
        if (runs == 1)
            arguments.append(u"/dQMO"_s);
        CNavigatorApp app(arguments);
        ASSERT_TRUE(app.InitInstance());
        app.OnIdle(0);
        app.OnIdle(1);
        EXPECT_EQ(utils.qmoStartActions, runs);
        delete app.MainWindow();
        app.ExitInstance();
        ResetSingletons();
    }
}

TEST_F(NavigatorAppTest, ShutDownEmptiesDeletedItemsOnlyWhenAsked) {
    for (const bool clean : {false, true}) {
        CNavigatorApp app({u"ambrel-navigator"_s});
        ASSERT_TRUE(app.InitInstance());
        app.OnIdle(0);
        NavigatorSettings::Instance()->SetCleanDeletedOnClose(clean);
        WNavDS* navigator = WNavDS::Instance();
        QString folderId;
        UnicodeStringPtr sink(&folderId);
        navigator->NewFolder(&sink);
        navigator->DeleteSelected();
        ASSERT_TRUE(navigator->IsInDeletedItems(navigator->FindItem(folderId)));

        delete app.MainWindow();
        app.ExitInstance();
        const QString catalog =
            QStringDecoder(QStringConverter::Utf16LE).decode(Read(u"Catalog/catalog.xml"_s));
        EXPECT_EQ(catalog.contains(folderId), !clean) << catalog.toStdString();
        // The settings written at the end still hold the choice.
        EXPECT_TRUE(ReadSettings().contains(clean ? u"|cleandeletedonclose|true|"_s
                                                  : u"|cleandeletedonclose|false|"_s));
        ResetSingletons();
    }
}

TEST_F(NavigatorAppTest, ClosingTheWindowUnderAnOpenMessageBoxEndsCleanly) {
    // Two bytes are refused with a message box over the window, in a nested event loop.
    const QString source = WriteFile(u"in/ab.txt"_s, "ab");
    CNavigatorApp app({u"ambrel-navigator"_s, u"/NewNoteFromFile"_s, source});
    QPointer<QWidget> box;
    bool boxWasOpen = false;
    QTimer closer;
    QObject::connect(&closer, &QTimer::timeout, [&] {
        if (QWidget* modal = QApplication::activeModalWidget(); modal && app.MainWindow()) {
            box = modal;
            boxWasOpen = true;
            closer.stop();
            app.MainWindow()->close();
        }
    });
    closer.start(10);

    EXPECT_EQ(app.Run(), 0);
    EXPECT_TRUE(boxWasOpen);
    EXPECT_TRUE(box.isNull()) << "the message box outlived the window";
    EXPECT_TRUE(QApplication::topLevelWidgets().isEmpty());
    EXPECT_EQ(GetDataStoreService(), nullptr) << "the shut-down did not run";
    EXPECT_TRUE(QFile::exists(source));
    EXPECT_TRUE(QDir(AppDataFolder() + u"/Catalog"_s)
                    .entryList(QDir::Dirs | QDir::NoDotAndDotDot)
                    .isEmpty());
}

} // namespace
