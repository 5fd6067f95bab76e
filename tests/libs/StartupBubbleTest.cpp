#include "FakeNotificationService.h"
#include "ServicesTestSupport.h"

#include "libs/toolwell/CHarborUtils.h"
#include "libs/toolwell/StartupBubble.h"
#include "platform/Registry.h"

#include <QDBusMessage>
#include <QGuiApplication>
#include <QScreen>
#include <QSettings>

namespace {

class StartupBubbleTest : public ServicesTest {
protected:
    // Messages from one sender arrive in order: once this question is answered, every
    // notification sent before it has arrived too.
    static bool Settled(FakeNotificationService& service) {
        const int before = service.capabilityQuestions;
        QDBusConnection::sessionBus().send(QDBusMessage::createMethodCall(
            QStringLiteral("org.freedesktop.Notifications"),
            QStringLiteral("/org/freedesktop/Notifications"),
            QStringLiteral("org.freedesktop.Notifications"), QStringLiteral("GetCapabilities")));
        return WaitForEvents([&] { return service.capabilityQuestions > before; });
    }
};

TEST_F(StartupBubbleTest, BubbleIsShownOnceAndOnlyByANotificationService) {
    if (!QDBusConnection::sessionBus().isConnected())
        GTEST_SKIP() << "no session bus";
    CHarborUtils utils;
    EXPECT_EQ(utils.IsStartupBubbleEnabled(), 1);
    const QRect screen = QGuiApplication::primaryScreen()->geometry();
    const QRect window(screen.right() - 100, screen.top(), 90, screen.height() / 4);

    // Without a service nothing is shown, and the hint waits for the next run.
    utils.SetNavigatorRect(window);
    EXPECT_EQ(utils.NavigatorRect(), window);
    EXPECT_EQ(utils.IsStartupBubbleEnabled(), 1);

    FakeNotificationService service;
    ASSERT_TRUE(service.registered);
    utils.SetNavigatorRect(window);
    ASSERT_TRUE(WaitForEvents([&] { return !service.shown.isEmpty(); }));
    EXPECT_EQ(service.shown[0].appName, QStringLiteral("Quillmark Ambrel"));
    EXPECT_EQ(service.shown[0].summary, QStringLiteral("Quillmark Ambrel is running"));
    EXPECT_TRUE(service.shown[0].body.contains(QStringLiteral("at the top right of your screen")))
        << service.shown[0].body.toStdString();

    // Shown once per user, not once per run.
    EXPECT_EQ(CHarborUtils().IsStartupBubbleEnabled(), 0);
    utils.SetNavigatorRect(window.translated(-10, 0));
    ASSERT_TRUE(Settled(service));
    EXPECT_EQ(service.shown.size(), 1);
    EXPECT_EQ(utils.NavigatorRect(), window.translated(-10, 0));

    utils.SetStartupBubbleEnabled(true);
    utils.SetNavigatorRect(window);
    EXPECT_TRUE(WaitForEvents([&] { return service.shown.size() == 2; }));
}

TEST_F(StartupBubbleTest, DelayComesFromTheMachineSettingsOrIsTwoMinutes) {
    EXPECT_EQ(StartupBubble::Delay(), 120000);
    QSettings machine(Platform::Registry::MachineFile(), QSettings::IniFormat);
    const QList<QPair<const char*, int>> cases{{"5000", 5000},         {"0", 0},
                                               {"soon", 120000},       {"-1", 120000},
                                               {"4294967295", 120000}, {"", 120000}};
    for (const auto& [stored, delay] : cases) {
        machine.setValue(QStringLiteral("Software/Brindle/Quillmark Ambrel/BubbleStartupDelay"),
                         QString::fromUtf8(stored));
        machine.sync();
        EXPECT_EQ(StartupBubble::Delay(), delay) << stored;
    }
}

} // namespace
