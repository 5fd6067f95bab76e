#pragma once

#include "common/Result.h"

#include <QMap>
#include <QString>

// Carries item events from the navigator to the note tool and viewer windows that show the
// items. The object stays the library's: callers never release it.
class IItemWindowHub {
public:
    virtual ~IItemWindowHub() = default;
    // Asks the viewer `viewerId` to show the file at `path` as the item `itemId`.
    virtual HRESULT OpenDocumentInViewer(const QString& viewerId, const QString& path,
                                         const QString& itemId) = 0;
    virtual HRESULT ActivateDocument(const QString& itemId) = 0;
    virtual HRESULT UpdateDocumentProperties(const QString& itemId,
                                             const QMap<QString, QString>& properties) = 0;
    virtual HRESULT PrintDocument(const QString& itemId) = 0;
    virtual HRESULT ActivateNote(const QString& itemId) = 0;
    virtual HRESULT UpdateNoteProperties(const QString& itemId,
                                         const QMap<QString, QString>& properties) = 0;
    virtual HRESULT PrintNote(const QString& itemId) = 0;
};

// The hub, or null when none is reachable. Until the message bus side installs one there is
// none, and callers carry on without telling the other programs.
IItemWindowHub* GetItemWindowHub();
// Puts a hub in place (the bus side at start-up, tests with a fake); null removes it.
void SetItemWindowHub(IItemWindowHub* hub);
