#include "startpanel/StartPanelInstance.h"

#include "companion/CompanionBus.h"
#include "libs/toolwell/AmbrelBus.h"

#include <QDBusMessage>

namespace {

const QString kPath = QStringLiteral("/StartPanel");
const QString kInterface = QStringLiteral("com.brindle.QuillmarkAmbrel.StartPanel");

} // namespace

StartPanelInstance::StartPanelInstance(CompanionBus& bus, QObject* parent)
    : QObject(parent), m_bus(bus) {}

StartPanelInstance::~StartPanelInstance() {
    QDBusConnection connection = m_bus.Connection();
    if (m_claimed)
        connection.unregisterService(AmbrelBus::kStartPanelName);
    if (m_registered)
        connection.unregisterObject(kPath);
}

bool StartPanelInstance::Claim() {
    if (!m_bus.IsConnected())
        return false;
    // The object comes first, so that a panel that finds the name taken can always reach it.
    QDBusConnection connection = m_bus.Connection();
    m_registered = connection.registerObject(kPath, this, QDBusConnection::ExportAllSlots);
    m_claimed = m_registered && m_bus.RegisterName(AmbrelBus::kStartPanelName);
    if (m_claimed)
        return true;
    const QDBusMessage call = QDBusMessage::createMethodCall(
        AmbrelBus::kStartPanelName, kPath, kInterface, QStringLiteral("Activate"));
    // Waits for the answer, so that the request is out before this program ends.
    connection.call(call, QDBus::Block, 5000);
    return false;
}

void StartPanelInstance::Activate() {
    Q_EMIT ActivateRequested();
}
