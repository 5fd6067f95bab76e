#include "navigator/WNavigatorTree.h"

#include "app/CCommandRouter.h"
#include "common/ReleasePtr.h"
#include "common/StringTable.h"
#include "dataexchange/WProperties.h"
#include "drop/CDropTarget.h"
#include "navigator/WNavDS.h"
#include "ui/AmbrelIcons.h"

#include <QApplication>
#include <QContextMenuEvent>
#include <QHeaderView>
#include <QLineEdit>
#include <QMenu>
#include <QMouseEvent>
#include <QPainter>
#include <QScrollBar>
#include <QStyledItemDelegate>

// The tree item of one shown record; the tree owns it, the node map only finds it.
class NavTreeNode final : public QTreeWidgetItem {
public:
    static constexpr int kType = QTreeWidgetItem::UserType + 1;

    explicit NavTreeNode(const QString& key) : QTreeWidgetItem(kType), key(key) {
        setFlags(Qt::ItemIsSelectable | Qt::ItemIsEnabled | Qt::ItemIsEditable);
    }

    const QString key;
    // Valid during a rebuild only: between idle passes the model may free records, so the
    // handlers look records up by key.
    NavListItemData* record = nullptr;
    // The record the node was last found by; only compared, never followed.
    const NavListItemData* recordKey = nullptr;
    // Its number in the tree's slots, carried by the record.
    int slot = -1;
    // The record passed the filter at the last walk (it may be shown only as a parent).
    bool listed = false;
    NavTreeNode* wantedParent = nullptr;
    std::vector<NavTreeNode*> wanted;
    QString title;
    int image = -1;
    // The rebuild in which the node was last shown.
    quint64 seenIn = 0;
};

// Hands the finished in-place edit to the tree instead of writing the item: the title
// changes in the model, and the tree shows it from there.
class NavTreeLabelDelegate final : public QStyledItemDelegate {
public:
    explicit NavTreeLabelDelegate(WNavigatorTree* tree) : QStyledItemDelegate(tree), m_tree(tree) {}

    void setModelData(QWidget* editor, QAbstractItemModel*,
                      const QModelIndex& index) const override {
        if (auto* line = qobject_cast<QLineEdit*>(editor))
            m_tree->CommitLabel(index, line->text());
    }

private:
    WNavigatorTree* m_tree;
};

WNavigatorTree::WNavigatorTree(QWidget* parent) : QTreeWidget(parent), m_insertionLine(viewport()) {
    setHeaderHidden(true);
    setColumnCount(1);
    setUniformRowHeights(true);
    setSelectionMode(QAbstractItemView::SingleSelection);
    setExpandsOnDoubleClick(false);
    setEditTriggers(QAbstractItemView::EditKeyPressed | QAbstractItemView::SelectedClicked);
    setItemDelegate(new NavTreeLabelDelegate(this));
    setAccessibleName(LoadString(StringId::NotebookTitle));
    for (int index = 0; index < static_cast<int>(m_images.size()); ++index)
        m_images[static_cast<std::size_t>(index)] = AmbrelIcons::TreeImage(index);

    m_dragTimer.setInterval(kDragTimerInterval);
    connect(&m_dragTimer, &QTimer::timeout, this, &WNavigatorTree::OnDragTimer);
    m_elapsed.start();
    connect(this, &QTreeWidget::itemExpanded, this,
            [this](QTreeWidgetItem* item) { OnExpansionChanged(item, true); });
    connect(this, &QTreeWidget::itemCollapsed, this,
            [this](QTreeWidgetItem* item) { OnExpansionChanged(item, false); });
    connect(this, &QTreeWidget::currentItemChanged, this,
            [this](QTreeWidgetItem* current) { OnCurrentChanged(current); });
    // Owned by the viewport, so it goes before the tree's own parts.
    new CDropTarget(viewport(), this);
}

WNavigatorTree::~WNavigatorTree() {
    m_followingModel = true; // the items go with the control; nothing reaches the model
}

void WNavigatorTree::SetCommandRouter(CCommandRouter* router) {
    m_router = router;
}

// ---- Rebuild ----------------------------------------------------------------------------

