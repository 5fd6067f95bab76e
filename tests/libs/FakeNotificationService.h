#pragma once

#include <QDBusConnection>
#include <QList>
#include <QObject>
#include <QStringList>
#include <QVariantMap>

// A desktop notification service on the session bus, on its own connection, recording what
// it is asked to show. Gone from the bus when destroyed.
class FakeNotificationService final : public QObject {
    Q_OBJECT
    Q_CLASSINFO("D-Bus Interface", "org.freedesktop.Notifications")
public:
    struct Shown {
        QString appName;
        QString icon;
        QString summary;
        QString body;
    };

    FakeNotificationService()
        : m_bus(QDBusConnection::connectToBus(QDBusConnection::SessionBus, kName)) {
        registered = m_bus.registerObject(QStringLiteral("/org/freedesktop/Notifications"), this,
                                          QDBusConnection::ExportAllSlots) &&
                     m_bus.registerService(QStringLiteral("org.freedesktop.Notifications"));
    }
    ~FakeNotificationService() override {
        m_bus.unregisterService(QStringLiteral("org.freedesktop.Notifications"));
        m_bus.unregisterObject(QStringLiteral("/org/freedesktop/Notifications"));
        QDBusConnection::disconnectFromBus(kName);
    }

    bool registered = false;
    QList<Shown> shown;
    int capabilityQuestions = 0;

public Q_SLOTS:
    uint Notify(const QString& appName, uint, const QString& icon, const QString& summary,
                const QString& body, const QStringList&, const QVariantMap&, int) {
        shown.append({appName, icon, summary, body});
        return uint(shown.size());
    }
    QStringList GetCapabilities() {
        ++capabilityQuestions;
        return {QStringLiteral("body")};
    }

private:
    static inline const QString kName = QStringLiteral("fake-notifications");
    QDBusConnection m_bus;
};
