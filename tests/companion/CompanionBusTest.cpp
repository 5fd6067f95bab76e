#include "companion/CompanionBus.h"
#include "support/AmbrelTest.h"
#include "support/FakeNavigatorBroker.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QTimer>

#include <functional>

namespace {

using Props = QMap<QString, QString>;
using FakeNavigator = FakeNavigatorBroker;
using namespace Qt::StringLiterals;

class CompanionBusTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        if (!QDBusConnection::sessionBus().isConnected())
            GTEST_SKIP() << "no session bus";
    }
};

TEST_F(CompanionBusTest, PostsReachTheNavigatorInOrderAndOnlyOwnWindowCommandsArrive) {
    FakeNavigator navigator;
    ASSERT_TRUE(navigator.registered);
    const QDBusConnection own = QDBusConnection::connectToBus(QDBusConnection::SessionBus, u"c1"_s);
    const QDBusConnection other =
        QDBusConnection::connectToBus(QDBusConnection::SessionBus, u"c2"_s);
    CompanionBus companion(own);
    CompanionBus bystander(other);
    ASSERT_TRUE(companion.IsNavigatorRunning());

    QList<std::tuple<qint64, QString, int>> commands;
    QList<std::pair<QString, Props>> notes;
    QObject::connect(&companion, &CompanionBus::WindowCommandReceived,
                     [&](qint64 handle, const QString& command, int show) {
                         commands.append({handle, command, show});
                     });
    QObject::connect(&companion, &CompanionBus::HubNotified,
                     [&](const QString& name, const Props& p) {
                         notes.append({name, p});
                     });
    int bystanderCommands = 0;
    QObject::connect(&bystander, &CompanionBus::WindowCommandReceived,
                     [&] { ++bystanderCommands; });

    const Props opened{{u"itemid"_s, u"A"_s}, {u"openwindowhandle"_s, u"1"_s}};
    EXPECT_TRUE(companion.Post(u"NoteOpenNotification"_s, opened));
    EXPECT_TRUE(companion.Post(u"UpdateMetadata"_s, {{u"open"_s, u"false"_s}}));
    ASSERT_TRUE(WaitForEvents([&] { return navigator.posted.size() == 2; }));
    EXPECT_EQ(navigator.posted[0], std::make_pair(u"NoteOpenNotification"_s, opened));
    EXPECT_EQ(navigator.posted[1].first, u"UpdateMetadata"_s);

    // A malformed command is dropped; the well-formed ones arrive, to their program only.
    navigator.Notify(companion.UniqueName(), u"WindowCommand"_s,
                     {{u"handle"_s, u"x"_s}, {u"command"_s, u"close"_s}});
    navigator.Notify(
        companion.UniqueName(), u"WindowCommand"_s,
        {{u"handle"_s, u"1"_s}, {u"command"_s, u"show"_s}, {u"showcommand"_s, u"6"_s}});
    navigator.Notify(companion.UniqueName(), u"WindowCommand"_s,
                     {{u"handle"_s, u"1"_s}, {u"command"_s, u"close"_s}});
    navigator.Notify({}, u"ActivateNote"_s, {{u"itemid"_s, u"A"_s}});
    ASSERT_TRUE(WaitForEvents([&] { return commands.size() == 2 && notes.size() == 1; }));
    EXPECT_EQ(commands[0], std::make_tuple(qint64{1}, u"show"_s, 6));
    EXPECT_EQ(commands[1], std::make_tuple(qint64{1}, u"close"_s, -1));
    EXPECT_EQ(notes[0], std::make_pair(u"ActivateNote"_s, Props{{u"itemid"_s, u"A"_s}}));
    EXPECT_EQ(bystanderCommands, 0);

    bool gone = false;
    QObject::connect(&companion, &CompanionBus::NavigatorGone, [&] { gone = true; });
    navigator.Leave();
    EXPECT_TRUE(WaitForEvents([&] { return gone; }));
    EXPECT_FALSE(companion.IsNavigatorRunning());
}

TEST_F(CompanionBusTest, ANameIsHeldByOneProgramAtATime) {
    const QDBusConnection first =
        QDBusConnection::connectToBus(QDBusConnection::SessionBus, u"n1"_s);
    const QDBusConnection second =
        QDBusConnection::connectToBus(QDBusConnection::SessionBus, u"n2"_s);
    CompanionBus panel(first);
    CompanionBus secondPanel(second);
    const QString name = u"com.brindle.QuillmarkAmbrel.StartPanel"_s;
    EXPECT_FALSE(panel.IsNameTaken(name));
    EXPECT_TRUE(panel.RegisterName(name));
    EXPECT_FALSE(secondPanel.RegisterName(name));
    EXPECT_TRUE(secondPanel.IsNameTaken(name));
}

} // namespace
