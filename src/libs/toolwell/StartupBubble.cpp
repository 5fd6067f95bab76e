#include "libs/toolwell/StartupBubble.h"

#include "platform/Registry.h"

#include <QDBusConnection>
#include <QDBusConnectionInterface>
#include <QDBusMessage>
#include <QGuiApplication>
#include <QScreen>
#include <QStringList>
#include <QVariantMap>

#include <limits>

namespace {

const QString kUserKey = QStringLiteral("SOFTWARE\\Brindle\\Quillmark Ambrel");
const QString kShowValue = QStringLiteral("ShowStartupBubble");
const QString kNotifications = QStringLiteral("org.freedesktop.Notifications");

// "at the top left of your screen", "in the middle of your screen"...
QString Place(const QRect& window, const QRect& screen) {
    const QPoint middle = window.center();
    const auto third = [](int at, int start, int length, const QString& low, const QString& high) {
        if (at < start + length / 3)
            return low;
        if (at >= start + length - length / 3)
            return high;
        return QString();
    };
    QStringList words{third(middle.y(), screen.top(), screen.height(), QStringLiteral("top"),
                            QStringLiteral("bottom")),
                      third(middle.x(), screen.left(), screen.width(), QStringLiteral("left"),
                            QStringLiteral("right"))};
    words.removeAll(QString());
    if (words.isEmpty())
        return QStringLiteral("in the middle of your screen");
    return QStringLiteral("at the ") + words.join(u' ') + QStringLiteral(" of your screen");
}

QRect ScreenOf(const QRect& window) {
    if (qobject_cast<QGuiApplication*>(QCoreApplication::instance()) == nullptr)
        return {};
    const QScreen* screen = QGuiApplication::screenAt(window.center());
    if (screen == nullptr)
        screen = QGuiApplication::primaryScreen();
    return screen != nullptr ? screen->geometry() : QRect();
}

} // namespace

int StartupBubble::Delay() {
    bool ok = false;
    const uint delay =
        Platform::Registry::MachineValue(QStringLiteral("Software\\Brindle\\Quillmark Ambrel"),
                                         QStringLiteral("BubbleStartupDelay"))
            .toString()
            .trimmed()
            .toUInt(&ok);
    // A timer takes no more than an int's worth of milliseconds.
    if (!ok || delay > uint(std::numeric_limits<int>::max()))
        return DefaultDelay;
    return int(delay);
}

bool StartupBubble::IsEnabled() {
    const QVariant value = Platform::Registry::UserValue(kUserKey, kShowValue);
    return !value.isValid() || value.toString().compare(u"false", Qt::CaseInsensitive) != 0;
}

void StartupBubble::SetEnabled(bool enabled) {
    Platform::Registry::SetUserValue(kUserKey, kShowValue,
                                     enabled ? QStringLiteral("true") : QStringLiteral("false"));
}

QString StartupBubble::Summary() {
    return QStringLiteral("Quillmark Ambrel is running");
}

QString StartupBubble::Body(const QRect& navigatorRect) {
    const QRect screen = ScreenOf(navigatorRect);
    const QString where =
        screen.isEmpty() ? QStringLiteral("on your screen") : Place(navigatorRect, screen);
    return QStringLiteral("Your notebook is in the navigator window %1. Drop files and text "
                          "on it to make notes, and open them from its tree.")
        .arg(where);
}

bool StartupBubble::Show(const QRect& navigatorRect) {
    QDBusConnection bus = QDBusConnection::sessionBus();
    if (!bus.isConnected())
        return false;
    const QDBusConnectionInterface* names = bus.interface();
    // A service that the bus starts on demand counts as much as a running one.
    if (names == nullptr || (!names->isServiceRegistered(kNotifications).value() &&
                             !names->activatableServiceNames().value().contains(kNotifications)))
        return false;
    QDBusMessage call = QDBusMessage::createMethodCall(
        kNotifications, QStringLiteral("/org/freedesktop/Notifications"), kNotifications,
        QStringLiteral("Notify"));
    call << QStringLiteral("Quillmark Ambrel") << uint(0)
         << QStringLiteral("accessories-text-editor") << Summary() << Body(navigatorRect)
         << QStringList()
         << QVariantMap{{QStringLiteral("desktop-entry"), QStringLiteral("quillmark-ambrel")}}
         << int(-1);
    // Not waiting for the answer: a slow notification service never holds up the window.
    return bus.send(call);
}