void WNavigatorTree::OnIdle() {
    if (m_dragging)
        return;
    WNavDS* model = WNavDS::Instance();
    if (model->IsChanged()) {
        Rebuild();
        model->SetChanged(false);
    }
    if (model->IsRenamePending()) {
        EditSelectedLabel();
        model->SetRenamePending(false);
    }
}

void WNavigatorTree::Rebuild() {
    WNavDS* model = WNavDS::Instance();
    QTreeWidgetItem* before = currentItem();
    m_followingModel = true;

    if (!FollowChangedRecords(model))
        WalkAllRecords(model);
    NavChangeLog& log = model->GetChangeLog();
    log.Clear();
    m_followedModel = model;
    m_followedClearing = log.Clearing();
    m_followedFilter = model->CurrentFilter();

    NavListItemData* selected = model->GetSelected();
    QTreeWidgetItem* current = selected != nullptr ? m_nodes.value(selected->GetItemId()) : nullptr;
    if (current != currentItem())
        setCurrentItem(current);
    if (current != nullptr && current != before)
        scrollToItem(current);
    m_followingModel = false;
}

bool WNavigatorTree::FollowChangedRecords(WNavDS* model) {
    const NavChangeLog& log = model->GetChangeLog();
    if (log.IsStructureChanged() || model != m_followedModel ||
        log.Clearing() != m_followedClearing || model->CurrentFilter() != m_followedFilter)
        return false;
    // The records' places are as the last walk left them; only their own state changed.
    for (NavListItemData* record : log.ChangedRecords()) {
        NavTreeNode* node = NodeFor(record);
        const bool listed = model->IsItemVisible(record);
        if (node == nullptr ? listed : node->listed != listed)
            return false; // it comes or goes
    }
    for (NavListItemData* record : log.ChangedRecords()) {
        if (NavTreeNode* node = NodeFor(record)) {
            ShowState(node, record);
            SyncExpansion(node, record);
        }
    }
    return true;
}

void WNavigatorTree::WalkAllRecords(WNavDS* model) {
    ++m_generation;
    m_wantedTopLevel.clear();
    m_shown.clear();

    // Every visible record in model order: the node of each, and the wanted children of every
    // node, in order. m_shown lists parents before their children.
    WNavDS::Position position = model->GetFirstPosition();
    while (NavListItemData* record = model->ForEachVisible(position))
        ShowRecord(record)->listed = true;

    QStringList gone;
    if (m_shown.size() != static_cast<std::size_t>(m_nodes.size())) {
        for (auto node = m_nodes.cbegin(); node != m_nodes.cend(); ++node) {
            if (node.value()->seenIn != m_generation)
                gone.append(node.key());
        }
    }
    for (const QString& key : std::as_const(gone)) {
        if (NavTreeNode* node = m_nodes.value(key))
            DropNode(node);
    }

    // Children before their parents: a new subtree is put together before it joins the
    // control, which then takes it in one step.
    for (auto node = m_shown.crbegin(); node != m_shown.crend(); ++node) {
        if (!(*node)->wanted.empty())
            PlaceChildren(*node, (*node)->wanted);
    }
    PlaceChildren(nullptr, m_wantedTopLevel);

    // Expansion is the view's state and can be set only once the items are in the control.
    for (NavTreeNode* node : m_shown) {
        if (node->record->GetKind() == ItemKindFolder)
            SyncExpansion(node, node->record);
    }

    for (NavTreeNode* node : m_shown)
        node->record = nullptr;
    m_shown.clear();
}

namespace {

// Texts that share their data (the usual case: the node took it from the record) are equal
// without comparing them.
bool SameText(const QString& a, const QString& b) {
    return a.constData() == b.constData() || a == b;
}

} // namespace

NavTreeNode* WNavigatorTree::NodeFor(const NavListItemData* record) const {
    const int slot = record->GetTreeSlot();
    if (slot < 0 || static_cast<std::size_t>(slot) >= m_slots.size())
        return nullptr;
    NavTreeNode* node = m_slots[static_cast<std::size_t>(slot)];
    // The number may be another tree's, or left from a node that has gone.
    return node != nullptr && node->recordKey == record ? node : nullptr;
}

