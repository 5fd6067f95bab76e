#include "NavigatorModelFixture.h"

#include "dataexchange/CBasicStringIDReporter.h"
#include "libs/toolwell/Formats.h"
#include "settings/NavigatorSettings.h"

#include <QFile>
#include <QFileInfo>

namespace {

const QString kTrue = QStringLiteral("true");
const QString kFalse = QStringLiteral("false");
const QString kRoot = QStringLiteral("root");
const QString kFolder = QStringLiteral("folder");
const QString kNote = QStringLiteral("note");
const QString kDocument = QStringLiteral("document");
const QString kOpen = QStringLiteral("open");
const QString kDeleted = QStringLiteral("deleted");
const QString kLinked = QStringLiteral("linked");

QString Time(std::int64_t seconds) {
    QString text;
    FormatTime(&text, seconds);
    return text;
}

class ItemOperationsTest : public NavigatorModelFixture {
protected:
    // The catalog's children of an item, in order.
    QStringList Children(const QString& itemId) {
        DataExchange::CBasicStringIDReporter children;
        service->ReportChildren(itemId, &children);
        return children.StringIDs();
    }
    // The records' identifiers in list order, special folders left out.
    QStringList ListOrder(WNavDS* model) {
        QStringList order;
        for (const auto& record : model->GetItems()) {
            if (record->GetParent() != nullptr)
                order.append(record->GetItemId());
        }
        return order;
    }
    QString LinkedDocument(const QString& path, const QString& accessed, bool deleted = false) {
        QMap<QString, QString> properties{{kLinked, kTrue},
                                          {QStringLiteral("path"), path},
                                          {QStringLiteral("subtype"), QStringLiteral("pdf")},
                                          {QStringLiteral("dateaccessed"), accessed}};
        if (deleted)
            properties.insert(kDeleted, kTrue);
        return Add(kDocument, kRoot, properties);
    }
    QString NewNoteId(WNavDS* model) {
        QString id;
        UnicodeStringPtr sink(&id);
        model->NewNote(nullptr, &sink);
        return id;
    }
};

TEST_F(ItemOperationsTest, NewNoteLandsBesideTheSelectionAndOpensInTheNoteTool) {
    const QString folder = Add(kFolder, kRoot);
    const QString first = Add(kNote, folder);
    const QString second = Add(kNote, folder);
    const QString binned = Add(kNote, kRoot, {{kDeleted, kTrue}});
    NavigatorSettings::Instance()->SetDefaultFont(QStringLiteral("Verdana"));
    WNavDS* model = Load();

    // On a folder: its last child, and the folder opens.
    model->SelectById(folder);
    const QString inFolder = NewNoteId(model);
    EXPECT_EQ(Children(folder), QStringList({first, second, inFolder}));
    EXPECT_EQ(CatalogValue(folder, QStringLiteral("expanded")), kTrue);
    EXPECT_EQ(model->GetSelected(), model->FindItem(inFolder));
    EXPECT_EQ(model->FindItem(inFolder)->GetParent(), model->FindItem(folder));
    EXPECT_EQ(CatalogValue(inFolder, QStringLiteral("font")), QStringLiteral("Verdana"));
    EXPECT_EQ(CatalogValue(inFolder, QStringLiteral("size")), QStringLiteral("525,400"));
    EXPECT_EQ(CatalogValue(inFolder, QStringLiteral("filename")), QStringLiteral("note.htm"));
    ASSERT_EQ(launcher.starts.size(), 1);
    EXPECT_EQ(launcher.starts[0].arguments.value(0), AppDataFolder() + QStringLiteral("/Catalog/") +
                                                         inFolder + QStringLiteral("/note.htm"));
    EXPECT_TRUE(launcher.starts[0].arguments.value(2).contains(QStringLiteral("itemid|") +
                                                               inFolder + u'|'));

    // On a note: just before it, in the catalog and in the list.
    model->SelectById(second);
    const QString beside = NewNoteId(model);
    EXPECT_EQ(Children(folder), QStringList({first, beside, second, inFolder}));
    EXPECT_EQ(ListOrder(model).indexOf(beside) + 1, ListOrder(model).indexOf(second));

    // Nothing is made inside Deleted Items: the note goes to the end of the Notebook.
    model->SelectById(binned);
    const QString top = NewNoteId(model);
    EXPECT_EQ(Children(kRoot).last(), top);
    EXPECT_EQ(model->FindItem(top)->GetParent(), model->GetNotebook());
    EXPECT_EQ(CatalogValue(top, kDeleted), QString());
}

TEST_F(ItemOperationsTest, NewFolderIsNamedAndAwaitsRenamingOnlyWhenItWasMade) {
    WNavDS* model = Load();
    QString id;
    UnicodeStringPtr sink(&id);
    model->NewFolder(&sink);
    ASSERT_NE(model->FindItem(id), nullptr);
    EXPECT_EQ(model->FindItem(id)->GetTitle(), QStringLiteral("New Folder"));
    EXPECT_EQ(model->GetSelected(), model->FindItem(id));
    EXPECT_TRUE(model->IsRenamePending());

    // A catalog that refuses every item: nothing is made, nothing is renamed.
    model->SetRenamePending(false);
    service->Suspend();
    const std::size_t count = model->GetItems().size();
    model->NewFolder(nullptr);
    EXPECT_FALSE(model->IsRenamePending());
    auto note = Set({{QStringLiteral("type"), kNote}});
    EXPECT_EQ(model->AddNewItem(note.get(), 0, nullptr), E_FAIL);
    auto strange = Set({{QStringLiteral("type"), QStringLiteral("Note")}});
    service->Resume();
    EXPECT_EQ(model->AddNewItem(strange.get(), 0, nullptr), E_FAIL);
    EXPECT_EQ(model->GetItems().size(), count);
}

TEST_F(ItemOperationsTest, LinkingAFileTheCatalogHoldsOpensTheExistingEntry) {
    const QString file = WriteFile(QStringLiteral("docs/report.pdf"), "%PDF");
    WNavDS* model = Load();

    model->LinkDocument(file, true);
    ASSERT_EQ(model->GetLinkedDocuments(), model->TopFolderOf(model->GetSelected()));
    NavListItemData* linked = model->GetSelected();
    const QString id = linked->GetItemId();
    EXPECT_TRUE(linked->IsOpen());
    EXPECT_EQ(CatalogValue(id, QStringLiteral("title")), QStringLiteral("report.pdf"));
    EXPECT_EQ(CatalogValue(id, QStringLiteral("subtype")), QStringLiteral("pdf"));
    EXPECT_EQ(launcher.starts.size(), 1);

    // Another spelling of the same file; it lies in Deleted Items meanwhile.
    model->CloseItem(linked);
    model->SelectItem(linked);
    model->DeleteSelected();
    ASSERT_TRUE(model->IsInDeletedItems(linked));
    const std::size_t count = model->GetItems().size();
    model->LinkDocument(QFileInfo(file).path() + QStringLiteral("/../docs/report.pdf"), true);
    EXPECT_EQ(model->GetItems().size(), count);
    EXPECT_EQ(linked->GetParent(), model->GetLinkedDocuments());
    EXPECT_TRUE(linked->IsOpen());
    EXPECT_EQ(launcher.starts.size(), 2);
    // The catalog follows, so the document is still linked, not deleted, after a restart.
    EXPECT_EQ(CatalogValue(id, kDeleted), kFalse);
    model->Load();
    EXPECT_EQ(model->FindItem(id)->GetParent(), model->GetLinkedDocuments());

    // Letter case matters to the file system, and other types are not linked at all.
    model->LinkDocument(QFileInfo(file).path() + QStringLiteral("/REPORT.pdf"), false);
    EXPECT_EQ(model->GetItems().size(), count + 1);
    model->LinkDocument(WriteFile(QStringLiteral("docs/notes.txt"), "x"), false);
    EXPECT_EQ(model->GetItems().size(), count + 1);
}

TEST_F(ItemOperationsTest, TheLinkedDocumentsLimitKeepsTheMostRecent) {
    NavigatorSettings::Instance()->SetMaxLinkedDocuments(2);
    const QString t1 = LinkedDocument(QStringLiteral("/d/1.pdf"), Time(1000));
    const QString t3 = LinkedDocument(QStringLiteral("/d/3.pdf"), Time(3000));
    const QString t2 = LinkedDocument(QStringLiteral("/d/2.pdf"), Time(2000));
    const QString binned = LinkedDocument(QStringLiteral("/d/0.pdf"), Time(1), true);
    WNavDS* model = Load();
    model->EnforceLinkedLimit();
    EXPECT_EQ(model->FindItem(t1), nullptr);
    EXPECT_TRUE(CatalogValue(t1, QStringLiteral("type")).isNull());
    EXPECT_NE(model->FindItem(t2), nullptr);
    EXPECT_NE(model->FindItem(t3), nullptr);
    EXPECT_NE(model->FindItem(binned), nullptr);

    // A newly linked file is the most recent: it stays, the oldest goes, however full the
    // list was.
    model->LinkDocument(WriteFile(QStringLiteral("new.pdf"), "%PDF"), false);
    NavListItemData* fresh = model->GetSelected();
    ASSERT_NE(fresh, nullptr);
    EXPECT_EQ(fresh->GetParent(), model->GetLinkedDocuments());
    EXPECT_EQ(model->FindItem(t2), nullptr);
    EXPECT_NE(model->FindItem(t3), nullptr);
}

TEST_F(ItemOperationsTest, AmongEqualTimesTheEarlierStaysAndOneAlwaysRemains) {
    const QString a = LinkedDocument(QStringLiteral("/d/a.pdf"), Time(500));
    const QString b = LinkedDocument(QStringLiteral("/d/b.pdf"), Time(500));
    const QString c = LinkedDocument(QStringLiteral("/d/c.pdf"), Time(500));
    NavigatorSettings::Instance()->SetMaxLinkedDocuments(2);
    WNavDS* model = Load();
    model->EnforceLinkedLimit();
    EXPECT_NE(model->FindItem(a), nullptr);
    EXPECT_NE(model->FindItem(b), nullptr);
    EXPECT_EQ(model->FindItem(c), nullptr);

    NavigatorSettings::Instance()->SetMaxLinkedDocuments(0);
    model->EnforceLinkedLimit();
    EXPECT_NE(model->FindItem(a), nullptr);
    EXPECT_EQ(model->FindItem(b), nullptr);
}

TEST_F(ItemOperationsTest, DeletingAFolderClosesItsContentsAndRestoreBringsItBack) {
    const QString parent = Add(kFolder, kRoot);
    const QString folder = Add(kFolder, parent);
    const QString inner = Add(kNote, folder);
    WNavDS* model = Load();
    auto open = Set({{kOpen, kTrue}});
    model->UpdateItem(inner, open.get(), true);
    hub.calls.clear();

    model->SelectById(folder);
    model->DeleteSelected();
    NavListItemData* record = model->FindItem(folder);
    EXPECT_EQ(record->GetParent(), model->GetDeletedItems());
    EXPECT_EQ(record->GetRestoreParent(), model->FindItem(parent));
    EXPECT_EQ(model->GetSelected(), model->FindItem(parent));
    EXPECT_FALSE(model->FindItem(inner)->IsOpen());
    EXPECT_TRUE(model->IsInDeletedItems(model->FindItem(inner)));
    EXPECT_EQ(CatalogValue(folder, kDeleted), kTrue);
    EXPECT_EQ(CatalogValue(inner, kOpen), kFalse);
    ASSERT_EQ(hub.calls.size(), 1);
    EXPECT_EQ(hub.calls[0].properties.value(kOpen), kFalse);
    // The catalog place does not change.
    EXPECT_EQ(Children(parent), QStringList({folder}));

    model->SelectItem(record);
    model->RestoreSelected();
    EXPECT_EQ(record->GetParent(), model->FindItem(parent));
    EXPECT_EQ(record->GetRestoreParent(), nullptr);
    EXPECT_EQ(CatalogValue(folder, kDeleted), kFalse);

    // An item inside a deleted folder carries no way back of its own: restoring it alone
    // leaves it where it is instead of losing its parent.
    model->DeleteSelected();
    model->SelectById(inner);
    model->RestoreSelected();
    EXPECT_EQ(model->FindItem(inner)->GetParent(), record);
}

TEST_F(ItemOperationsTest, DeleteInDeletedItemsRemovesForGood) {
    const QString kept = Add(kNote, kRoot);
    const QString first = Add(kNote, kRoot, {{kDeleted, kTrue}});
    const QString folder = Add(kFolder, kRoot, {{kDeleted, kTrue}});
    const QString inner = Add(kNote, folder);
    WNavDS* model = Load();

    // Permanently Delete: only that item, and Deleted Items becomes the selection.
    model->SelectById(first);
    model->DeleteSelected();
    EXPECT_EQ(model->FindItem(first), nullptr);
    EXPECT_TRUE(CatalogValue(first, QStringLiteral("type")).isNull());
    EXPECT_FALSE(QFileInfo::exists(AppDataFolder() + QStringLiteral("/Catalog/") + first));
    EXPECT_EQ(model->GetSelected(), model->GetDeletedItems());
    EXPECT_NE(model->FindItem(folder), nullptr);

    // Delete on Deleted Items itself empties it, contents of deleted folders included.
    model->DeleteSelected();
    EXPECT_EQ(model->FindItem(folder), nullptr);
    EXPECT_EQ(model->FindItem(inner), nullptr);
    EXPECT_EQ(Children(kRoot), QStringList({kept}));
    EXPECT_EQ(ListOrder(model), QStringList({kept}));
}

TEST_F(ItemOperationsTest, RestoreAllKeepsFolderContentsInTheirFolder) {
    const QString folder = Add(kFolder, kRoot, {{kDeleted, kTrue}});
    const QString inner = Add(kNote, folder);
    const QString alsoDeleted = Add(kNote, folder, {{kDeleted, kTrue}});
    const QString older = LinkedDocument(QStringLiteral("/d/o.pdf"), Time(100), true);
    const QString newer = LinkedDocument(QStringLiteral("/d/n.pdf"), Time(200));
    NavigatorSettings::Instance()->SetMaxLinkedDocuments(1);
    WNavDS* model = Load();

    model->SelectItem(model->GetDeletedItems());
    model->RestoreSelected();
    EXPECT_EQ(model->FindItem(folder)->GetParent(), model->GetNotebook());
    EXPECT_EQ(model->FindItem(inner)->GetParent(), model->FindItem(folder));
    EXPECT_EQ(model->FindItem(alsoDeleted)->GetParent(), model->FindItem(folder));
    EXPECT_EQ(CatalogValue(alsoDeleted, kDeleted), kFalse);
    // The restored document joins Linked Documents, which keeps to its limit.
    EXPECT_EQ(model->FindItem(older), nullptr);
    EXPECT_NE(model->FindItem(newer), nullptr);
}

TEST_F(ItemOperationsTest, SaveToNotebookCopiesTheFileOrKeepsTheDocumentLinked) {
    const QString file = WriteFile(QStringLiteral("docs/plan.qmd"), "plan text");
    const QString saved = LinkedDocument(file, Time(100));
    const QString missing = LinkedDocument(Home() + QStringLiteral("/docs/gone.pdf"), Time(100));
    WNavDS* model = Load();

    model->SelectById(saved);
    model->MoveSelectedTo(nullptr);
    NavListItemData* record = model->FindItem(saved);
    EXPECT_EQ(record->GetParent(), model->GetNotebook());
    EXPECT_FALSE(record->IsLinked());
    EXPECT_EQ(CatalogValue(saved, kLinked), kFalse);
    EXPECT_EQ(CatalogValue(saved, QStringLiteral("path")), QString(QStringLiteral("")));
    QString path;
    ASSERT_TRUE(model->GetSelectedDocumentPath(&path));
    EXPECT_EQ(path,
              AppDataFolder() + QStringLiteral("/Catalog/") + saved + QStringLiteral("/plan.qmd"));
    QFile copy(path);
    ASSERT_TRUE(copy.open(QIODevice::ReadOnly));
    EXPECT_EQ(copy.readAll(), QByteArray("plan text"));

    // No file to copy: the document stays linked, path and all, also after a restart.
    model->MoveById(missing);
    EXPECT_EQ(model->FindItem(missing)->GetParent(), model->GetLinkedDocuments());
    EXPECT_EQ(CatalogValue(missing, kLinked), kTrue);
    EXPECT_EQ(CatalogValue(missing, QStringLiteral("path")),
              Home() + QStringLiteral("/docs/gone.pdf"));
    model->Load();
    EXPECT_EQ(model->FindItem(missing)->GetParent(), model->GetLinkedDocuments());
    EXPECT_EQ(model->FindItem(saved)->GetParent(), model->GetNotebook());
}

TEST_F(ItemOperationsTest, MovesThatCanDropRefusesChangeNothing) {
    const QString outer = Add(kFolder, kRoot);
    const QString inner = Add(kFolder, outer);
    const QString note = Add(kNote, kRoot);
    WNavDS* model = Load();
    const QStringList order = ListOrder(model);

    model->MoveItemTo(model->FindItem(outer), model->FindItem(inner));
    model->MoveItemTo(model->FindItem(note), model->GetLinkedDocuments());
    model->MoveItemTo(model->GetNotebook(), model->FindItem(outer));
    // An identifier from outside that names a special folder.
    model->MoveById(model->GetDeletedItems()->GetItemId());
    model->MoveById(model->GetLinkedDocuments()->GetItemId());

    EXPECT_EQ(Children(kRoot), QStringList({outer, note}));
    EXPECT_EQ(Children(outer), QStringList({inner}));
    EXPECT_EQ(ListOrder(model), order);
    EXPECT_EQ(model->FindItem(outer)->GetParent(), model->GetNotebook());
    EXPECT_EQ(model->GetDeletedItems()->GetParent(), nullptr);
    EXPECT_EQ(model->GetLinkedDocuments()->GetParent(), nullptr);
}

TEST_F(ItemOperationsTest, MovesKeepCatalogRecordsAndListInStep) {
    const QString a = Add(kFolder, kRoot);
    const QString aNote = Add(kNote, a);
    const QString b = Add(kFolder, kRoot);
    const QString bNote = Add(kNote, b);
    const QString binned = Add(kNote, kRoot, {{kDeleted, kTrue}});
    WNavDS* model = Load();

    // A folder goes with its contents, before the sibling it is dropped on.
    model->MoveItemTo(model->FindItem(b), model->FindItem(aNote));
    EXPECT_EQ(Children(a), QStringList({b, aNote}));
    EXPECT_EQ(ListOrder(model).mid(0, 4), QStringList({a, b, bNote, aNote}));

    // Out of Deleted Items onto a folder: the catalog takes the new place too.
    model->MoveItemTo(model->FindItem(binned), model->FindItem(b));
    EXPECT_EQ(Children(b), QStringList({bNote, binned}));
    EXPECT_EQ(CatalogValue(binned, kDeleted), kFalse);
    model->Load();
    EXPECT_EQ(model->FindItem(binned)->GetParent(), model->FindItem(b));

    // Into Deleted Items the catalog place stays; dropping it there again keeps its way back.
    model->MoveItemTo(model->FindItem(binned), model->GetDeletedItems());
    NavListItemData* record = model->FindItem(binned);
    EXPECT_EQ(record->GetRestoreParent(), model->FindItem(b));
    model->MoveItemTo(record, model->GetDeletedItems());
    EXPECT_EQ(record->GetRestoreParent(), model->FindItem(b));
    EXPECT_EQ(Children(b), QStringList({bNote, binned}));
}

TEST_F(ItemOperationsTest, FilterChoicesRefreshTheTreeOnlyWhenTheyChange) {
    WNavDS* model = Load();
    NavigatorSettings* settings = NavigatorSettings::Instance();
    model->SetChanged(false);
    settings->SaveIfDirty();

    model->ChooseTypeFilter(WNavDS::TypeFilter::All);
    EXPECT_FALSE(model->IsChanged());
    EXPECT_FALSE(settings->IsDirty());

    model->ChooseTypeFilter(WNavDS::TypeFilter::Pdf);
    EXPECT_TRUE(model->IsChanged());
    EXPECT_TRUE(model->IsTypeFilterChosen(WNavDS::TypeFilter::Pdf));
    EXPECT_FALSE(model->IsTypeFilterChosen(WNavDS::TypeFilter::All));

    model->SetChanged(false);
    model->ToggleOpenedItemsOnly();
    EXPECT_TRUE(model->IsOpenedItemsOnly());
    EXPECT_TRUE(model->IsChanged());
    model->ToggleOpenedItemsOnly();
    EXPECT_FALSE(model->IsOpenedItemsOnly());
}

TEST_F(ItemOperationsTest, CommandsAreEnabledFromTheSelection) {
    const QString folder = Add(kFolder, kRoot);
    const QString note = Add(kNote, folder);
    const QString binnedNote = Add(kNote, kRoot, {{kDeleted, kTrue}});
    const QString linked = LinkedDocument(QStringLiteral("/d/x.pdf"), Time(1));
    WNavDS* model = Load();

    struct Expected {
        NavListItemData* selection;
        bool rename, print, wordProcessor, blog;
    };
    const QList<Expected> cases{
        {model->GetNotebook(), false, false, true, false},
        {model->GetLinkedDocuments(), true, false, false, false},
        {model->FindItem(folder), true, false, true, false},
        {model->FindItem(note), true, true, true, true},
        {model->FindItem(binnedNote), true, true, false, false},
        {model->FindItem(linked), false, true, false, false},
    };
    for (const Expected& expected : cases) {
        model->SelectItem(expected.selection);
        SCOPED_TRACE(expected.selection->GetTitle().toStdString());
        EXPECT_EQ(model->CanRenameSelected(), expected.rename);
        EXPECT_EQ(model->CanPrintSelected(), expected.print);
        EXPECT_EQ(model->CanSendSelectedToWordProcessor(), expected.wordProcessor);
        EXPECT_EQ(model->CanBlogSelected(), expected.blog);
    }
}

} // namespace
