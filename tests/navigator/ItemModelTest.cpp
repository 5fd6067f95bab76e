#include "NavigatorModelFixture.h"

#include "settings/NavigatorSettings.h"

namespace {

class ItemModelTest : public NavigatorModelFixture {};

const QString kTrue = QStringLiteral("true");

TEST_F(ItemModelTest, DeletedAndLinkedItemsHangUnderTheirFoldersAndRememberTheWayBack) {
    const QString folder = Add(QStringLiteral("folder"), QStringLiteral("root"));
    const QString deletedNote =
        Add(QStringLiteral("note"), folder, {{QStringLiteral("deleted"), kTrue}});
    const QString deletedAtRoot =
        Add(QStringLiteral("note"), QStringLiteral("root"), {{QStringLiteral("deleted"), kTrue}});
    const QString linked = Add(QStringLiteral("document"), QStringLiteral("root"),
                               {{QStringLiteral("linked"), kTrue}});
    const QString deletedLinked = Add(
        QStringLiteral("document"), folder,
        {{QStringLiteral("linked"), QStringLiteral("TRUE")}, {QStringLiteral("deleted"), kTrue}});
    const QString plain = Add(QStringLiteral("note"), folder);

    WNavDS* model = Load();
    NavListItemData* folderRecord = model->FindItem(folder);
    ASSERT_NE(folderRecord, nullptr);
    EXPECT_EQ(folderRecord->GetParent(), model->GetNotebook());

    NavListItemData* record = model->FindItem(deletedNote);
    EXPECT_EQ(record->GetParent(), model->GetDeletedItems());
    EXPECT_EQ(record->GetRestoreParent(), folderRecord);
    EXPECT_EQ(model->FindItem(deletedAtRoot)->GetRestoreParent(), model->GetNotebook());

    record = model->FindItem(linked);
    EXPECT_EQ(record->GetParent(), model->GetLinkedDocuments());
    EXPECT_EQ(record->GetRestoreParent(), nullptr);

    record = model->FindItem(deletedLinked);
    EXPECT_EQ(record->GetParent(), model->GetDeletedItems());
    EXPECT_EQ(record->GetRestoreParent(), model->GetLinkedDocuments());
    EXPECT_TRUE(record->IsLinked());

    EXPECT_EQ(model->FindItem(plain)->GetParent(), folderRecord);

    // The special folders first, then the catalog depth-first in catalog order.
    QStringList order;
    for (const auto& item : model->GetItems())
        order << item->GetItemId();
    EXPECT_EQ(order, QStringList({QStringLiteral("Linked Documents"),
                                  QStringLiteral("Deleted Items"), QStringLiteral("root"), folder,
                                  deletedNote, deletedLinked, plain, deletedAtRoot, linked}));
}

TEST_F(ItemModelTest, PropertiesAreReadAsTheCatalogSpellsThem) {
    const QString untyped = Add(QString(), QStringLiteral("root"));
    const QString folder = Add(QStringLiteral("Folder"), QStringLiteral("root"),
                               {{QStringLiteral("expanded"), QStringLiteral("TRUE")}});
    const QString note = Add(QStringLiteral("note"), QStringLiteral("root"),
                             {{QStringLiteral("expanded"), kTrue},
                              {QStringLiteral("datecreated"), QStringLiteral("2024-01-02")}});
    const QString pdf = Add(QStringLiteral("document"), QStringLiteral("root"),
                            {{QStringLiteral("subtype"), QStringLiteral("PDF")},
                             {QStringLiteral("path"), QStringLiteral("/x.pdf")}});

    WNavDS* model = Load();
    NavListItemData* record = model->FindItem(untyped);
    ASSERT_NE(record, nullptr);
    EXPECT_EQ(record->GetKind(), ItemKindUnknown);
    EXPECT_FALSE(model->IsItemVisible(record));
    EXPECT_EQ(model->ImageIndexOf(record), 4);

    EXPECT_EQ(model->FindItem(folder)->GetKind(), ItemKindFolder);
    EXPECT_TRUE(model->FindItem(folder)->IsExpanded());
    EXPECT_FALSE(model->FindItem(note)->IsExpanded());
    EXPECT_EQ(model->FindItem(note)->GetDateCreated(), QStringLiteral("2024-01-02"));
    EXPECT_EQ(model->FindItem(pdf)->GetSubtype(), DocumentSubtypePdf);
}

TEST_F(ItemModelTest, SpecialFoldersTakeTheirStartStateAtEveryLoad) {
    WNavDS* model = Load();
    EXPECT_EQ(model->GetSelected(), model->GetNotebook());
    model->GetLinkedDocuments()->SetExpanded(true);
    model->GetDeletedItems()->SetExpanded(true);
    model->GetNotebook()->SetExpanded(false);

    model->Load();
    EXPECT_FALSE(model->GetLinkedDocuments()->IsExpanded());
    EXPECT_FALSE(model->GetDeletedItems()->IsExpanded());
    EXPECT_TRUE(model->GetNotebook()->IsExpanded());
    EXPECT_EQ(model->GetItems().size(), 3u);
    EXPECT_EQ(model->GetSelected(), model->GetNotebook());
}

TEST(ItemFilterTest, EachTypeOptionShowsItsOwnItemsAndFoldersAlways) {
    auto item = [](ItemKind kind, DocumentSubtype subtype, bool open) {
        return NavListItemData(kind, {}, {}, nullptr, false, false, open, subtype, {}, {});
    };
    const NavListItemData folder = item(ItemKindFolder, DocumentSubtypeUnknown, false);
    const NavListItemData note = item(ItemKindNote, DocumentSubtypeUnknown, false);
    const NavListItemData qmd = item(ItemKindDocument, DocumentSubtypeQmd, false);
    const NavListItemData pdf = item(ItemKindDocument, DocumentSubtypePdf, true);
    const NavListItemData doc = item(ItemKindDocument, DocumentSubtypeDoc, false);
    const NavListItemData other = item(ItemKindDocument, DocumentSubtypeUnknown, false);
    const NavListItemData unknown = item(ItemKindUnknown, DocumentSubtypeUnknown, true);
    const QList<const NavListItemData*> all{&folder, &note, &qmd, &pdf, &doc, &other, &unknown};

    auto visible = [&all](const ItemFilter& filter) {
        QList<const NavListItemData*> shown;
        for (const NavListItemData* candidate : all) {
            if (IsItemVisible(candidate, filter))
                shown << candidate;
        }
        return shown;
    };
    using List = QList<const NavListItemData*>;
    ItemFilter filter{};
    EXPECT_EQ(visible(filter), List({&folder, &note, &qmd, &pdf, &doc, &other}));
    filter.showOpenedItemsOnly = true;
    EXPECT_EQ(visible(filter), List({&folder, &pdf}));

    filter = ItemFilter{true, false, false, false, false, false};
    EXPECT_EQ(visible(filter), List({&folder, &note}));
    filter = ItemFilter{false, true, false, false, false, false};
    EXPECT_EQ(visible(filter), List({&folder, &qmd}));
    filter = ItemFilter{false, false, true, false, false, false};
    EXPECT_EQ(visible(filter), List({&folder, &doc}));
    filter = ItemFilter{false, false, false, true, false, true};
    EXPECT_EQ(visible(filter), List({&folder, &pdf}));
    EXPECT_FALSE(IsItemVisible(nullptr, ItemFilter{}));
}

TEST_F(ItemModelTest, TheFilterComesFromTheSettings) {
    Add(QStringLiteral("note"), QStringLiteral("root"));
    Add(QStringLiteral("document"), QStringLiteral("root"),
        {{QStringLiteral("subtype"), QStringLiteral("pdf")}});
    WNavDS* model = Load();
    auto visibleTitles = [model]() {
        QStringList titles;
        WNavDS::Position position = model->GetFirstPosition();
        while (NavListItemData* item = model->ForEachVisible(position))
            titles << item->GetTitle();
        return titles;
    };
    EXPECT_EQ(visibleTitles().size(), 5);
    NavigatorSettings::Instance()->SetShowPdf(true);
    EXPECT_EQ(visibleTitles(),
              QStringList({QStringLiteral("Linked Documents"), QStringLiteral("Deleted Items"),
                           QStringLiteral("Notebook"), QStringLiteral("document item")}));
}

TEST_F(ItemModelTest, CanDropRefusesMovesIntoItselfAndIntoLinkedDocuments) {
    const QString outer = Add(QStringLiteral("folder"), QStringLiteral("root"));
    const QString inner = Add(QStringLiteral("folder"), outer);
    const QString note = Add(QStringLiteral("note"), inner);
    const QString linked = Add(QStringLiteral("document"), QStringLiteral("root"),
                               {{QStringLiteral("linked"), kTrue}});
    const QString stored = Add(QStringLiteral("document"), QStringLiteral("root"));
    const QString linkedSibling = Add(QStringLiteral("document"), QStringLiteral("root"),
                                      {{QStringLiteral("linked"), kTrue}});
    WNavDS* model = Load();
    NavListItemData* outerRecord = model->FindItem(outer);
    NavListItemData* innerRecord = model->FindItem(inner);
    NavListItemData* siblingRecord = model->FindItem(linkedSibling);

    EXPECT_FALSE(model->CanDrop(outerRecord, outerRecord));
    EXPECT_FALSE(model->CanDrop(outerRecord, innerRecord));
    EXPECT_FALSE(model->CanDrop(outerRecord, model->FindItem(note)));
    EXPECT_TRUE(model->CanDrop(innerRecord, model->GetNotebook()));
    EXPECT_TRUE(model->CanDrop(model->FindItem(note), outerRecord));

    EXPECT_FALSE(model->CanDrop(model->FindItem(linked), model->GetLinkedDocuments()));
    EXPECT_TRUE(model->CanDrop(model->FindItem(linked), siblingRecord));
    EXPECT_FALSE(model->CanDrop(model->FindItem(stored), siblingRecord));
    EXPECT_FALSE(model->CanDrop(model->FindItem(note), siblingRecord));
    model->FindItem(stored)->SetOpen(true);
    EXPECT_FALSE(model->CanDrop(model->FindItem(stored), siblingRecord));

    for (NavListItemData* special :
         {model->GetNotebook(), model->GetDeletedItems(), model->GetLinkedDocuments()})
        EXPECT_FALSE(model->CanDrop(special, outerRecord));
    EXPECT_TRUE(model->CanDrop(innerRecord, model->GetDeletedItems()));
}

TEST_F(ItemModelTest, SelectionAndDropTargetPredicates) {
    const QString folder = Add(QStringLiteral("folder"), QStringLiteral("root"));
    const QString deleted =
        Add(QStringLiteral("note"), folder, {{QStringLiteral("deleted"), kTrue}});
    const QString linked = Add(QStringLiteral("document"), QStringLiteral("root"),
                               {{QStringLiteral("linked"), kTrue}});
    WNavDS* model = Load();

    EXPECT_FALSE(model->CanEditSelected()); // the Notebook
    model->SelectById(linked);
    EXPECT_TRUE(model->IsLinkedDocumentSelected());
    EXPECT_TRUE(model->CanEditSelected());
    EXPECT_EQ(model->TopFolderOf(model->GetSelected()), model->GetLinkedDocuments());
    model->SelectItem(model->GetDeletedItems());
    EXPECT_TRUE(model->CanEditSelected());
    EXPECT_TRUE(model->IsSelectedInDeletedItems());
    model->SelectById(deleted);
    EXPECT_TRUE(model->IsSelectedInDeletedItems());
    EXPECT_FALSE(model->IsSelectedOpen());

    model->SetDropTargetById(folder);
    EXPECT_TRUE(model->IsDropTargetFolder());
    EXPECT_TRUE(model->DropTargetAccepts(true));
    model->SetDropTargetById(deleted);
    EXPECT_FALSE(model->IsDropTargetFolder());
    EXPECT_FALSE(model->DropTargetAccepts(true));
    EXPECT_TRUE(model->DropTargetAccepts(false));
    model->SetDropTargetById(linked);
    EXPECT_FALSE(model->DropTargetAccepts(false));
}

TEST_F(ItemModelTest, ImageIndexForEveryKindOfRow) {
    const QString folder = Add(QStringLiteral("folder"), QStringLiteral("root"));
    const QString deletedFolder =
        Add(QStringLiteral("folder"), QStringLiteral("root"), {{QStringLiteral("deleted"), kTrue}});
    const QString document = Add(QStringLiteral("document"), QStringLiteral("root"));
    const QString deletedDocument = Add(QStringLiteral("document"), QStringLiteral("root"),
                                        {{QStringLiteral("deleted"), kTrue}});
    const QString linked = Add(QStringLiteral("document"), QStringLiteral("root"),
                               {{QStringLiteral("linked"), kTrue}});
    const QString deletedLinked =
        Add(QStringLiteral("document"), QStringLiteral("root"),
            {{QStringLiteral("linked"), kTrue}, {QStringLiteral("deleted"), kTrue}});
    const QString note = Add(QStringLiteral("note"), QStringLiteral("root"));
    const QString deletedNote =
        Add(QStringLiteral("note"), QStringLiteral("root"), {{QStringLiteral("deleted"), kTrue}});
    WNavDS* model = Load();
    auto image = [model](const QString& id) { return model->ImageIndexOf(model->FindItem(id)); };

    EXPECT_EQ(model->ImageIndexOf(model->GetLinkedDocuments()), 0);
    EXPECT_EQ(model->ImageIndexOf(model->GetDeletedItems()), 2);
    EXPECT_EQ(model->ImageIndexOf(model->GetNotebook()), 18);
    EXPECT_EQ(image(folder), 4);
    EXPECT_EQ(image(deletedFolder), 6);
    EXPECT_EQ(image(document), 8);
    EXPECT_EQ(image(deletedDocument), 10);
    EXPECT_EQ(image(linked), 11);
    EXPECT_EQ(image(deletedLinked), 13);
    EXPECT_EQ(image(note), 14);
    EXPECT_EQ(image(deletedNote), 16);

    for (NavListItemData* record :
         {model->GetLinkedDocuments(), model->GetDeletedItems(), model->GetNotebook(),
          model->FindItem(folder), model->FindItem(deletedFolder)})
        record->SetExpanded(!record->IsExpanded());
    EXPECT_EQ(model->ImageIndexOf(model->GetLinkedDocuments()), 1);
    EXPECT_EQ(model->ImageIndexOf(model->GetDeletedItems()), 3);
    EXPECT_EQ(model->ImageIndexOf(model->GetNotebook()), 17);
    EXPECT_EQ(image(folder), 5);
    EXPECT_EQ(image(deletedFolder), 7);

    for (const QString& id : {document, linked, note})
        model->FindItem(id)->SetOpen(true);
    EXPECT_EQ(image(document), 9);
    EXPECT_EQ(image(linked), 12);
    EXPECT_EQ(image(note), 15);
}

} // namespace