NavTreeNode* WNavigatorTree::NewNode(const QString& key) {
    auto* node = new NavTreeNode(key);
    if (m_freeSlots.empty()) {
        node->slot = static_cast<int>(m_slots.size());
        m_slots.push_back(node);
    } else {
        node->slot = m_freeSlots.back();
        m_freeSlots.pop_back();
        m_slots[static_cast<std::size_t>(node->slot)] = node;
    }
    m_nodes.insert(key, node);
    return node;
}

NavTreeNode* WNavigatorTree::ShowRecord(NavListItemData* record) {
    const QString& key = record->GetItemId();
    NavTreeNode* node = NodeFor(record);
    if (node == nullptr || !SameText(node->key, key))
        node = m_nodes.value(key); // a new record, or one that took another identifier
    // Shown already, as a parent: once only, or it would be placed twice.
    if (node != nullptr && node->seenIn == m_generation)
        return node;
    NavTreeNode* parent =
        record->GetParent() != nullptr ? ShowRecord(record->GetParent()) : nullptr;
    if (node == nullptr)
        node = NewNode(key);
    node->recordKey = record;
    record->SetTreeSlot(node->slot);
    node->record = record;
    node->seenIn = m_generation;
    node->listed = false;
    node->wanted.clear();
    node->wantedParent = parent;
    (parent != nullptr ? parent->wanted : m_wantedTopLevel).push_back(node);
    m_shown.push_back(node);

    // An item whose parent changed leaves it now, so that dropping the items of records no
    // longer shown cannot take it along.
    QTreeWidgetItem* current = node->parent();
    const bool attached = current != nullptr || node->treeWidget() == this;
    if (attached && current != parent) {
        if (current != nullptr)
            current->takeChild(current->indexOfChild(node));
        else
            takeTopLevelItem(indexOfTopLevelItem(node));
    }
    ShowState(node, record);
    return node;
}

void WNavigatorTree::ShowState(NavTreeNode* node, const NavListItemData* record) {
    const int image = WNavDS::Instance()->ImageIndexOf(record);
    if (image != node->image) {
        node->image = image;
        node->setIcon(0, image >= 0 && image < static_cast<int>(m_images.size())
                             ? m_images[static_cast<std::size_t>(image)]
                             : QIcon());
    }
    if (!SameText(node->title, record->GetTitle())) {
        node->title = record->GetTitle();
        node->setText(0, node->title);
    }
}

void WNavigatorTree::PlaceChildren(NavTreeNode* parent, const std::vector<NavTreeNode*>& wanted) {
    // After the moves and drops every child of the parent is among the wanted ones: only
    // those out of place are taken and put back.
    for (std::size_t at = 0; at < wanted.size(); ++at) {
        const int index = static_cast<int>(at);
        NavTreeNode* node = wanted[at];
        if (parent != nullptr) {
            if (parent->child(index) == node)
                continue;
            if (node->parent() == parent)
                parent->takeChild(parent->indexOfChild(node));
            parent->insertChild(index, node);
        } else {
            if (topLevelItem(index) == node)
                continue;
            if (node->treeWidget() == this)
                takeTopLevelItem(indexOfTopLevelItem(node));
            insertTopLevelItem(index, node);
        }
    }
}

void WNavigatorTree::DropNode(NavTreeNode* node) {
    QList<QTreeWidgetItem*> pending{node};
    while (!pending.isEmpty()) {
        QTreeWidgetItem* item = pending.takeLast();
        if (NavTreeNode* below = NodeOf(item)) {
            if (m_nodes.value(below->key) == below)
                m_nodes.remove(below->key);
            m_slots[static_cast<std::size_t>(below->slot)] = nullptr;
            m_freeSlots.push_back(below->slot);
        }
        for (int index = 0; index < item->childCount(); ++index)
            pending.append(item->child(index));
    }
    delete node;
}

void WNavigatorTree::SyncExpansion(QTreeWidgetItem* item, const NavListItemData* record) {
    if (record == nullptr || item->treeWidget() != this)
        return;
    const bool expanded = record->GetKind() == ItemKindFolder && record->IsExpanded();
    if (item->isExpanded() != expanded)
        item->setExpanded(expanded);
}

NavTreeNode* WNavigatorTree::NodeOf(const QTreeWidgetItem* item) const {
    if (item == nullptr || item->type() != NavTreeNode::kType)
        return nullptr;
    return static_cast<NavTreeNode*>(const_cast<QTreeWidgetItem*>(item));
}

