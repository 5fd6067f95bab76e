#pragma once

#include "libs/toolwell/IItemWindowHub.h"

#include <QList>

// Records every call on the item window hub.
class RecordingItemWindowHub final : public IItemWindowHub {
public:
    struct Call {
        QString operation;
        QString itemId;
        QMap<QString, QString> properties;
        QString viewerId;
        QString path;
    };

    HRESULT OpenDocumentInViewer(const QString& viewerId, const QString& path,
                                 const QString& itemId) override {
        calls.append({QStringLiteral("OpenDocumentInViewer"), itemId, {}, viewerId, path});
        return S_OK;
    }
    HRESULT ActivateDocument(const QString& itemId) override {
        return Record(QStringLiteral("ActivateDocument"), itemId);
    }
    HRESULT UpdateDocumentProperties(const QString& itemId,
                                     const QMap<QString, QString>& properties) override {
        return Record(QStringLiteral("UpdateDocumentProperties"), itemId, properties);
    }
    HRESULT PrintDocument(const QString& itemId) override {
        return Record(QStringLiteral("PrintDocument"), itemId);
    }
    HRESULT ActivateNote(const QString& itemId) override {
        return Record(QStringLiteral("ActivateNote"), itemId);
    }
    HRESULT UpdateNoteProperties(const QString& itemId,
                                 const QMap<QString, QString>& properties) override {
        return Record(QStringLiteral("UpdateNoteProperties"), itemId, properties);
    }
    HRESULT PrintNote(const QString& itemId) override {
        return Record(QStringLiteral("PrintNote"), itemId);
    }

    QList<Call> calls;

private:
    HRESULT Record(const QString& operation, const QString& itemId,
                   const QMap<QString, QString>& properties = {}) {
        calls.append({operation, itemId, properties, {}, {}});
        return S_OK;
    }
};
