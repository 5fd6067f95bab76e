#include "NavigatorTreeFixture.h"

#include <QAccessible>
#include <QApplication>
#include <QImage>
#include <QLineEdit>
#include <QMimeData>
#include <QScrollBar>
#include <QUrl>

#include <functional>
#include <utility>

namespace {

class NavigatorTreeTest : public NavigatorTreeFixture {
protected:
    // The identifiers of the item's children in the tree, in order.
    QStringList ChildrenOf(const QString& itemId) const {
        QStringList ids;
        QTreeWidgetItem* item = TreeItem(itemId);
        for (int index = 0; item != nullptr && index < item->childCount(); ++index) {
            for (const QString& id : shown) {
                if (TreeItem(id) == item->child(index))
                    ids.append(id);
            }
        }
        return ids;
    }
    QStringList shown;
};

TEST_F(NavigatorTreeTest, RebuildFollowsTheModelKeepingItemsExpansionAndScroll) {
    const QString folder = Folder();
    const QString inFolder = Add(u"note"_s, folder);
    for (int index = 0; index < 30; ++index)
        shown.append(Add(u"note"_s, u"root"_s, {{u"title"_s, u"Note %1"_s.arg(index)}}));
    shown.prepend(folder);
    shown.append(inFolder);
    WNavDS* model = Show();

    ASSERT_EQ(tree->topLevelItemCount(), 3);
    QStringList names;
    for (int index = 0; index < 3; ++index)
        names.append(tree->topLevelItem(index)->text(0));
    EXPECT_EQ(names, QStringList({u"Linked Documents"_s, u"Deleted Items"_s, u"Notebook"_s}));
    EXPECT_EQ(ChildrenOf(u"root"_s), shown.mid(0, 31));
    EXPECT_TRUE(TreeItem(u"root"_s)->isExpanded());
    EXPECT_FALSE(TreeItem(folder)->isExpanded());
    // Every row is named for assistive technology by its title, the special folders too.
    QStringList accessibleNames;
    QAccessibleInterface* accessible = QAccessible::queryAccessibleInterface(tree.get());
    for (int index = 0; accessible != nullptr && index < accessible->childCount(); ++index)
        accessibleNames.append(accessible->child(index)->text(QAccessible::Name));
    for (const QString& name :
         {u"Linked Documents"_s, u"Deleted Items"_s, u"Notebook"_s, u"Note 0"_s})
        EXPECT_TRUE(accessibleNames.contains(name)) << name.toStdString();

    tree->verticalScrollBar()->setValue(6);
    QTreeWidgetItem* folderItem = TreeItem(folder);
    QTreeWidgetItem* kept = TreeItem(shown[5]);
    Update(shown[5], {{u"title"_s, u"Renamed"_s}});
    model->MoveItemTo(Item(shown[3]), Item(folder));
    model->SetExpanded(Item(folder), true);
    tree->OnIdle();
    QApplication::processEvents();

    EXPECT_FALSE(model->IsChanged());
    EXPECT_EQ(TreeItem(folder), folderItem);
    EXPECT_EQ(TreeItem(shown[5]), kept);
    EXPECT_EQ(kept->text(0), u"Renamed"_s);
    EXPECT_EQ(ChildrenOf(folder), QStringList({inFolder, shown[3]}));
    QStringList notebook = shown.mid(0, 31);
    notebook.removeAt(3);
    EXPECT_EQ(ChildrenOf(u"root"_s), notebook);
    EXPECT_TRUE(folderItem->isExpanded());
    EXPECT_EQ(tree->verticalScrollBar()->value(), 6);
}

// The tree's items, depth-first: depth, title, expansion and picture of each.
QStringList Picture(const QTreeWidget& tree) {
    QStringList lines;
    QList<std::pair<QTreeWidgetItem*, int>> pending;
    for (int index = tree.topLevelItemCount() - 1; index >= 0; --index)
        pending.append({tree.topLevelItem(index), 0});
    while (!pending.isEmpty()) {
        const auto [item, depth] = pending.takeLast();
        const QImage image = item->icon(0).pixmap(16).toImage();
        lines.append(
            u"%1%2 %3 %4"_s.arg(QString(depth, u' '), item->text(0))
                .arg(item->isExpanded())
                .arg(qHashBits(image.constBits(), static_cast<size_t>(image.sizeInBytes()))));
        for (int index = item->childCount() - 1; index >= 0; --index)
            pending.append({item->child(index), depth + 1});
    }
    return lines;
}

// After each change the tree that followed the model from one idle pass to the next must look
// exactly like a tree built afresh from the model.
TEST_F(NavigatorTreeTest, FollowingChangesGivesTheTreeAFullRebuildGives) {
    const QString folder = Folder();
    const QString inner = Folder(folder);
    const QString deep = Add(u"note"_s, inner, {{u"title"_s, u"Deep"_s}});
    const QString note = Add(u"note"_s, folder, {{u"title"_s, u"Note"_s}});
    const QString other = Add(u"note"_s, u"root"_s, {{u"title"_s, u"Other"_s}});
    const QString target = Folder();
    WNavDS* model = Show();
    const std::pair<const char*, std::function<void()>> changes[] = {
        {"rename",
         [&] {
             Update(note, {{u"title"_s, u"Renamed"_s}});
         }},
        {"expand", [&] { model->SetExpanded(Item(inner), true); }},
        {"open", [&] { Update(other, kOpen); }},
        {"opened items only", [&] { model->ToggleOpenedItemsOnly(); }},
        {"open after the filter switch", [&] { Update(deep, kOpen); }},
        {"close under the filter",
         [&] {
             Update(other, {{u"open"_s, u"false"_s}});
         }},
        {"all items again", [&] { model->ToggleOpenedItemsOnly(); }},
        {"subtree moved", [&] { model->MoveItemTo(Item(inner), Item(target)); }},
        {"renamed inside the moved subtree",
         [&] {
             Update(deep, {{u"title"_s, u"Moved"_s}});
         }},
        {"deleted",
         [&] {
             model->SelectById(folder);
             model->DeleteSelected();
         }},
        {"removed for good", [&] { model->EmptyDeletedItems(); }},
        {"rename after the removal",
         [&] {
             Update(other, {{u"title"_s, u"Last"_s}});
         }},
    };
    for (const auto& [what, change] : changes) {
        change();
        tree->OnIdle();
        WNavigatorTree fresh;
        fresh.Rebuild();
        EXPECT_EQ(Picture(*tree), Picture(fresh)) << what;
        EXPECT_EQ(tree->currentItem()->text(0), fresh.currentItem()->text(0)) << what;
    }
}

TEST_F(NavigatorTreeTest, OpenedItemsOnlyRemovesClosedItemsAtTheNextIdlePass) {
    const QString folder = Folder();
    const QString open = Add(u"note"_s, folder);
    const QString closed = Add(u"note"_s);
    const QString document = Add(u"document"_s, u"root"_s, {{u"subtype"_s, u"pdf"_s}});
    WNavDS* model = Show();
    Update(open, kOpen);
    tree->OnIdle();

    model->ToggleOpenedItemsOnly();
    EXPECT_NE(TreeItem(closed), nullptr) << "the tree changes only at the idle pass";
    tree->OnIdle();
    EXPECT_EQ(TreeItem(closed), nullptr);
    EXPECT_EQ(TreeItem(document), nullptr);
    ASSERT_NE(TreeItem(open), nullptr);
    EXPECT_EQ(TreeItem(open)->parent(), TreeItem(folder));
}

TEST_F(NavigatorTreeTest, RenameNeverStartsOnSpecialFoldersAndEmptyTextKeepsTheTitle) {
    const QString note = Add(u"note"_s, u"root"_s, {{u"title"_s, u"Kept"_s}});
    WNavDS* model = Show();
    for (NavListItemData* special :
         {model->GetLinkedDocuments(), model->GetDeletedItems(), model->GetNotebook()}) {
        model->SelectItem(special);
        tree->OnIdle();
        tree->EditSelectedLabel();
        Key(Qt::Key_F2);
        EXPECT_EQ(Editor(), nullptr) << special->GetTitle().toStdString();
    }

    auto renameTo = [&](const QString& text) {
        model->SelectById(note);
        tree->OnIdle();
        tree->EditSelectedLabel();
        QLineEdit* editor = Editor();
        ASSERT_NE(editor, nullptr);
        editor->setText(text);
        QKeyEvent enter(QEvent::KeyPress, Qt::Key_Return, Qt::NoModifier);
        QApplication::sendEvent(editor, &enter);
        QApplication::processEvents();
        tree->OnIdle();
    };
    renameTo(QString());
    EXPECT_EQ(Item(note)->GetTitle(), u"Kept"_s);
    EXPECT_EQ(TreeItem(note)->text(0), u"Kept"_s);
    renameTo(u"Minutes"_s);
    EXPECT_EQ(Item(note)->GetTitle(), u"Minutes"_s);
    EXPECT_EQ(CatalogValue(note, u"title"_s), u"Minutes"_s);
    EXPECT_EQ(TreeItem(note)->text(0), u"Minutes"_s);

    // A new folder opens its name for editing at the next idle pass.
    model->NewFolder(nullptr);
    tree->OnIdle();
    EXPECT_NE(Editor(), nullptr);
    EXPECT_EQ(tree->currentItem()->text(0), u"New Folder"_s);
}

TEST_F(NavigatorTreeTest, RightClickShowsTheMenuOfTheItemAndNoneOnLinkedDocuments) {
    const QString folder = Add(u"folder"_s, u"root"_s, {{u"expanded"_s, u"true"_s}});
    const QString note = Add(u"note"_s, folder);
    const QString document = Add(u"document"_s, folder, {{u"subtype"_s, u"pdf"_s}});
    const QString deleted = Add(u"note"_s, u"root"_s, kDeleted);
    WNavDS* model = Show();
    model->SelectById(deleted);
    tree->OnIdle();

    struct Case {
        QString itemId;
        QList<int> ids; // empty: no menu
    };
    const Case cases[] = {
        {u"Linked Documents"_s, {}},
        {u"root"_s, {32855, 32856, 32857, 32858, 32859, 32861, 32860}},
        {folder, {32855, 32856, 32857, 32858, 32859, 32861, 32860}},
        {document, {32871, 32872, 32874, 32873, 32875, 32876, 32898, 32879, 32878, 32880}},
        {note, {32890, 32891, 32893, 32892, 32896, 32895, 32923, 32897}},
        {deleted, {32900, 32901}},
        {u"Deleted Items"_s, {32900, 32901}},
    };
    for (const Case& entry : cases) {
        QList<int> ids;
        QList<bool> enabled;
        const bool shownMenu = ContextMenuAt(At(entry.itemId), &ids, &enabled);
        EXPECT_EQ(shownMenu, !entry.ids.isEmpty()) << entry.itemId.toStdString();
        EXPECT_EQ(ids, entry.ids) << entry.itemId.toStdString();
        EXPECT_EQ(model->GetSelected(), Item(entry.itemId)) << entry.itemId.toStdString();
        // The Notebook can be neither renamed nor deleted.
        if (entry.itemId == u"root"_s) {
            EXPECT_EQ(enabled, QList<bool>({true, true, false, false, true, true, true}));
        }
    }
}

TEST_F(NavigatorTreeTest, DraggingShowsTheDropPlaceAndEmptySpaceMovesToTheEndOfTheNotebook) {
    const QString folder = Folder();
    const QString dragged = Add(u"note"_s, folder);
    const QString other = Add(u"note"_s);
    const QString last = Add(u"note"_s);
    WNavDS* model = Show();
    model->SelectById(dragged);
    tree->OnIdle();

    Press(At(dragged));
    MoveHeld(At(dragged) + QPoint(0, 3));
    MoveHeld(At(other));
    ASSERT_TRUE(tree->IsDragging());
    EXPECT_TRUE(tree->DragTimer().isActive());
    const CTreeInsertionLine& line = tree->InsertionLine();
    EXPECT_TRUE(line.IsVisible());
    EXPECT_EQ(line.Rect().bottom() + 1, tree->visualItemRect(TreeItem(other)).top());
    EXPECT_EQ(tree->HighlightedItem(), nullptr);

    MoveHeld(At(folder));
    EXPECT_FALSE(line.IsVisible());
    EXPECT_EQ(tree->HighlightedItem(), TreeItem(folder));

    const QPoint below(40, tree->viewport()->height() - 5);
    ASSERT_EQ(tree->itemAt(below), nullptr);
    MoveHeld(below);
    Release(below);
    EXPECT_FALSE(tree->IsDragging());
    EXPECT_FALSE(tree->DragTimer().isActive());
    EXPECT_EQ(tree->HighlightedItem(), nullptr);
    EXPECT_EQ(Item(dragged)->GetParent(), model->GetNotebook());
    EXPECT_EQ(model->GetItems().back().get(), Item(dragged));
    tree->OnIdle();
    EXPECT_EQ(TreeItem(dragged)->parent(), TreeItem(u"root"_s));
    EXPECT_EQ(TreeItem(u"root"_s)->indexOfChild(TreeItem(dragged)), 3);
    EXPECT_EQ(TreeItem(last)->parent(), TreeItem(u"root"_s));
}

TEST_F(NavigatorTreeTest, HoveringAFolderExpandsThenCollapsesItAndTheEdgeScrolls) {
    const QString folder = Folder();
    Add(u"note"_s, folder);
    const QString dragged = Add(u"note"_s);
    for (int index = 0; index < 30; ++index)
        Add(u"note"_s);
    WNavDS* model = Show();
    qint64 now = 0;
    tree->SetClock([&now] { return now; });
    model->SelectById(dragged);
    tree->OnIdle();
    ASSERT_FALSE(Item(folder)->IsExpanded());

    Press(At(dragged));
    MoveHeld(At(folder));
    ASSERT_TRUE(tree->IsDragging());
    EXPECT_EQ(tree->DragTimer().interval(), 250);
    tree->OnDragTimer(); // the cursor comes to rest on the folder
    now = 750;
    tree->OnDragTimer();
    EXPECT_FALSE(Item(folder)->IsExpanded());
    now = 751;
    tree->OnDragTimer();
    EXPECT_TRUE(Item(folder)->IsExpanded());
    EXPECT_TRUE(TreeItem(folder)->isExpanded());
    now = 751 + 1250;
    tree->OnDragTimer();
    EXPECT_TRUE(Item(folder)->IsExpanded());
    now = 751 + 1251;
    tree->OnDragTimer();
    EXPECT_FALSE(Item(folder)->IsExpanded());
    EXPECT_FALSE(TreeItem(folder)->isExpanded());

    // Within 10 pixels of the bottom edge every tick scrolls one line.
    QScrollBar* bar = tree->verticalScrollBar();
    const int start = bar->value();
    MoveHeld(QPoint(40, tree->viewport()->height() - 4));
    tree->OnDragTimer();
    tree->OnDragTimer();
    EXPECT_EQ(bar->value(), start + 2 * bar->singleStep());
    MoveHeld(QPoint(40, tree->viewport()->height() / 2));
    tree->OnDragTimer();
    EXPECT_EQ(bar->value(), start + 2 * bar->singleStep());
}

TEST_F(NavigatorTreeTest, KeysDoubleClickAndTheExpandButtonReachTheModel) {
    const QString folder = Folder();
    const QString note = Add(u"note"_s, folder);
    WNavDS* model = Show();
    model->SelectById(folder);
    model->SetExpanded(Item(folder), false);
    tree->OnIdle();

    Key(Qt::Key_Right);
    EXPECT_TRUE(Item(folder)->IsExpanded());
    Key(Qt::Key_Left);
    EXPECT_FALSE(Item(folder)->IsExpanded());
    Mouse(QEvent::MouseButtonDblClick, At(folder), Qt::LeftButton, Qt::LeftButton);
    EXPECT_TRUE(Item(folder)->IsExpanded());
    tree->OnIdle();
    EXPECT_TRUE(TreeItem(folder)->isExpanded());

    TreeItem(folder)->setExpanded(false); // as the control's own button does
    EXPECT_FALSE(Item(folder)->IsExpanded());
    EXPECT_EQ(CatalogValue(folder, u"expanded"_s), u"false"_s);

    model->SelectById(note);
    tree->OnIdle();
    Key(Qt::Key_Delete);
    EXPECT_TRUE(model->IsInDeletedItems(Item(note)));
}

TEST_F(NavigatorTreeTest, AFileDroppedFromAnotherProgramBecomesANoteInTheFolderUnderTheCursor) {
    const QString folder = Folder();
    const QString other = Folder();
    const QString text = WriteFile(u"in/minutes.txt"_s, "meeting minutes");
    WNavDS* model = Show();
    model->SelectById(other);

    QMimeData data;
    data.setUrls({QUrl::fromLocalFile(text)});
    QWidget* viewport = tree->viewport();
    const QPoint at = At(folder);
    const Qt::DropActions actions = Qt::CopyAction | Qt::MoveAction;
    QDragEnterEvent enter(at, actions, &data, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(viewport, &enter);
    QDragMoveEvent move(at, actions, &data, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(viewport, &move);
    EXPECT_TRUE(move.isAccepted());
    QDropEvent drop(at, actions, &data, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(viewport, &drop);
    EXPECT_TRUE(drop.isAccepted());

    const NavListItemData* note = model->GetSelected();
    ASSERT_NE(note, nullptr);
    EXPECT_EQ(note->GetKind(), ItemKindNote);
    EXPECT_EQ(note->GetTitle(), u"minutes.txt"_s);
    EXPECT_EQ(note->GetParent(), Item(folder));
    EXPECT_FALSE(tree->InsertionLine().IsVisible());
    EXPECT_EQ(tree->HighlightedItem(), nullptr);
}

} // namespace