NavListItemData* WNavigatorTree::RecordOf(const QTreeWidgetItem* item) const {
    const NavTreeNode* node = NodeOf(item);
    return node != nullptr ? WNavDS::Instance()->FindItem(node->key) : nullptr;
}

QTreeWidgetItem* WNavigatorTree::ItemOf(const QString& itemId) const {
    return m_nodes.value(itemId);
}

bool WNavigatorTree::IsSpecialFolder(const NavListItemData* record) const {
    const WNavDS* model = WNavDS::Instance();
    return record != nullptr &&
           (record == model->GetLinkedDocuments() || record == model->GetDeletedItems() ||
            record == model->GetNotebook());
}

// ---- Selection, expansion and in-place editing ---------------------------------------------

void WNavigatorTree::OnExpansionChanged(QTreeWidgetItem* item, bool expanded) {
    if (m_followingModel)
        return;
    // The control's own expand button: the model keeps the state, and the next rebuild shows
    // what it holds.
    NavListItemData* record = RecordOf(item);
    if (record != nullptr && record->GetKind() == ItemKindFolder)
        WNavDS::Instance()->SetExpanded(record, expanded);
}

void WNavigatorTree::OnCurrentChanged(QTreeWidgetItem* current) {
    if (m_followingModel)
        return;
    NavListItemData* record = RecordOf(current);
    if (record == nullptr)
        return;
    const ItemKind kind = record->GetKind();
    if (kind == ItemKindFolder || kind == ItemKindDocument || kind == ItemKindNote)
        WNavDS::Instance()->SelectById(record->GetItemId());
}

bool WNavigatorTree::edit(const QModelIndex& index, EditTrigger trigger, QEvent* event) {
    if (trigger != QAbstractItemView::NoEditTriggers) {
        NavListItemData* record = RecordOf(itemFromIndex(index));
        if (record == nullptr || IsSpecialFolder(record))
            return false;
    }
    return QTreeWidget::edit(index, trigger, event);
}

void WNavigatorTree::EditSelectedLabel() {
    NavListItemData* selected = WNavDS::Instance()->GetSelected();
    QTreeWidgetItem* item = selected != nullptr ? m_nodes.value(selected->GetItemId()) : nullptr;
    if (item == nullptr || IsSpecialFolder(selected))
        return;
    scrollToItem(item);
    editItem(item);
}

void WNavigatorTree::CommitLabel(const QModelIndex& index, const QString& text) {
    NavListItemData* record = RecordOf(itemFromIndex(index));
    if (text.isEmpty() || record == nullptr)
        return;
    ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
    set->SetProperty(QStringLiteral("title"), text);
    WNavDS::Instance()->UpdateItem(record->GetItemId(), set.get(), true);
}

// ---- Mouse and keys ---------------------------------------------------------------------------

void WNavigatorTree::mousePressEvent(QMouseEvent* event) {
    const QPoint point = event->position().toPoint();
    QTreeWidgetItem* item = itemAt(point);
    NavTreeNode* node = NodeOf(item);
    if (event->button() == Qt::RightButton) {
        if (node != nullptr) {
            setCurrentItem(item);
            WNavDS::Instance()->SelectById(node->key);
        }
        CancelDrag();
        event->accept();
        return;
    }
    if (event->button() == Qt::LeftButton) {
        if (node != nullptr)
            WNavDS::Instance()->SelectById(node->key);
        m_pressed = true;
        m_pressPoint = point;
    }
    QTreeWidget::mousePressEvent(event);
}

void WNavigatorTree::mouseMoveEvent(QMouseEvent* event) {
    const QPoint point = event->position().toPoint();
    if (m_dragging) {
        DragFeedback(point);
        return;
    }
    if (m_pressed && event->buttons().testFlag(Qt::LeftButton)) {
        // Moving with the button down drags the selection; it never selects along the way.
        if ((point - m_pressPoint).manhattanLength() >= QApplication::startDragDistance() &&
            NodeOf(itemAt(m_pressPoint)) != nullptr) {
            BeginDrag();
            DragFeedback(point);
        }
        return;
    }
    QTreeWidget::mouseMoveEvent(event);
}

void WNavigatorTree::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton) {
        m_pressed = false;
        if (m_dragging) {
            EndDrag(event->position().toPoint(), true);
            return;
        }
    }
    QTreeWidget::mouseReleaseEvent(event);
}

