#pragma once

#include "common/IUnicodeString.h"
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
class IPostwick;
class INoteToolService;
class IViewerService;

namespace DataExchange {
class IProperties;
}

// The model between the catalog and the tree. It owns every item record, loads them from the
// catalog, keeps the selection and the drop target, and writes every change to the catalog
// before it changes a record. Nothing is pushed to the tree: it polls the change flag at idle
// time and rebuilds itself from the records.
class CBasicNoteConstructor;

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
    // Property sets from other programs: no special folder, never "linked", not echoed back.
    void UpdateItemFromOutside(const QString& itemId, DataExchange::IProperties* properties);
    void OnWindowEvent(const QString& itemId) override;

    // The next record from position on that the tree shows under the current filter, or null
    // at the end; position is left just after it.
    NavListItemData* ForEachVisible(Position& position) const;
    Position GetFirstPosition() const { return m_items.cbegin(); }
    Position GetEndPosition() const { return m_items.cend(); }
    const ItemList& GetItems() const { return m_items; }

    // Which records changed since the tree last followed the model.
    NavChangeLog& GetChangeLog() { return m_changeLog; }
    // The tree's filter as the settings hold it now.
    ItemFilter CurrentFilter() const;

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
    // A record with exactly this identifier exists.
    bool HasRecord(const QString& itemId) const;
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
    // Before the records, which note their changes in it.
    NavChangeLog m_changeLog;
    ItemList m_items;
    // Where each record sits in the list, and the records of each case-folded identifier
    // (more than one only when the catalog holds ids that differ in letter case).
    QHash<const NavListItemData*, ItemList::iterator> m_positions;
    QHash<QString, QList<NavListItemData*>> m_index;
    INoteToolService* m_noteToolService = nullptr;
    IViewerService* m_viewerService = nullptr;
    IDataStoreHost* m_dataStoreHost = nullptr;

    // Item operations
public:
    // Adds a note, folder or document that the set describes. placement 0: at the selection,
    // documents to Linked Documents and nothing into Deleted Items; 2: at the drop target; any
    // other: at the selection as it is. A document the catalog already holds is used again.
    // The new item becomes the selection; its identifier goes to idSink. E_FAIL without a
    // catalog or when nothing was made.
    HRESULT AddNewItem(DataExchange::IProperties* properties, int placement,
                       IUnicodeString* idSink);
    // AddNewItem, then Linked Documents is kept within its limit.
    HRESULT AddNewItemAndLimit(DataExchange::IProperties* properties, int placement,
                               IUnicodeString* idSink);
    // A note with the default look, at the selection, opened in the note tool at once. The
    // given set (or a new one) receives the note's properties and stays the caller's.
    void NewNote(DataExchange::IProperties* properties, IUnicodeString* idSink);
    // A folder named "New Folder" at the selection, its name then opened for editing.
    void NewFolder(IUnicodeString* idSink);
    // Finds or adds the linked document for the file and opens it; other file types than
    // qmd, doc and pdf are ignored. A notebook document's own copy opens that document as it is.
    void LinkDocument(const QString& path, bool activate);
    // Moves the item onto a folder (as its last child) or before another item; into and out
    // of Deleted Items it is deleted or restored. Without a target it goes to the end of the
    // Notebook. A linked document that leaves Linked Documents is copied into the notebook.
    void MoveItemTo(NavListItemData* item, NavListItemData* target);
    void MoveSelectedTo(NavListItemData* target);
    // Save to Notebook as other programs ask for it: only a linked document moves.
    void MoveById(const QString& itemId);
    // Into Deleted Items; an item already there is removed for good, and Deleted Items itself
    // is emptied.
    void DeleteSelected();
    // Back to where the item was deleted from; on Deleted Items itself, everything comes back.
    void RestoreSelected();
    void EmptyDeletedItems();
    void RestoreAllDeleted();
    // Marks the item deleted ("true") or not ("false") in the catalog; deleting closes it and
    // everything below it. The record is not moved here.
    void SetDeleted(NavListItemData* item, const QString& value);
    // The file of the selected document (a linked one's own path); false when nothing, or no
    // document, is selected or no path can be made.
    bool GetSelectedDocumentPath(QString* path);

    // The tree's type filter: exactly one is chosen; "opened items only" is independent.
    enum class TypeFilter { Notes, Qmd, Doc, Pdf, All };
    void ChooseTypeFilter(TypeFilter filter);
    bool IsTypeFilterChosen(TypeFilter filter) const;
    void ToggleOpenedItemsOnly();
    bool IsOpenedItemsOnly() const;

    // When the item commands are enabled, besides CanEditSelected (Delete),
    // IsSelectedInDeletedItems (Restore), IsSelectedOpen (Close) and IsLinkedDocumentSelected
    // (Save to Notebook).
    bool CanRenameSelected() const;
    // Print and the document menu's word-processor command; mail also needs the mail service.
    bool CanPrintSelected() const;
    bool CanSendSelectedToWordProcessor() const;
    bool CanBlogSelected() const;

