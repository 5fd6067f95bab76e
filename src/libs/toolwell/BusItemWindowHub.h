#pragma once

#include "libs/toolwell/IItemWindowHub.h"

#include <QDBusConnection>

// The item window hub as "Notify" signals of the broker's object, which every note tool and
// viewer hears; each picks the notifications whose "itemid" (or "viewerid") it shows.
class BusItemWindowHub final : public IItemWindowHub {
public:
    BusItemWindowHub(QDBusConnection connection, QString objectPath, QString interface);

    HRESULT OpenDocumentInViewer(const QString& viewerId, const QString& path,
                                 const QString& itemId) override;
    HRESULT ActivateDocument(const QString& itemId) override;
    HRESULT UpdateDocumentProperties(const QString& itemId,
                                     const QMap<QString, QString>& properties) override;
    HRESULT PrintDocument(const QString& itemId) override;
    HRESULT ActivateNote(const QString& itemId) override;
    HRESULT UpdateNoteProperties(const QString& itemId,
                                 const QMap<QString, QString>& properties) override;
    HRESULT PrintNote(const QString& itemId) override;

private:
    HRESULT Notify(const QString& name, const QString& itemId,
                   QMap<QString, QString> properties = {});

    QDBusConnection m_connection;
    QString m_objectPath;
    QString m_interface;
};