void WNavigatorTree::mouseDoubleClickEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton) {
        QTreeWidget::mouseDoubleClickEvent(event);
        return;
    }
    // A double click on an expand button is two clicks on it; anywhere else it opens.
    const QPoint point = event->position().toPoint();
    if (QTreeWidgetItem* item = itemAt(point);
        item != nullptr && point.x() < visualItemRect(item).left())
        return;
    WNavDS::Instance()->OpenSelected();
    event->accept();
}

void WNavigatorTree::keyPressEvent(QKeyEvent* event) {
    WNavDS* model = WNavDS::Instance();
    switch (event->key()) {
    case Qt::Key_Escape:
        if (!m_dragging)
            break;
        CancelDrag();
        return;
    case Qt::Key_Left:
        model->CollapseSelected();
        return;
    case Qt::Key_Right:
        model->ExpandSelected();
        return;
    case Qt::Key_Delete:
        model->DeleteSelected();
        return;
    default:
        break;
    }
    QTreeWidget::keyPressEvent(event);
}

// ---- Context menus ----------------------------------------------------------------------------

WNavigatorTree::ContextMenu WNavigatorTree::ContextMenuFor(const QString& itemId) const {
    const WNavDS* model = WNavDS::Instance();
    const NavListItemData* record = model->FindItem(itemId);
    if (record == nullptr)
        return NoMenu;
    if (model->IsInDeletedItems(record))
        return DeletedItemMenu;
    if (record == model->GetLinkedDocuments())
        return NoMenu;
    switch (record->GetKind()) {
    case ItemKindFolder:
        return FolderMenu;
    case ItemKindDocument:
        return DocumentMenu;
    case ItemKindNote:
        return NoteMenu;
    default:
        return NoMenu;
    }
}

std::unique_ptr<QMenu> WNavigatorTree::BuildMenu(ContextMenu which) {
    if (!m_router)
        return nullptr;
    // Command ids in menu order; kSendTo opens the "Send To" submenu, kEnd closes it.
    constexpr int kSendTo = 0;
    constexpr int kEnd = -1;
    std::vector<int> entries;
    switch (which) {
    case FolderMenu:
        entries = {32855, 32856, 32857, 32858, 32859, 32861, 32860};
        break;
    case DocumentMenu:
        entries = {32871, 32872,   32874, 32873, 32875, 32876,
                   32898, kSendTo, 32879, 32878, kEnd,  32880};
        break;
    case NoteMenu:
        entries = {32890, 32891, 32893, 32892, kSendTo, 32896, 32895, 32923, kEnd, 32897};
        break;
    case DeletedItemMenu:
        entries = {32900, 32901};
        break;
    case NoMenu:
        return nullptr;
    }
    auto menu = std::make_unique<QMenu>(this);
    m_router->WatchMenu(menu.get());
    QMenu* into = menu.get();
    for (int id : entries) {
        if (id == kSendTo) {
            into = menu->addMenu(LoadString(StringId::SendTo));
            m_router->WatchMenu(into);
        } else if (id == kEnd) {
            into = menu.get();
        } else if (id == StringId::SendToBlog) {
            into->addAction(m_router->Action(id, QStringLiteral("Blog")));
        } else {
            into->addAction(m_router->Action(id));
        }
    }
    return menu;
}

void WNavigatorTree::contextMenuEvent(QContextMenuEvent* event) {
    QTreeWidgetItem* item = nullptr;
    QPoint at;
    if (event->reason() == QContextMenuEvent::Keyboard) {
        item = currentItem();
        if (item != nullptr) {
            const QRect label = LabelRect(item);
            at = viewport()->mapToGlobal(
                QPoint(std::min(label.right(), viewport()->rect().right()), label.top()));
        }
    } else {
        item = itemAt(event->pos());
        at = event->globalPos();
    }
    m_dragTimer.stop();
    m_scrollVertical = -1;
    m_scrollHorizontal = -1;
    event->accept();
    const NavTreeNode* node = NodeOf(item);
    if (node == nullptr)
        return;
    if (std::unique_ptr<QMenu> menu = BuildMenu(ContextMenuFor(node->key)))
        menu->exec(at);
}