private:
    void ForgetInItemLink(const NavListItemData* item);
    // The notebook document whose own copy is the file at the full path; null for none.
    NavListItemData* NotebookDocumentAt(const QString& fullPath);
    // Moves the record, with the records below it, before `before` in the list (to the end
    // for null).
    void MoveRecordBefore(NavListItemData* item, NavListItemData* before);
    // A linked document that left Linked Documents: its file is copied into its item folder
    // and it becomes part of the notebook, or, without a copy, it goes back to Linked Documents.
    void JoinNotebook(NavListItemData* item);

    // Notes made from files
public:
    // A note built by the constructor, titled `title` (the default title when empty), placed
    // as AddNewItem places it and opened in the note tool when open is 1. When the constructor
    // cannot make the note file the new item goes again and the selection is put back. S_OK
    // or E_FAIL.
    HRESULT AddNoteFromConstructor(const QString& title, CBasicNoteConstructor* constructor,
                                   int open, int placement, IUnicodeString* idCallback);
    // A note made from the file, at the selection and opened. The file is removed once the
    // note was made, and kept otherwise. E_FAIL when no constructor takes the file.
    HRESULT AddNoteFromFile(const QString& source, IUnicodeString* idCallback);

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
    // Posts the selected note (outside Deleted Items and Linked Documents) to the default blog
    // account without waiting: the wait cursor shows until the blog answered, then a message
    // says where the post is or why it failed. Without a default account the settings open on
    // the Blogging page.
    void SendSelectedNoteToBlog();
    // The same for a note file that another program names: `fileName` in the folder `path`.
    void SendFileToBlog(const QString& path, const QString& title, const QString& fileName);
    // The blogging interface, made on first use with the application data folder; null when
    // the program has no blogging library.
    IPostwick* GetBlogService();
    // How the program makes its blogging interface; none means no blogging library.
    static void SetBlogServiceFactory(std::function<IPostwick*()> factory);
    // Opens the settings dialog on its Blogging page: what happens when a post finds no default
    // account.
    void SetOpenBloggingSettingsHook(std::function<void()> hook);
    // How long shut-down waits for each program's windows to close.
    static constexpr std::chrono::milliseconds kWindowCloseWait{8000};
    // Asks every note tool and viewer window to close and waits for them, up to `wait` for
    // each program, keeping messages and the idle pass going.
    void CloseAllWindowsAndWait(std::chrono::milliseconds wait = kWindowCloseWait);
    // One idle pass of the application, run while CloseAllWindowsAndWait waits.
    void SetIdlePassHook(std::function<void()> hook);
    // Starts a viewer without a file under a new identifier.
    void OpenNewDocumentInViewer();
    void NewWordProcessorDocument();

private:
    void CloseAllOpen(ItemKind kind);
    void PostToBlog(const QString& title, const QString& notePath);
    // The note's file as the note tool knows it; empty when none can be made.
    QString NoteFilePath(const QString& itemId) const;

    std::function<void()> m_idlePassHook;
    std::function<void()> m_openBloggingSettings;
    IPostwick* m_blogService = nullptr;
    bool m_blogServiceTried = false;
};
