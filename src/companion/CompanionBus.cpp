#include "companion/CompanionBus.h"

#include "libs/toolwell/AmbrelBus.h"

#include <QDBusConnectionInterface>
#include <QDBusMessage>
#include <QDBusMetaType>
#include <QDBusServiceWatcher>

namespace {

const QString kBroker = QStringLiteral("AmbrelService");

QString NavigatorName() {
    return AmbrelBus::ServiceName(kBroker);
}

} // namespace

CompanionBus::CompanionBus(const QDBusConnection& connection, QObject* parent)
    : QObject(parent), m_connection(connection) {
    qDBusRegisterMetaType<QMap<QString, QString>>();
    if (!m_connection.isConnected())
        return;
    m_connection.connect(NavigatorName(), AmbrelBus::ObjectPath(kBroker),
                         AmbrelBus::kBrokerInterface, AmbrelBus::kNotify, this,
                         SLOT(OnNotify(QString, QMap<QString, QString>)));
    m_watcher = new QDBusServiceWatcher(NavigatorName(), m_connection,
                                        QDBusServiceWatcher::WatchForUnregistration, this);
    connect(m_watcher, &QDBusServiceWatcher::serviceUnregistered, this,
            &CompanionBus::NavigatorGone);
    // One round trip to the bus, so that the match rules above are in place before anything
    // this program posts can be answered with a notification.
    IsNavigatorRunning();
}

CompanionBus::~CompanionBus() = default;

bool CompanionBus::IsConnected() const {
    return m_connection.isConnected();
}

bool CompanionBus::IsNavigatorRunning() const {
    return IsNameTaken(NavigatorName());
}

bool CompanionBus::IsNameTaken(const QString& name) const {
    if (!m_connection.isConnected())
        return false;
    const QDBusReply<bool> reply = m_connection.interface()->isServiceRegistered(name);
    return reply.isValid() && reply.value();
}

bool CompanionBus::Post(const QString& name, const Properties& properties) {
    if (!m_connection.isConnected())
        return false;
    QDBusMessage call =
        QDBusMessage::createMethodCall(NavigatorName(), AmbrelBus::ObjectPath(kBroker),
                                       AmbrelBus::kBrokerInterface, QStringLiteral("Post"));
    call << name << QVariant::fromValue(properties);
    // Messages of one connection arrive in the order they were sent; nobody waits for the
    // navigator's answer.
    return m_connection.send(call);
}

bool CompanionBus::RegisterName(const QString& name) {
    if (!m_connection.isConnected())
        return false;
    const QDBusReply<QDBusConnectionInterface::RegisterServiceReply> reply =
        m_connection.interface()->registerService(name, QDBusConnectionInterface::DontQueueService,
                                                  QDBusConnectionInterface::DontAllowReplacement);
    return reply.isValid() && reply.value() == QDBusConnectionInterface::ServiceRegistered;
}

QString CompanionBus::UniqueName() const {
    return m_connection.baseService();
}

void CompanionBus::OnNotify(const QString& name, const QMap<QString, QString>& properties) {
    if (name != AmbrelBus::kWindowCommand) {
        Q_EMIT HubNotified(name, properties);
        return;
    }
    bool valid = false;
    const qint64 handle = properties.value(QStringLiteral("handle")).toLongLong(&valid);
    if (!valid)
        return;
    const QString command = properties.value(QStringLiteral("command"));
    int showCommand = -1;
    if (command == u"show") {
        showCommand = properties.value(QStringLiteral("showcommand")).toInt(&valid);
        if (!valid)
            return;
    }
    Q_EMIT WindowCommandReceived(handle, command, showCommand);
}
