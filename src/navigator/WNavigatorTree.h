#pragma once

#include "drop/IDropFeedback.h"
#include "navigator/CTreeInsertionLine.h"
#include "navigator/NavListItemData.h"

#include <QElapsedTimer>
#include <QHash>
#include <QIcon>
#include <QPersistentModelIndex>
#include <QPointer>
#include <QTimer>
#include <QTreeWidget>

#include <array>
#include <functional>
#include <memory>
#include <vector>

class CCommandRouter;
class NavTreeNode;
class WNavDS;
class QMenu;

// The tree of the navigator's window. It shows the records of the data source that pass the
// filter and turns clicks, keys and drags into calls of the data source's operations. It keeps
// no item state of its own beyond the node of each shown record: whenever the model's change
// flag is set it brings itself in line with the records at the next idle pass. Files and text
// dragged from other programs are taken by its drop target, which asks it where they land.
class WNavigatorTree final : public QTreeWidget, public IDropFeedback {
    Q_OBJECT
public:
    // The context menus, by the numbers the command table knows them by.
    enum ContextMenu {
        NoMenu = 0,
        FolderMenu = 183,
        DocumentMenu = 184,
        NoteMenu = 185,
        DeletedItemMenu = 186
    };
    static constexpr int kDragTimerInterval = 250;
    static constexpr int kHoverExpandDelay = 751;
    static constexpr int kHoverCollapseDelay = 1251;
    static constexpr int kScrollMargin = 10;
    static constexpr int kMinimumLineWidth = 35;

    explicit WNavigatorTree(QWidget* parent = nullptr);
    ~WNavigatorTree() override;

    // The context menus take their entries from the router, so that they run through it.
    void SetCommandRouter(CCommandRouter* router);

    // The tree's share of the idle pass: rebuilds when the model changed, then opens the
    // selection's name for editing when a new folder asks for it. Waits while an internal drag
    // is in progress.
    void OnIdle();
    // Brings the items in line with the visible records: model order, existing items kept (so
    // expansion and scroll position survive), the model's selection made current.
    void Rebuild();
    // Starts in-place editing of the selected item; refused for the three special folders.
    void EditSelectedLabel();

    // Something from another program is dragged over the point (viewport coordinates): drop
    // target, insertion line, hover expansion and auto-scroll as for an internal drag. Answers
    // whether the place accepts a drop (it must lie under the Notebook).
    bool DragOverFromOutside(const QPoint& point) override;
    // Hides the insertion line and the highlight; the model's drop target stays for the drop.
    void RemoveInsertionMark() override;
    // The outside drag entered at the point: the drag timer runs the hover and auto-scroll.
    void BeginExternalDrag(const QPoint& point);
    // The outside drag left or dropped: line, highlight, hover and timer are reset.
    void EndExternalDrag() override;

    // The tree item that shows the record with this identifier (exact letter case), or null.
    QTreeWidgetItem* ItemOf(const QString& itemId) const;
    // The context menu for the item with this identifier.
    ContextMenu ContextMenuFor(const QString& itemId) const;

    bool IsDragging() const { return m_dragging; }
    const CTreeInsertionLine& InsertionLine() const { return m_insertionLine; }
    // The folder shown as the drop place, or null.
    QTreeWidgetItem* HighlightedItem() const;
    const QTimer& DragTimer() const { return m_dragTimer; }
    // One tick of the drag timer: hover expansion and auto-scroll. The timer calls it; so can
    // a test.
    void OnDragTimer();
    // The millisecond clock of the hover timing; a test can drive it.
    void SetClock(std::function<qint64()> clock) { m_clock = std::move(clock); }

protected:
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void contextMenuEvent(QContextMenuEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void drawRow(QPainter* painter, const QStyleOptionViewItem& option,
                 const QModelIndex& index) const override;
    bool edit(const QModelIndex& index, EditTrigger trigger, QEvent* event) override;

private:
    friend class NavTreeLabelDelegate;

    // Brings the nodes of the changed records in line when nothing else changed since the
    // last rebuild; false when every record has to be walked.
    bool FollowChangedRecords(WNavDS* model);
    void WalkAllRecords(WNavDS* model);
    NavTreeNode* ShowRecord(NavListItemData* record);
    // The node that shows the record, found by the number the record carries.
    NavTreeNode* NodeFor(const NavListItemData* record) const;
    NavTreeNode* NewNode(const QString& key);
    void ShowState(NavTreeNode* node, const NavListItemData* record);
    NavTreeNode* NodeOf(const QTreeWidgetItem* item) const;
    NavListItemData* RecordOf(const QTreeWidgetItem* item) const;
    void PlaceChildren(NavTreeNode* parent, const std::vector<NavTreeNode*>& wanted);
    // Deletes the node's item with everything below it, forgetting their nodes.
    void DropNode(NavTreeNode* node);
    // The item's expansion as the record holds it.
    void SyncExpansion(QTreeWidgetItem* item, const NavListItemData* record);
    void OnExpansionChanged(QTreeWidgetItem* item, bool expanded);
    void OnCurrentChanged(QTreeWidgetItem* current);
    // The in-place editor ended with this text.
    void CommitLabel(const QModelIndex& index, const QString& text);
    bool IsSpecialFolder(const NavListItemData* record) const;
    std::unique_ptr<QMenu> BuildMenu(ContextMenu menu);

    void BeginDrag();
    void DragFeedback(const QPoint& point);
    void ShowLineAbove(QTreeWidgetItem* item);
    // The item's icon and text, in viewport coordinates.
    QRect LabelRect(QTreeWidgetItem* item) const;
    void CancelDrag();
    void Highlight(QTreeWidgetItem* item);
    void HoverStep(const QPoint& point);
    void AutoScrollStep(const QPoint& point);
    void EndDrag(const QPoint& point, bool drop);
    void ResetDragState();
    qint64 Now() const;

    QHash<QString, NavTreeNode*> m_nodes;
    // The same nodes by number, the quick way in from a record; free numbers are used again.
    std::vector<NavTreeNode*> m_slots;
    std::vector<int> m_freeSlots;
    // The model, its change log's clearing and the filter as the last rebuild left them.
    const WNavDS* m_followedModel = nullptr;
    quint64 m_followedClearing = 0;
    ItemFilter m_followedFilter;
    quint64 m_generation = 0;
    // During a rebuild: the wanted top-level items, and every shown node, parents first.
    std::vector<NavTreeNode*> m_wantedTopLevel;
    std::vector<NavTreeNode*> m_shown;
    std::array<QIcon, 19> m_images;
    QPointer<CCommandRouter> m_router;
    // The control is being set from the model: its signals are not the user's.
    bool m_followingModel = false;

    bool m_dragging = false;
    bool m_externalDrag = false;
    bool m_pressed = false; // the left button went down on the viewport
    QPoint m_pressPoint;
    CTreeInsertionLine m_insertionLine;
    QPersistentModelIndex m_highlighted;
    QPersistentModelIndex m_hoverItem;
    qint64 m_hoverStart = 0;
    int m_scrollVertical = -1;
    int m_scrollHorizontal = -1;
    QPoint m_cursor;
    QTimer m_dragTimer;
    QElapsedTimer m_elapsed;
    std::function<qint64()> m_clock;
};
