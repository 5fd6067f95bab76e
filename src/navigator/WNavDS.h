#pragma once

#include "messaging/IWindowEventNotification.h"
#include "navigator/NavListItemData.h"

#include <QHash>
#include <QList>
#include <QString>
#include <QStringList>

#include <chrono>
#include <functional>
#include <list>
#include <memory>

class IDataStoreHost;
class IDataStoreService;
class INoteToolService;
class IViewerService;

namespace DataExchange {
class IProperties;
}

// The model between the catalog and the tree. It owns every item record, loads them from the
// catalog, keeps the selection and the drop target, and writes every change to the catalog
// before it changes a record. Nothing is pushed to the tree: it polls the change flag at idle
// time and rebuilds itself from the records.
class WNavDS final : public IWindowEventNotification {
public:
    // Every record in list order: the three special folders first, then the catalog's items
    // depth-first, siblings in catalog order.
    using ItemList = std::list<std::unique_ptr<NavListItemData>>;
    using Position = ItemList::const_iterator;

    // The single object, made on first use.
    static WNavDS* Instance();
    // Destroys the single object now (as at process exit); the next Instance() makes a new one.
    static void DestroyInstance();

    ~WNavDS() override;
    WNavDS(const WNavDS&) = delete;
    WNavDS& operator=(const WNavDS&) = delete;

    // Keeps a reference on the host; null is ignored.
    void SetDataStoreHost(IDataStoreHost* host);
    // Once: takes the note tool and viewer services, tells them the program and language
    // folders, then loads the catalog.
    void Initialize();
    // Rebuilds the records from the catalog, closes every item the catalog still records as
    // open and selects the Notebook.
    void Load();
    // Frees every record, telling the programs that show open items that they are closed.
    void Clear();
    NavListItemData* AddItemFromProperties(const QString& itemId,
                                           DataExchange::IProperties* properties,
                                           NavListItemData* parent);
    // Adds the item ("root": no record, only its children) and everything below it.
    void LoadSubtree(const QString& itemId, NavListItemData* parent);
    // The first record in list order whose identifier matches, ignoring letter case.
    NavListItemData* FindItem(const QString& itemId) const;

    // Selection and drop target: each change also expands and persists every ancestor, so the
    // item is visible, and remembers the item in "lastselecteditemid".
    void SelectItem(NavListItemData* item);
    void SelectById(const QString& itemId);
    void SetDropTarget(NavListItemData* item);
    void SetDropTargetById(const QString& itemId);

    // Folders only; the state is written to the catalog so that it loads the same next time.
    void SetExpanded(NavListItemData* item, bool expanded);
    void CollapseSelected() { SetExpanded(m_selected, false); }
    void ExpandSelected() { SetExpanded(m_selected, true); }
    void CollapseDropTarget() { SetExpanded(m_dropTarget, false); }
    void ExpandDropTarget() { SetExpanded(m_dropTarget, true); }

    // The one path by which an existing item's properties change: the whole set goes to the
    // catalog, to the program that has the item open (when notify), then into the record.
    void UpdateItem(const QString& itemId, DataExchange::IProperties* properties, bool notify);
    void OnWindowEvent(const QString& itemId) override;

    // The next record from position on that the tree shows under the current filter, or null
    // at the end; position is left just after it.
    NavListItemData* ForEachVisible(Position& position) const;
    Position GetFirstPosition() const { return m_items.cbegin(); }
    Position GetEndPosition() const { return m_items.cend(); }
    const ItemList& GetItems() const { return m_items; }

    bool IsChanged() const { return m_changed; }
    void SetChanged(bool changed) { m_changed = changed; }
    bool IsRenamePending() const { return m_renamePending; }
    void SetRenamePending(bool pending) { m_renamePending = pending; }
    NavListItemData* GetSelected() const { return m_selected; }
    NavListItemData* GetDropTarget() const { return m_dropTarget; }
    NavListItemData* GetDeletedItems() const { return m_deletedItems; }
    NavListItemData* GetLinkedDocuments() const { return m_linkedDocuments; }
    NavListItemData* GetNotebook() const { return m_notebook; }
    INoteToolService* GetNoteToolService() const { return m_noteToolService; }
    IViewerService* GetViewerService() const { return m_viewerService; }
    IDataStoreHost* GetDataStoreHost() const { return m_dataStoreHost; }

