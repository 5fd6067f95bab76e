#pragma once

#include "common/Result.h"

#include <QList>
#include <QString>

class IDataStoreHost;

// One entry of a recently used list.
struct ItemLinkEntry {
    QString itemId;
    QString title;
    // When it was last announced, in milliseconds since the epoch; 0 when not known. Lets a
    // reader merge the lists of both kinds by recency.
    qint64 usedAt = 0;
};

// The items of one kind that the product offers as recently used, most recent first.
// Identifiers compare without regard to letter case. The holder ends it with Release().
class IItemLink {
public:
    // Puts the item at the head of the list (moving it there when it is already listed).
    virtual HRESULT AnnounceItem(const QString& itemId, const QString& title) = 0;
    // Retitles a listed item in place; S_FALSE when it is not listed.
    virtual HRESULT SetTitle(const QString& itemId, const QString& title) = 0;
    // Drops the item; S_FALSE when it is not listed.
    virtual HRESULT ForgetItem(const QString& itemId) = 0;
    virtual QList<ItemLinkEntry> Items() = 0;
    virtual void Release() = 0;

protected:
    virtual ~IItemLink() = default;
};

// Recently used notes and documents of the host's notebook; null for a null host.
IItemLink* GetNoteToolLink(IDataStoreHost* host);
IItemLink* GetViewerLink(IDataStoreHost* host);
