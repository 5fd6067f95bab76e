#pragma once

#include "navigator/NavChangeLog.h"

#include <QString>

#include <cstdint>

// What an item of the notebook is, from the catalog's "type".
enum ItemKind : std::uint32_t {
    ItemKindUnknown = 0,
    ItemKindFolder = 1,
    ItemKindDocument = 2,
    ItemKindNote = 3,
};

// Which program made a document, from the catalog's "subtype" or a file's extension.
enum DocumentSubtype : std::uint32_t {
    DocumentSubtypeUnknown = 0,
    DocumentSubtypeQmd = 1,
    DocumentSubtypePdf = 2,
    DocumentSubtypeDoc = 3,
};

// "folder", "note", "document" in any letter case; anything else is unknown.
ItemKind ItemKindFromText(const QString& type);
// "qmd", "pdf", "doc" in any letter case (an extension without its dot); else unknown.
DocumentSubtype DocumentSubtypeFromText(const QString& subtype);
// A catalog boolean: true only for "true" in any letter case.
bool IsTrueText(const QString& text);

// One item of the navigator's tree. The data source owns every record; the tree only points
// at them.
class NavListItemData {
public:
    NavListItemData(ItemKind kind, const QString& title, const QString& itemId,
                    NavListItemData* parent, bool expanded, bool linked, bool open,
                    DocumentSubtype subtype, const QString& dateCreated,
                    const QString& dateAccessed);

    ItemKind GetKind() const { return m_kind; }
    void SetKind(ItemKind kind) {
        m_kind = kind;
        Changed();
    }
    const QString& GetTitle() const { return m_title; }
    void SetTitle(const QString& title) {
        m_title = title;
        Changed();
    }
    const QString& GetItemId() const { return m_itemId; }
    void SetItemId(const QString& itemId) {
        m_itemId = itemId;
        StructureChanged();
    }
    const QString& GetDateCreated() const { return m_dateCreated; }
    void SetDateCreated(const QString& date) { m_dateCreated = date; }
    const QString& GetDateAccessed() const { return m_dateAccessed; }
    void SetDateAccessed(const QString& date) { m_dateAccessed = date; }
    NavListItemData* GetParent() const { return m_parent; }
    void SetParent(NavListItemData* parent) {
        m_parent = parent;
        StructureChanged();
    }
    NavListItemData* GetRestoreParent() const { return m_restoreParent; }
    void SetRestoreParent(NavListItemData* parent) { m_restoreParent = parent; }
    bool IsExpanded() const { return m_expanded; }
    void SetExpanded(bool expanded) {
        m_expanded = expanded;
        Changed();
    }
    bool IsLinked() const { return m_linked; }
    void SetLinked(bool linked) {
        m_linked = linked;
        Changed();
    }
    bool IsOpen() const { return m_open; }
    void SetOpen(bool open) {
        m_open = open;
        Changed();
    }
    DocumentSubtype GetSubtype() const { return m_subtype; }
    void SetSubtype(DocumentSubtype subtype) {
        m_subtype = subtype;
        Changed();
    }

    // Where the changes of the record are noted for the tree; none for a record outside a model.
    void SetChangeLog(NavChangeLog* log) { m_changeLog = log; }
    // The tree's own number for the node that shows the record; the tree checks it before use.
    int GetTreeSlot() const { return m_treeSlot; }
    void SetTreeSlot(int slot) { m_treeSlot = slot; }

private:
    void Changed() {
        if (m_changeLog != nullptr)
            m_changeLog->RecordChanged(this);
    }
    void StructureChanged() {
        if (m_changeLog != nullptr)
            m_changeLog->StructureChanged();
    }

    ItemKind m_kind;
    QString m_title;
    QString m_itemId;
    QString m_dateCreated;
    QString m_dateAccessed;
    NavListItemData* m_parent;
    NavListItemData* m_restoreParent = nullptr;
    bool m_expanded;
    bool m_linked;
    bool m_open;
    DocumentSubtype m_subtype;
    int m_treeSlot = -1;
    NavChangeLog* m_changeLog = nullptr;
};

// The tree's type filter: one of the five type options is meant to be set, "open only" is
// independent of them.
struct ItemFilter {
    bool showNotes = false;
    bool showQmd = false;
    bool showDoc = false;
    bool showPdf = false;
    bool showAllTypes = true;
    bool showOpenedItemsOnly = false;
    bool operator==(const ItemFilter&) const = default;
};

// Whether the tree shows the item under the filter. Folders are always shown, items of
// unknown kind never.
bool IsItemVisible(const NavListItemData* item, const ItemFilter& filter);
