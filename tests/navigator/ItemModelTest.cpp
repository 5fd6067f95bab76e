#include "NavigatorModelFixture.h"

#include "settings/NavigatorSettings.h"

namespace {

class ItemModelTest : public NavigatorModelFixture {};

const Props kDeletedLinked{{u"linked"_s, u"TRUE"_s}, {u"deleted"_s, u"true"_s}};

TEST_F(ItemModelTest, DeletedAndLinkedItemsHangUnderTheirFoldersAndRememberTheWayBack) {
    const QString folder = Folder();
    const QString deletedNote = Add(u"note"_s, folder, kDeleted);
    const QString deletedAtRoot = Add(u"note"_s, u"root"_s, kDeleted);
    const QString linked = Add(u"document"_s, u"root"_s, kLinked);
    const QString deletedLinked = Add(u"document"_s, folder, kDeletedLinked);
    const QString plain = Add(u"note"_s, folder);

    WNavDS* model = Load();
    EXPECT_EQ(Item(plain)->GetParent(), Item(folder));
    EXPECT_EQ(Item(deletedNote)->GetParent(), model->GetDeletedItems());
    EXPECT_EQ(Item(deletedNote)->GetRestoreParent(), Item(folder));
    EXPECT_EQ(Item(deletedAtRoot)->GetRestoreParent(), model->GetNotebook());
    EXPECT_EQ(Item(linked)->GetParent(), model->GetLinkedDocuments());
    EXPECT_EQ(Item(linked)->GetRestoreParent(), nullptr);
    EXPECT_EQ(Item(deletedLinked)->GetParent(), model->GetDeletedItems());
    EXPECT_EQ(Item(deletedLinked)->GetRestoreParent(), model->GetLinkedDocuments());

    // The special folders first, then the catalog depth-first in catalog order.
    QStringList order;
    for (const auto& item : model->GetItems())
        order << item->GetItemId();
    EXPECT_EQ(order, QStringList({u"Linked Documents"_s, u"Deleted Items"_s, u"root"_s, folder,
                                  deletedNote, deletedLinked, plain, deletedAtRoot, linked}));
}

TEST_F(ItemModelTest, TheTreeShowsWhatTheSettingsChooseButNeverUntypedItems) {
    Add(QString());
    Add(u"note"_s);
    Add(u"document"_s, u"root"_s, {{u"subtype"_s, u"PDF"_s}});
    WNavDS* model = Load();
    auto visibleTitles = [model]() {
        QStringList titles;
        WNavDS::Position position = model->GetFirstPosition();
        while (NavListItemData* item = model->ForEachVisible(position))
            titles << item->GetTitle();
        return titles.mid(3); // after the special folders
    };
    EXPECT_EQ(visibleTitles(), QStringList({u"note item"_s, u"document item"_s}));
    NavigatorSettings::Instance()->SetShowPdf(true);
    EXPECT_EQ(visibleTitles(), QStringList({u"document item"_s}));
}

TEST_F(ItemModelTest, SpecialFoldersTakeTheirStartStateAtEveryLoad) {
    WNavDS* model = Load();
    model->GetLinkedDocuments()->SetExpanded(true);
    model->GetDeletedItems()->SetExpanded(true);
    model->GetNotebook()->SetExpanded(false);

    model->Load();
    EXPECT_FALSE(model->GetLinkedDocuments()->IsExpanded());
    EXPECT_FALSE(model->GetDeletedItems()->IsExpanded());
    EXPECT_TRUE(model->GetNotebook()->IsExpanded());
    EXPECT_EQ(model->GetSelected(), model->GetNotebook());
}

TEST(ItemFilterTest, EachTypeOptionShowsItsOwnItemsAndFoldersAlways) {
    auto item = [](ItemKind kind, DocumentSubtype subtype, bool open = false) {
        return NavListItemData(kind, {}, {}, nullptr, false, false, open, subtype, {}, {});
    };
    const NavListItemData folder = item(ItemKindFolder, DocumentSubtypeUnknown);
    const NavListItemData note = item(ItemKindNote, DocumentSubtypeUnknown);
    const NavListItemData qmd = item(ItemKindDocument, DocumentSubtypeQmd);
    const NavListItemData pdf = item(ItemKindDocument, DocumentSubtypePdf, true);
    const NavListItemData doc = item(ItemKindDocument, DocumentSubtypeDoc);
    const NavListItemData other = item(ItemKindDocument, DocumentSubtypeUnknown);
    const NavListItemData unknown = item(ItemKindUnknown, DocumentSubtypeUnknown, true);
    using List = QList<const NavListItemData*>;
    const struct {
        ItemFilter filter;
        List shown;
    } cases[] = {
        {{}, {&folder, &note, &qmd, &pdf, &doc, &other}},
        {{false, false, false, false, true, true}, {&folder, &pdf}}, // opened items only
        {{true, false, false, false, false, false}, {&folder, &note}},
        {{false, true, false, false, false, false}, {&folder, &qmd}},
        {{false, false, true, false, false, false}, {&folder, &doc}},
        {{false, false, false, true, false, true}, {&folder, &pdf}},
    };
    for (const auto& expected : cases) {
        List shown;
        for (const NavListItemData* candidate :
             {&folder, &note, &qmd, &pdf, &doc, &other, &unknown})
            if (IsItemVisible(candidate, expected.filter))
                shown << candidate;
        EXPECT_EQ(shown, expected.shown) << "case " << &expected - cases;
    }
}

TEST_F(ItemModelTest, DropsRefuseCyclesSpecialFoldersAndClosedDocumentsIntoLinkedDocuments) {
    const QString outer = Folder();
    const QString inner = Folder(outer);
    const QString note = Add(u"note"_s, inner);
    const QString linked = Add(u"document"_s, u"root"_s, kLinked);
    const QString stored = Add(u"document"_s);
    const QString sibling = Add(u"document"_s, u"root"_s, kLinked);
    const QString deleted = Add(u"note"_s, outer, kDeleted);
    WNavDS* model = Load();

    EXPECT_FALSE(model->CanDrop(Item(outer), Item(outer)));
    EXPECT_FALSE(model->CanDrop(Item(outer), Item(note)));
    EXPECT_TRUE(model->CanDrop(Item(note), Item(outer)));
    EXPECT_TRUE(model->CanDrop(Item(inner), model->GetDeletedItems()));
    for (NavListItemData* special :
         {model->GetNotebook(), model->GetDeletedItems(), model->GetLinkedDocuments()})
        EXPECT_FALSE(model->CanDrop(special, Item(outer)));
    EXPECT_FALSE(model->CanDrop(Item(linked), model->GetLinkedDocuments()));
    EXPECT_TRUE(model->CanDrop(Item(linked), Item(sibling)));
    EXPECT_FALSE(model->CanDrop(Item(note), Item(sibling)));
    EXPECT_FALSE(model->CanDrop(Item(stored), Item(sibling)));

    // Dropped files go into folders only, and never into Linked Documents.
    model->SetDropTargetById(outer);
    EXPECT_TRUE(model->DropTargetAccepts(true));
    model->SetDropTargetById(deleted);
    EXPECT_FALSE(model->DropTargetAccepts(true));
    EXPECT_TRUE(model->DropTargetAccepts(false));
    model->SetDropTargetById(linked);
    EXPECT_FALSE(model->DropTargetAccepts(false));
}

TEST_F(ItemModelTest, ImageIndexForEveryKindOfRow) {
    const QString folder = Folder();
    const QString deletedFolder = Add(u"folder"_s, u"root"_s, kDeleted);
    const QString document = Add(u"document"_s);
    const QString deletedDocument = Add(u"document"_s, u"root"_s, kDeleted);
    const QString linked = Add(u"document"_s, u"root"_s, kLinked);
    const QString deletedLinked = Add(u"document"_s, u"root"_s, kDeletedLinked);
    const QString note = Add(u"note"_s);
    const QString deletedNote = Add(u"note"_s, u"root"_s, kDeleted);
    const QString untyped = Add(QString());
    WNavDS* model = Load();

    // Each row: the record, its image closed and collapsed, and open or expanded.
    const struct {
        NavListItemData* record;
        int image, changed;
    } rows[] = {
        {model->GetLinkedDocuments(), 0, 1}, {model->GetDeletedItems(), 2, 3},
        {model->GetNotebook(), 18, 17},      {Item(folder), 4, 5},
        {Item(deletedFolder), 6, 7},         {Item(document), 8, 9},
        {Item(deletedDocument), 10, 10},     {Item(linked), 11, 12},
        {Item(deletedLinked), 13, 13},       {Item(note), 14, 15},
        {Item(deletedNote), 16, 16},         {Item(untyped), 4, 4},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.record->GetTitle().toStdString());
        EXPECT_EQ(model->ImageIndexOf(row.record), row.image);
        if (row.record->GetKind() == ItemKindFolder || row.record->GetParent() == nullptr)
            row.record->SetExpanded(!row.record->IsExpanded());
        else if (!model->IsInDeletedItems(row.record))
            row.record->SetOpen(true);
        EXPECT_EQ(model->ImageIndexOf(row.record), row.changed);
    }
}

} // namespace