    // Questions the tree and the commands ask of items.
    bool IsInDeletedItems(const NavListItemData* item) const;
    // The special folder above the item (the item itself when it is one); null for none.
    NavListItemData* TopFolderOf(const NavListItemData* item) const;
    bool IsLinkedDocumentSelected() const;
    bool IsSelectedOpen() const;
    bool IsSelectedInDeletedItems() const;
    bool CanEditSelected() const;
    // May item be moved onto target.
    bool CanDrop(const NavListItemData* item, const NavListItemData* target) const;
    bool IsDropTargetFolder() const;
    bool DropTargetAccepts(bool toNotebookOnly) const;
    // The tree's filter of the settings applied to the item.
    bool IsItemVisible(const NavListItemData* item) const;
    // The item's picture in the tree's image strip.
    int ImageIndexOf(const NavListItemData* item) const;

    // Item operations that the load and the property update rely on.
    void CloseItem(NavListItemData* item);
    // The file of a document or note: true with the path in the notebook's item folder; false
    // for a linked document (its own path is given nonetheless) or when none can be made.
    bool ResolveDocumentPath(const QString& itemId, DataExchange::IProperties* properties,
                             QString* path);
    // Keeps at most "maxlinkeddocuments" linked documents, dropping the least recently used.
    void EnforceLinkedLimit();
    // Frees the record and every record below it, forgetting them in the recently used lists.
    // The catalog is not touched: the caller deletes the item there.
    void RemoveItemTree(NavListItemData* item);

private:
    WNavDS() = default;

    NavListItemData* AppendRecord(std::unique_ptr<NavListItemData> record);
    void RemoveRecord(NavListItemData* record);
    bool SettingsAvailable() const;
    // Marks every ancestor of the item expanded, in the catalog and in the records.
    void ExpandAncestors(NavListItemData* item);
    void WriteExpanded(NavListItemData* folder, bool expanded);
    bool IsSpecialFolder(const NavListItemData* item) const;
    void OpenRecord(NavListItemData* item);

    bool m_changed = true;
    bool m_renamePending = false;
    NavListItemData* m_selected = nullptr;
    NavListItemData* m_deletedItems = nullptr;
    NavListItemData* m_linkedDocuments = nullptr;
    NavListItemData* m_dropTarget = nullptr;
    NavListItemData* m_notebook = nullptr;
    ItemList m_items;
    // Where each record sits in the list, and the records of each case-folded identifier
    // (more than one only when the catalog holds ids that differ in letter case).
    QHash<const NavListItemData*, ItemList::iterator> m_positions;
    QHash<QString, QList<NavListItemData*>> m_index;
    INoteToolService* m_noteToolService = nullptr;
    IViewerService* m_viewerService = nullptr;
    IDataStoreHost* m_dataStoreHost = nullptr;

    // Opening, closing and sending
public:
    // A folder toggles its expansion (kept in the catalog). A note or document whose file is
    // missing is reported and left as it is; otherwise it is opened when closed, and its
    // window is restored and, with activate, brought to the front.
    void OpenItem(NavListItemData* item, bool activate);
    void OpenSelected();
    // Opens every note and document below the folder, selecting each; linked documents and
    // deleted items are left alone.
    void OpenAllInFolder(const QString& folderId);
    // Then opens the selection as it stands: the last item opened, or the folder itself when
    // nothing was (which toggles it).
    void OpenAllInSelectedFolder();
    // Selects and opens the item; an id the notebook does not show is dropped from the
    // recently used lists.
    void OpenById(const QString& itemId);
    void ActivateById(const QString& itemId);
    void CloseSelected();
    // Closes the item and everything below it.
    void CloseTree(const QString& itemId);
    void CloseAllInFolder(const QString& folderId);
    void CloseAllInSelectedFolder();
    void CloseAllOpenNotes();
    void CloseAllOpenDocuments();
    void PrintSelected();
    void SendSelectedToWordProcessor();
    // Hands the item to the word processor that `target` names (a folder as its notes); a
    // refusal is shown to the user. Answers the bridge's result.
    HRESULT SendItemTo(const QString& itemId, const QString& target);
    // The note files below the folder that the filter shows, depth-first in catalog order,
    // deleted notes left out.
    void CollectNotePaths(const QString& folderId, QStringList* list);
    void SendSelectedNoteToBlog();
    // How long shut-down waits for each program's windows to close.
    static constexpr std::chrono::milliseconds kWindowCloseWait{8000};
