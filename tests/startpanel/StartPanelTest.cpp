#include "companion/CompanionBus.h"
#include "libs/toolwell/AmbrelBus.h"
#include "libs/toolwell/BusForeignWindows.h"
#include "platform/Registry.h"
#include "startpanel/CStartPanelDlg.h"
#include "startpanel/StartPanelActions.h"
#include "startpanel/StartPanelInstance.h"
#include "support/AmbrelTest.h"
#include "support/FakeNavigatorBroker.h"
#include "support/RecordingProcessLauncher.h"

#include <QCoreApplication>
#include <QDBusConnection>
#include <QDBusConnectionInterface>
#include <QDBusMetaType>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QFileDialog>
#include <QProcess>
#include <QTimer>
#include <QToolButton>

#include <functional>

namespace {

using Props = QMap<QString, QString>;
using FakeNavigator = FakeNavigatorBroker;
using namespace Qt::StringLiterals;

const QString kPath = u"/AmbrelService"_s;
const QString kBroker = u"com.brindle.QuillmarkAmbrel.Broker"_s;
// Starting programs under the sanitizer takes its time.
bool WaitFor(const std::function<bool()>& done) {
    return WaitForEvents(done, 10000);
}

const QString kRecentKey = u"SOFTWARE\\Brindle\\Quillmark Ambrel\\RecentItems"_s;

// One stored recently used entry, as the item links keep it.
QString Entry(const QString& itemId, const QString& title, qint64 usedAt) {
    return uR"({"itemid":"%1","title":"%2","used":%3})"_s.arg(itemId, title).arg(usedAt);
}

QStringList RecentTitles(const CStartPanelDlg& panel) {
    QStringList titles;
    for (const QToolButton* button : panel.findChildren<QToolButton*>()) {
        if (button->accessibleDescription().startsWith(u"Open this"_s))
            titles << button->accessibleName();
    }
    return titles;
}

QToolButton* Button(const CStartPanelDlg& panel, const QString& name) {
    for (QToolButton* button : panel.findChildren<QToolButton*>()) {
        if (button->accessibleName() == name)
            return button;
    }
    return nullptr;
}

class StartPanelTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        if (!QDBusConnection::sessionBus().isConnected())
            GTEST_SKIP() << "no session bus";
        Platform::SetProcessLauncher(&launcher);
        // The navigator's side registers the properties' type when it starts.
        qDBusRegisterMetaType<Props>();
    }
    void TearDown() override {
        Platform::SetProcessLauncher(nullptr);
        AmbrelTest::TearDown();
    }

    // Starts the built panel program; answers once it owns the start panel's name.
    bool StartPanelProgram(QProcess& panel) {
        panel.setProcessChannelMode(QProcess::ForwardedChannels);
        panel.start(QStringLiteral(AMBREL_STARTPANEL_PATH));
        return panel.waitForStarted() && WaitFor([] {
                   return QDBusConnection::sessionBus().interface()->isServiceRegistered(
                       AmbrelBus::kStartPanelName);
               });
    }

    RecordingProcessLauncher launcher;
};

TEST_F(StartPanelTest, ButtonsPostMessagesOrStartTheNavigatorWithASwitch) {
    FakeNavigator navigator;
    ASSERT_TRUE(navigator.registered);
    Platform::Registry::SetUserValue(kRecentKey, u"Notes"_s,
                                     u"["_s + Entry(u"N-1"_s, u"Groceries"_s, 5) + u"]"_s);
    CompanionBus bus;
    StartPanelActions actions(u"/opt/qa/bin"_s, [&bus](const QString& name, const Props& values) {
        return bus.Post(name, values);
    });
    CStartPanelDlg panel(actions);

    Button(panel, u"New Note"_s)->click();
    Button(panel, u"Snapshot to New Note"_s)->click();
    ASSERT_EQ(launcher.starts.size(), 2);
    EXPECT_EQ(launcher.starts[0].program, u"/opt/qa/bin/ambrel-navigator"_s);
    EXPECT_EQ(launcher.starts[0].arguments, QStringList{u"/NewNote"_s});
    EXPECT_EQ(launcher.starts[1].arguments, QStringList{u"/SnapShotToNewNote"_s});

    Button(panel, u"Groceries"_s)->click();
    const QString report = WriteFile(u"papers/report.pdf"_s, "%PDF-1.4\n");
    Button(panel, u"Open Document"_s)->click();
    auto* chooser = panel.findChild<QFileDialog*>();
    ASSERT_NE(chooser, nullptr);
    chooser->setOption(QFileDialog::DontUseNativeDialog);
    chooser->selectFile(report);
    QMetaObject::invokeMethod(chooser, "accept");

    ASSERT_TRUE(WaitFor([&] { return navigator.posted.size() >= 2; }));
    EXPECT_EQ(navigator.posted[0],
              std::make_pair(u"OpenItemByItemID"_s, Props{{u"itemid"_s, u"N-1"_s}}));
    EXPECT_EQ(navigator.posted[1],
              std::make_pair(u"RequestViewerFromFile"_s, Props{{u"filename"_s, report}}));
}

