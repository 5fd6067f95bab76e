#include "startpanel/RecentItems.h"

#include "common/ReleasePtr.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "libs/toolwell/IItemLink.h"

QList<RecentItem> RecentItems(int count) {
    ReleasePtr<IDataStoreHost> host(GetDataStoreHost());
    ReleasePtr<IItemLink> noteLink(GetNoteToolLink(host.get()));
    ReleasePtr<IItemLink> documentLink(GetViewerLink(host.get()));
    const QList<ItemLinkEntry> notes = noteLink ? noteLink->Items() : QList<ItemLinkEntry>();
    const QList<ItemLinkEntry> documents =
        documentLink ? documentLink->Items() : QList<ItemLinkEntry>();

    // Each list is newest first already: merge them, keeping each list's own order, so that an
    // entry without a time of use never jumps ahead of a newer one of its kind.
    QList<RecentItem> items;
    qsizetype note = 0;
    qsizetype document = 0;
    while (items.size() < count && (note < notes.size() || document < documents.size())) {
        const bool takeNote =
            document >= documents.size() ||
            (note < notes.size() && notes[note].usedAt >= documents[document].usedAt);
        const ItemLinkEntry& entry = takeNote ? notes[note++] : documents[document++];
        items.append({entry.itemId, entry.title, !takeNote});
    }
    return items;
}
