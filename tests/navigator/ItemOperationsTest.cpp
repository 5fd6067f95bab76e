#include "NavigatorModelFixture.h"

#include "dataexchange/CBasicStringIDReporter.h"
#include "settings/NavigatorSettings.h"

#include <QFile>
#include <QFileInfo>

namespace {

class ItemOperationsTest : public NavigatorModelFixture {
protected:
    // The catalog's children of an item, in order.
    QStringList Children(const QString& itemId) {
        DataExchange::CBasicStringIDReporter children;
        service->ReportChildren(itemId, &children);
        return children.StringIDs();
    }
    // The records' identifiers in list order, special folders left out.
    QStringList ListOrder() {
        QStringList order;
        for (const auto& record : WNavDS::Instance()->GetItems())
            if (record->GetParent() != nullptr)
                order.append(record->GetItemId());
        return order;
    }
    QString NewNote() {
        QString id;
        UnicodeStringPtr sink(&id);
        WNavDS::Instance()->NewNote(nullptr, &sink);
        return id;
    }
};

TEST_F(ItemOperationsTest, NewNoteLandsBesideTheSelectionButNeverInDeletedItems) {
    const QString folder = Folder();
    const QString first = Add(u"note"_s, folder);
    const QString second = Add(u"note"_s, folder);
    const QString binned = Add(u"note"_s, u"root"_s, kDeleted);
    WNavDS* model = Load();

    // On a folder: its last child, and the folder opens.
    model->SelectById(folder);
    const QString inFolder = NewNote();
    EXPECT_EQ(Children(folder), QStringList({first, second, inFolder}));
    EXPECT_EQ(CatalogValue(folder, u"expanded"_s), u"true"_s);
    EXPECT_EQ(Item(inFolder)->GetParent(), Item(folder));
    EXPECT_EQ(launcher.starts.value(0).arguments.value(0), ItemFile(inFolder));

    // On a note: just before it, in the catalog and in the list.
    model->SelectById(second);
    const QString beside = NewNote();
    EXPECT_EQ(Children(folder), QStringList({first, beside, second, inFolder}));
    EXPECT_EQ(ListOrder().indexOf(beside) + 1, ListOrder().indexOf(second));

    // On a deleted item: at the end of the Notebook.
    model->SelectById(binned);
    const QString top = NewNote();
    EXPECT_EQ(Children(u"root"_s).last(), top);
    EXPECT_EQ(Item(top)->GetParent(), model->GetNotebook());
}

TEST_F(ItemOperationsTest, NewFolderAwaitsRenamingOnlyWhenTheCatalogMadeIt) {
    WNavDS* model = Load();
    QString id;
    UnicodeStringPtr sink(&id);
    model->NewFolder(&sink);
    ASSERT_NE(Item(id), nullptr);
    EXPECT_EQ(Item(id)->GetTitle(), u"New Folder"_s);
    EXPECT_EQ(model->GetSelected(), Item(id));
    EXPECT_TRUE(model->IsRenamePending());

    // The catalog creates nothing: no record with an empty identifier, nothing to rename.
    model->SetRenamePending(false);
    service->Suspend();
    const std::size_t count = model->GetItems().size();
    model->NewFolder(nullptr);
    EXPECT_FALSE(model->IsRenamePending());
    EXPECT_EQ(model->AddNewItem(Set({{u"type"_s, u"note"_s}}).get(), 0, nullptr), E_FAIL);
    service->Resume();
    EXPECT_EQ(model->AddNewItem(Set({{u"type"_s, u"Note"_s}}).get(), 0, nullptr), E_FAIL);
    EXPECT_EQ(model->GetItems().size(), count);
}

TEST_F(ItemOperationsTest, LinkingAFileTheCatalogHoldsOpensTheExistingEntry) {
    const QString file = WriteFile(u"docs/report.pdf"_s, "%PDF");
    WNavDS* model = Load();
    model->LinkDocument(file, true);
    NavListItemData* linked = model->GetSelected();
    ASSERT_EQ(linked->GetParent(), model->GetLinkedDocuments());
    const QString id = linked->GetItemId();
    EXPECT_EQ(CatalogValue(id, u"subtype"_s), u"pdf"_s);

    // Another spelling of the same file, while it lies in Deleted Items.
    model->CloseItem(linked);
    model->SelectItem(linked);
    model->DeleteSelected();
    ASSERT_TRUE(model->IsInDeletedItems(linked));
    const std::size_t count = model->GetItems().size();
    model->LinkDocument(QFileInfo(file).path() + u"/../docs/report.pdf"_s, true);
    EXPECT_EQ(model->GetItems().size(), count);
    EXPECT_TRUE(linked->IsOpen());
    // The catalog follows, so the document is still linked, not deleted, after a restart.
    EXPECT_EQ(CatalogValue(id, u"deleted"_s), u"false"_s);
    model->Load();
    EXPECT_EQ(Item(id)->GetParent(), model->GetLinkedDocuments());

    // Letter case matters to the file system, and other types are not linked at all.
    model->LinkDocument(QFileInfo(file).path() + u"/REPORT.pdf"_s, false);
    model->LinkDocument(WriteFile(u"docs/notes.txt"_s, "x"), false);
    EXPECT_EQ(model->GetItems().size(), count + 1);
}

TEST_F(ItemOperationsTest,
       TheLinkedDocumentsLimitKeepsTheMostRecentTheEarlierOfEqualAndAtLeastOne) {
    NavigatorSettings::Instance()->SetMaxLinkedDocuments(2);
    const QString t1 = Linked(u"/d/1.pdf"_s, 1000);
    const QString t3 = Linked(u"/d/3.pdf"_s, 3000);
    const QString t2 = Linked(u"/d/2.pdf"_s, 2000);
    const QString binned = Linked(u"/d/0.pdf"_s, 1, true);
    WNavDS* model = Load();
    model->EnforceLinkedLimit();
    EXPECT_EQ(Item(t1), nullptr);
    EXPECT_TRUE(CatalogValue(t1, u"type"_s).isNull());
    for (const QString& id : {t2, t3, binned})
        EXPECT_NE(Item(id), nullptr);

    // A newly linked file is the most recent: it stays, and the oldest goes.
    model->LinkDocument(WriteFile(u"new.pdf"_s, "%PDF"), false);
    const QString newest = model->GetSelected()->GetItemId();
    EXPECT_EQ(Item(newest)->GetParent(), model->GetLinkedDocuments());
    EXPECT_EQ(Item(t2), nullptr);

    // Among equal times the earlier in the list stays; a limit of zero still keeps one.
    const QString a = Linked(u"/d/a.pdf"_s, 500);
    const QString b = Linked(u"/d/b.pdf"_s, 500);
    model->Load();
    NavigatorSettings::Instance()->SetMaxLinkedDocuments(3);
    model->EnforceLinkedLimit();
    EXPECT_NE(Item(a), nullptr);
    EXPECT_EQ(Item(b), nullptr);
    NavigatorSettings::Instance()->SetMaxLinkedDocuments(0);
    model->EnforceLinkedLimit();
    EXPECT_NE(Item(newest), nullptr);
    EXPECT_EQ(Item(t3), nullptr);
    EXPECT_EQ(Item(a), nullptr);
}

TEST_F(ItemOperationsTest, DeletingAFolderClosesItsContentsAndRestoreBringsItBack) {
    const QString parent = Folder();
    const QString folder = Folder(parent);
    const QString inner = Add(u"note"_s, folder);
    WNavDS* model = Load();
    Update(inner, kOpen);

    model->SelectById(folder);
    model->DeleteSelected();
    NavListItemData* record = Item(folder);
    EXPECT_EQ(record->GetParent(), model->GetDeletedItems());
    EXPECT_EQ(record->GetRestoreParent(), Item(parent));
    EXPECT_EQ(model->GetSelected(), Item(parent));
    EXPECT_EQ(CatalogValue(folder, u"deleted"_s), u"true"_s);
    EXPECT_EQ(CatalogValue(inner, u"open"_s), u"false"_s);
    EXPECT_EQ(hub.calls.size(), 1);
    EXPECT_EQ(Children(parent), QStringList({folder}));

    model->SelectItem(record);
    model->RestoreSelected();
    EXPECT_EQ(record->GetParent(), Item(parent));
    EXPECT_EQ(CatalogValue(folder, u"deleted"_s), u"false"_s);

    // An item inside a deleted folder has no way back of its own: restoring it alone
    // leaves it where it is instead of losing its parent.
    model->DeleteSelected();
    model->SelectById(inner);
    model->RestoreSelected();
    EXPECT_EQ(Item(inner)->GetParent(), record);
}

TEST_F(ItemOperationsTest, DeleteInDeletedItemsRemovesForGood) {
    const QString kept = Add(u"note"_s);
    const QString first = Add(u"note"_s, u"root"_s, kDeleted);
    const QString folder = Add(u"folder"_s, u"root"_s, kDeleted);
    const QString inner = Add(u"note"_s, folder);
    WNavDS* model = Load();

    // Permanently Delete: only that item, and Deleted Items becomes the selection.
    model->SelectById(first);
    model->DeleteSelected();
    EXPECT_EQ(Item(first), nullptr);
    EXPECT_FALSE(QFileInfo::exists(AppDataFolder() + u"/Catalog/"_s + first));
    EXPECT_EQ(model->GetSelected(), model->GetDeletedItems());

    // Delete on Deleted Items itself empties it, contents of deleted folders included.
    model->DeleteSelected();
    EXPECT_EQ(Item(inner), nullptr);
    EXPECT_EQ(Children(u"root"_s), QStringList({kept}));
    EXPECT_EQ(ListOrder(), QStringList({kept}));
}

TEST_F(ItemOperationsTest, RestoreAllKeepsFolderContentsInTheirFolder) {
    const QString folder = Add(u"folder"_s, u"root"_s, kDeleted);
    const QString inner = Add(u"note"_s, folder, kDeleted);
    const QString older = Linked(u"/d/o.pdf"_s, 100, true);
    const QString newer = Linked(u"/d/n.pdf"_s, 200);
    NavigatorSettings::Instance()->SetMaxLinkedDocuments(1);
    WNavDS* model = Load();

    model->SelectItem(model->GetDeletedItems());
    model->RestoreSelected();
    EXPECT_EQ(Item(folder)->GetParent(), model->GetNotebook());
    EXPECT_EQ(Item(inner)->GetParent(), Item(folder));
    EXPECT_EQ(CatalogValue(inner, u"deleted"_s), u"false"_s);
    // The restored document joins Linked Documents, which keeps to its limit.
    EXPECT_EQ(Item(older), nullptr);
    EXPECT_NE(Item(newer), nullptr);
}

TEST_F(ItemOperationsTest, SaveToNotebookCopiesTheFileOrKeepsTheDocumentLinked) {
    const QString saved = Linked(WriteFile(u"docs/plan.qmd"_s, "plan text"), 100);
    const QString gone = Home() + u"/docs/gone.pdf"_s;
    const QString missing = Linked(gone, 100);
    // A device is no file to copy either, also behind a link.
    const QString device = Home() + u"/docs/device.pdf"_s;
    ASSERT_TRUE(QFile::link(u"/dev/null"_s, device));
    const QString notAFile = Linked(device, 100);
    WNavDS* model = Load();

    model->SelectById(saved);
    model->MoveSelectedTo(nullptr);
    EXPECT_EQ(Item(saved)->GetParent(), model->GetNotebook());
    EXPECT_EQ(CatalogValue(saved, u"linked"_s), u"false"_s);
    EXPECT_EQ(CatalogValue(saved, u"path"_s), u""_s);
    QString path;
    ASSERT_TRUE(model->GetSelectedDocumentPath(&path));
    EXPECT_EQ(path, ItemFile(saved, u"plan.qmd"_s));
    QFile copy(path);
    ASSERT_TRUE(copy.open(QIODevice::ReadOnly));
    EXPECT_EQ(copy.readAll(), QByteArray("plan text"));

    // No file to copy: the document stays linked, path and all, also after a restart.
    for (const auto& [itemId, source] : {std::pair(missing, gone), std::pair(notAFile, device)}) {
        model->MoveById(itemId);
        EXPECT_EQ(CatalogValue(itemId, u"linked"_s), u"true"_s) << source.toStdString();
        EXPECT_EQ(CatalogValue(itemId, u"path"_s), source);
        model->Load();
        EXPECT_EQ(Item(itemId)->GetParent(), model->GetLinkedDocuments());
    }
}

// Viewing the notebook's copy by its path opens the notebook document: it does not become a
// linked document, which the limit would remove together with the only copy.
TEST_F(ItemOperationsTest, ViewingANotebookCopyByItsPathOpensItAsItIs) {
    const QString saved = Linked(WriteFile(u"docs/plan.qmd"_s, "plan text"), 100);
    const QString other = Linked(u"/d/other.pdf"_s, 200);
    NavigatorSettings::Instance()->SetMaxLinkedDocuments(1);
    WNavDS* model = Load();
    model->SelectById(saved);
    model->MoveSelectedTo(nullptr);
    const std::size_t count = model->GetItems().size();

    model->LinkDocument(QFileInfo(ItemFile(saved, u"plan.qmd"_s)).path() + u"/./plan.qmd"_s, true);
    EXPECT_EQ(model->GetItems().size(), count);
    EXPECT_TRUE(Item(saved)->IsOpen());
    EXPECT_FALSE(Item(saved)->IsLinked());
    EXPECT_EQ(Item(saved)->GetParent(), model->GetNotebook());
    EXPECT_EQ(CatalogValue(saved, u"linked"_s), u"false"_s);
    EXPECT_EQ(CatalogValue(saved, u"path"_s), u""_s);

    model->EnforceLinkedLimit();
    EXPECT_NE(Item(other), nullptr);
    EXPECT_TRUE(QFileInfo::exists(ItemFile(saved, u"plan.qmd"_s)));
}

TEST_F(ItemOperationsTest, MovesKeepCatalogAndListInStepAndRefusedOnesChangeNothing) {
    const QString a = Folder();
    const QString aNote = Add(u"note"_s, a);
    const QString b = Folder();
    const QString bNote = Add(u"note"_s, b);
    const QString binned = Add(u"note"_s, u"root"_s, kDeleted);
    WNavDS* model = Load();

    // Refused: into its own subtree, into Linked Documents, a special folder, by outside id.
    const QStringList order = ListOrder();
    model->MoveItemTo(Item(a), Item(aNote));
    model->MoveItemTo(Item(aNote), model->GetLinkedDocuments());
    model->MoveItemTo(model->GetNotebook(), Item(a));
    model->MoveById(model->GetDeletedItems()->GetItemId());
    model->MoveById(model->GetLinkedDocuments()->GetItemId());
    EXPECT_EQ(ListOrder(), order);
    EXPECT_EQ(Children(a), QStringList({aNote}));

    // A folder goes with its contents, before the sibling it is dropped on.
    model->MoveItemTo(Item(b), Item(aNote));
    EXPECT_EQ(Children(a), QStringList({b, aNote}));
    EXPECT_EQ(ListOrder().mid(0, 4), QStringList({a, b, bNote, aNote}));

    // Out of Deleted Items onto a folder: the catalog takes the new place too.
    model->MoveItemTo(Item(binned), Item(b));
    EXPECT_EQ(Children(b), QStringList({bNote, binned}));
    EXPECT_EQ(CatalogValue(binned, u"deleted"_s), u"false"_s);
    model->Load();
    EXPECT_EQ(Item(binned)->GetParent(), Item(b));

    // Into Deleted Items the catalog place stays; dropping it there again keeps its way back.
    model->MoveItemTo(Item(binned), model->GetDeletedItems());
    model->MoveItemTo(Item(binned), model->GetDeletedItems());
    EXPECT_EQ(Item(binned)->GetRestoreParent(), Item(b));
    EXPECT_EQ(Children(b), QStringList({bNote, binned}));
}

TEST_F(ItemOperationsTest, CommandsAreEnabledFromTheSelection) {
    const QString folder = Folder();
    const QString note = Add(u"note"_s, folder);
    const QString binnedNote = Add(u"note"_s, u"root"_s, kDeleted);
    const QString linked = Linked(u"/d/x.pdf"_s, 1);
    WNavDS* model = Load();

    const struct {
        NavListItemData* selection;
        bool edit, rename, print, wordProcessor, blog, inDeleted;
    } cases[] = {
        {model->GetNotebook(), false, false, false, true, false, false},
        {model->GetLinkedDocuments(), false, true, false, false, false, false},
        {Item(folder), true, true, false, true, false, false},
        {Item(note), true, true, true, true, true, false},
        {Item(binnedNote), true, true, true, false, false, true},
        {Item(linked), true, false, true, false, false, false},
    };
    for (const auto& expected : cases) {
        model->SelectItem(expected.selection);
        SCOPED_TRACE(expected.selection->GetTitle().toStdString());
        EXPECT_EQ(model->CanEditSelected(), expected.edit);
        EXPECT_EQ(model->CanRenameSelected(), expected.rename);
        EXPECT_EQ(model->CanPrintSelected(), expected.print);
        EXPECT_EQ(model->CanSendSelectedToWordProcessor(), expected.wordProcessor);
        EXPECT_EQ(model->CanBlogSelected(), expected.blog);
        EXPECT_EQ(model->IsSelectedInDeletedItems(), expected.inDeleted);
    }
}

} // namespace