// ---- Painting -----------------------------------------------------------------------------

void WNavigatorTree::paintEvent(QPaintEvent* event) {
    QTreeWidget::paintEvent(event);
    QPainter painter(viewport());
    m_insertionLine.Paint(painter);
}

void WNavigatorTree::drawRow(QPainter* painter, const QStyleOptionViewItem& option,
                             const QModelIndex& index) const {
    if (!m_highlighted.isValid() || index != m_highlighted) {
        QTreeWidget::drawRow(painter, option, index);
        return;
    }
    QStyleOptionViewItem highlighted = option;
    highlighted.state |= QStyle::State_Selected;
    QTreeWidget::drawRow(painter, highlighted, index);
}

QRect WNavigatorTree::LabelRect(QTreeWidgetItem* item) const {
    const QRect row = visualItemRect(item);
    const int icon =
        iconSize().isValid() ? iconSize().width() : style()->pixelMetric(QStyle::PM_SmallIconSize);
    const int width = icon + fontMetrics().horizontalAdvance(item->text(0)) + 8;
    return QRect(row.left(), row.top(), std::min(width, row.width()), row.height());
}

// ---- Dragging -----------------------------------------------------------------------------

qint64 WNavigatorTree::Now() const {
    return m_clock ? m_clock() : m_elapsed.elapsed();
}

QTreeWidgetItem* WNavigatorTree::HighlightedItem() const {
    return m_highlighted.isValid() ? itemFromIndex(m_highlighted) : nullptr;
}

void WNavigatorTree::BeginDrag() {
    m_dragging = true;
    viewport()->setCursor(Qt::DragMoveCursor);
    m_dragTimer.start();
}

void WNavigatorTree::Highlight(QTreeWidgetItem* item) {
    const QPersistentModelIndex index = item != nullptr ? indexFromItem(item) : QModelIndex();
    if (index == m_highlighted)
        return;
    m_highlighted = index;
    viewport()->update();
}

void WNavigatorTree::ShowLineAbove(QTreeWidgetItem* item) {
    // Just above the label: two pixels high, wide enough to be seen on a short title.
    const QRect label = LabelRect(item);
    m_insertionLine.SetRect(
        QRect(label.left(), label.top() - 2, std::max(label.width(), kMinimumLineWidth), 2));
    m_insertionLine.Show();
}

void WNavigatorTree::DragFeedback(const QPoint& point) {
    m_cursor = point;
    QTreeWidgetItem* item = viewport()->rect().contains(point) ? itemAt(point) : nullptr;
    const NavListItemData* record = RecordOf(item);
    if (record == nullptr) {
        m_insertionLine.Hide();
        Highlight(nullptr);
    } else if (record->GetKind() == ItemKindFolder) {
        Highlight(item);
        m_insertionLine.Hide();
    } else {
        Highlight(nullptr);
        ShowLineAbove(item);
    }
}

void WNavigatorTree::OnDragTimer() {
    if (!m_dragging && !m_externalDrag) {
        m_dragTimer.stop();
        return;
    }
    HoverStep(m_cursor);
    AutoScrollStep(m_cursor);
    if (m_scrollVertical >= 0) {
        verticalScrollBar()->triggerAction(m_scrollVertical == 0
                                               ? QAbstractSlider::SliderSingleStepSub
                                               : QAbstractSlider::SliderSingleStepAdd);
    } else if (m_scrollHorizontal >= 0) {
        horizontalScrollBar()->triggerAction(m_scrollHorizontal == 0
                                                 ? QAbstractSlider::SliderSingleStepSub
                                                 : QAbstractSlider::SliderSingleStepAdd);
    } else {
        return;
    }
    // The items moved under the cursor.
    if (m_dragging)
        DragFeedback(m_cursor);
    viewport()->update();
}

