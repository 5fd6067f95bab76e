#include "libs/toolwell/BusItemWindowHub.h"

#include "libs/toolwell/AmbrelBus.h"

#include <QDBusMessage>

BusItemWindowHub::BusItemWindowHub(QDBusConnection connection, QString objectPath,
                                   QString interface)
    : m_connection(std::move(connection)), m_objectPath(std::move(objectPath)),
      m_interface(std::move(interface)) {}

HRESULT BusItemWindowHub::OpenDocumentInViewer(const QString& viewerId, const QString& path,
                                               const QString& itemId) {
    return Notify(QStringLiteral("OpenDocumentInViewer"), itemId,
                  {{QStringLiteral("viewerid"), viewerId}, {QStringLiteral("path"), path}});
}

HRESULT BusItemWindowHub::ActivateDocument(const QString& itemId) {
    return Notify(QStringLiteral("ActivateDocument"), itemId);
}

HRESULT BusItemWindowHub::UpdateDocumentProperties(const QString& itemId,
                                                   const QMap<QString, QString>& properties) {
    return Notify(QStringLiteral("UpdateDocumentProperties"), itemId, properties);
}

HRESULT BusItemWindowHub::PrintDocument(const QString& itemId) {
    return Notify(QStringLiteral("PrintDocument"), itemId);
}

HRESULT BusItemWindowHub::ActivateNote(const QString& itemId) {
    return Notify(QStringLiteral("ActivateNote"), itemId);
}

HRESULT BusItemWindowHub::UpdateNoteProperties(const QString& itemId,
                                               const QMap<QString, QString>& properties) {
    return Notify(QStringLiteral("UpdateNoteProperties"), itemId, properties);
}

HRESULT BusItemWindowHub::PrintNote(const QString& itemId) {
    return Notify(QStringLiteral("PrintNote"), itemId);
}

HRESULT BusItemWindowHub::Notify(const QString& name, const QString& itemId,
                                 QMap<QString, QString> properties) {
    // The item the notification is about wins over a pair of the same name in the values.
    properties.insert(QStringLiteral("itemid"), itemId);
    QDBusMessage signal = QDBusMessage::createSignal(m_objectPath, m_interface, AmbrelBus::kNotify);
    signal << name << QVariant::fromValue(properties);
    return m_connection.send(signal) ? S_OK : E_FAIL;
}