TEST_F(StartPanelTest, RecentListHoldsTheTenNewestOfBothKindsAndFollowsActivation) {
    // Seven notes and five documents, interleaved in time; "Old note" was stored before
    // times were kept and stays behind the newer notes.
    QStringList notes;
    QStringList documents;
    for (int i = 0; i < 6; ++i)
        notes << Entry(u"N-%1"_s.arg(i), u"Note %1"_s.arg(i), 100 - 10 * i);
    notes << uR"({"itemid":"N-old","title":"Old note"})"_s;
    for (int i = 0; i < 5; ++i)
        documents << Entry(u"D-%1"_s.arg(i), u"Doc %1"_s.arg(i), 95 - 10 * i);
    Platform::Registry::SetUserValue(kRecentKey, u"Notes"_s, u"["_s + notes.join(u',') + u"]"_s);
    Platform::Registry::SetUserValue(kRecentKey, u"Documents"_s,
                                     u"["_s + documents.join(u',') + u"]"_s);
    StartPanelActions actions(u"/opt/qa/bin"_s, [](const QString&, const Props&) { return true; });
    CStartPanelDlg panel(actions);
    EXPECT_EQ(RecentTitles(panel),
              QStringList({u"Note 0"_s, u"Doc 0"_s, u"Note 1"_s, u"Doc 1"_s, u"Note 2"_s,
                           u"Doc 2"_s, u"Note 3"_s, u"Doc 3"_s, u"Note 4"_s, u"Doc 4"_s}));

    // The navigator announces a note while the panel sits in the background.
    Platform::Registry::SetUserValue(kRecentKey, u"Documents"_s,
                                     u"["_s + Entry(u"D-new"_s, u"Fresh"_s, 500) + u"]"_s);
    QEvent activate(QEvent::WindowActivate);
    QCoreApplication::sendEvent(&panel, &activate);
    const QStringList titles = RecentTitles(panel);
    ASSERT_EQ(titles.size(), 8);
    EXPECT_EQ(titles.first(), u"Fresh"_s);
    EXPECT_EQ(titles.last(), u"Old note"_s);
}

TEST_F(StartPanelTest, ASecondPanelBringsTheFirstToTheFrontAndEnds) {
    FakeNavigator navigator;
    CompanionBus bus;
    StartPanelInstance first(bus);
    int activations = 0;
    QObject::connect(&first, &StartPanelInstance::ActivateRequested, [&] { ++activations; });
    ASSERT_TRUE(first.Claim());

    QProcess second;
    second.setProcessChannelMode(QProcess::ForwardedChannels);
    second.start(QStringLiteral(AMBREL_STARTPANEL_PATH));
    ASSERT_TRUE(WaitFor([&] { return second.state() == QProcess::NotRunning; }));
    EXPECT_EQ(second.exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(second.exitCode(), 0);
    EXPECT_EQ(activations, 1);
}

TEST_F(StartPanelTest, PanelEndsWhenTheNavigatorClosesItOrLeaves) {
    for (const bool leave : {false, true}) {
        SCOPED_TRACE(leave ? "navigator leaves" : "navigator closes the panel");
        FakeNavigator navigator;
        ASSERT_TRUE(navigator.registered);
        QProcess panel;
        ASSERT_TRUE(StartPanelProgram(panel));
        if (leave) {
            navigator.Leave();
        } else {
            // The navigator's own way: the window of the name's owner, number 0, told to close.
            BusForeignWindows windows(navigator.bus, kPath, kBroker);
            const Platform::WindowHandle window = windows.FindStartPanel();
            ASSERT_NE(window, 0);
            // Any other command leaves it running.
            ASSERT_TRUE(windows.Show(window, 6));
            ASSERT_FALSE(panel.waitForFinished(300));
            ASSERT_TRUE(windows.Close(window));
        }
        ASSERT_TRUE(WaitFor([&] { return panel.state() == QProcess::NotRunning; }));
        EXPECT_EQ(panel.exitStatus(), QProcess::NormalExit);
    }
}

} // namespace