void WNavigatorTree::HoverStep(const QPoint& point) {
    WNavDS* model = WNavDS::Instance();
    QTreeWidgetItem* item = viewport()->rect().contains(point) ? itemAt(point) : nullptr;
    const NavTreeNode* node = NodeOf(item);
    if (node == nullptr) {
        m_hoverItem = QPersistentModelIndex();
        model->SetDropTarget(nullptr);
        m_hoverStart = Now();
        return;
    }
    const QModelIndex index = indexFromItem(item);
    if (index != m_hoverItem) {
        m_hoverItem = index;
        m_hoverStart = Now();
        return;
    }
    model->SetDropTargetById(node->key);
    if (!model->DropTargetAccepts(m_externalDrag)) {
        viewport()->setCursor(Qt::ForbiddenCursor);
        return;
    }
    viewport()->setCursor(Qt::DragMoveCursor);
    if (!model->IsDropTargetFolder())
        return;
    NavListItemData* target = model->GetDropTarget();
    const qint64 resting = Now() - m_hoverStart;
    if (!target->IsExpanded() && resting >= kHoverExpandDelay)
        model->ExpandDropTarget();
    else if (target->IsExpanded() && resting >= kHoverCollapseDelay)
        model->CollapseDropTarget();
    else
        return;
    m_hoverStart = Now();
    // Rebuilds wait for the drag to end, but the folder under the cursor opens or closes now,
    // as the model decided.
    m_followingModel = true;
    SyncExpansion(item, target);
    m_followingModel = false;
}

void WNavigatorTree::AutoScrollStep(const QPoint& point) {
    const QRect area = viewport()->rect();
    if (point.y() < area.top() + kScrollMargin)
        m_scrollVertical = 0;
    else if (point.y() > area.bottom() - kScrollMargin)
        m_scrollVertical = 1;
    else
        m_scrollVertical = -1;
    if (point.x() < area.left() + kScrollMargin)
        m_scrollHorizontal = 0;
    else if (point.x() > area.right() - kScrollMargin)
        m_scrollHorizontal = 1;
    else
        m_scrollHorizontal = -1;
}

void WNavigatorTree::EndDrag(const QPoint& point, bool drop) {
    m_insertionLine.Hide();
    m_dragTimer.stop();
    m_dragging = false;
    Highlight(nullptr);
    viewport()->unsetCursor();
    if (drop && viewport()->rect().contains(point)) {
        WNavDS* model = WNavDS::Instance();
        QTreeWidgetItem* item = itemAt(point);
        if (item == nullptr)
            model->MoveSelectedTo(nullptr); // empty space: the end of the Notebook
        else if (NavListItemData* target = RecordOf(item))
            model->MoveSelectedTo(target);
    }
    viewport()->update();
    ResetDragState();
}

void WNavigatorTree::CancelDrag() {
    m_insertionLine.Hide();
    if (!m_dragging)
        return;
    EndDrag(QPoint(), false);
}

void WNavigatorTree::ResetDragState() {
    m_hoverItem = QPersistentModelIndex();
    m_insertionLine.Hide();
    m_scrollVertical = -1;
    m_scrollHorizontal = -1;
    m_dragTimer.stop();
    m_externalDrag = false;
}

bool WNavigatorTree::DragOverFromOutside(const QPoint& point) {
    WNavDS* model = WNavDS::Instance();
    // The first move of an outside drag starts the hover and auto-scroll ticks.
    if (!m_externalDrag)
        BeginExternalDrag(point);
    m_externalDrag = true;
    m_cursor = point;
    QTreeWidgetItem* item = viewport()->rect().contains(point) ? itemAt(point) : nullptr;
    const NavTreeNode* node = NodeOf(item);
    bool accepts = false;
    if (node == nullptr) {
        model->SetDropTarget(nullptr);
        m_insertionLine.Hide();
        Highlight(nullptr);
    } else {
        model->SetDropTargetById(node->key);
        accepts = model->DropTargetAccepts(true);
        const NavListItemData* target = model->GetDropTarget();
        if (target != nullptr && target->GetKind() == ItemKindFolder) {
            m_insertionLine.Hide();
            HoverStep(point);
            Highlight(item);
        } else {
            Highlight(nullptr);
            ShowLineAbove(item);
        }
    }
    AutoScrollStep(point);
    return accepts;
}

void WNavigatorTree::BeginExternalDrag(const QPoint& point) {
    m_externalDrag = true;
    m_cursor = point;
    m_dragTimer.start();
}

void WNavigatorTree::RemoveInsertionMark() {
    m_insertionLine.Hide();
    Highlight(nullptr);
}

void WNavigatorTree::EndExternalDrag() {
    Highlight(nullptr);
    viewport()->unsetCursor();
    ResetDragState();
}
