#include "NavigatorModelFixture.h"

#include "dataexchange/CBasicStringIDReporter.h"
#include "libs/toolwell/IItemLink.h"
#include "settings/NavigatorSettings.h"

namespace {

class NavigatorDataSourceTest : public NavigatorModelFixture {
protected:
    // Replaces the catalog with a hand-edited one holding folders A and B and note N, placed
    // as the organization text says, and loads it.
    WNavDS* LoadCatalog(const char* organization) {
        const QByteArray text =
            QByteArray("<?xml version=\"1.0\"?><archive><organization><root>") + organization +
            "</root></organization><items>"
            "<folder uuid=\"A\"><properties><type>folder</type></properties></folder>"
            "<folder uuid=\"B\"><properties><type>folder</type></properties></folder>"
            "<note uuid=\"N\"><properties><type>note</type></properties></note>"
            "</items></archive>";
        QString catalog;
        host->GetCatalogPath(&catalog, nullptr);
        WriteFile(catalog.mid(Home().size() + 1), text);
        EXPECT_EQ(service->Open(), S_OK);
        WNavDS* model = Load();
        model->Load();
        return model;
    }
    // Each record below the special folders as "id<parent id", in list order.
    QStringList Placement() {
        QStringList placement;
        for (const auto& record : WNavDS::Instance()->GetItems()) {
            if (record->GetParent() != nullptr)
                placement.append(record->GetItemId() + u'<' + record->GetParent()->GetItemId());
        }
        return placement;
    }
    QStringList Children(const QString& itemId) {
        DataExchange::CBasicStringIDReporter children;
        service->ReportChildren(itemId, &children);
        return children.StringIDs();
    }
};

// A hand-edited catalog may refer to an item twice, even from inside the item itself: the
// first reference places it, the others are passed over and stay in the catalog.
TEST_F(NavigatorDataSourceTest, LoadShowsEveryItemOnceWhateverTheCatalogRefersTo) {
    const struct {
        const char* name;
        const char* organization;
        QStringList placement;
        QString holder; // keeps its repeated reference
        QStringList held;
    } cases[] = {
        {"cycle",
         "<child uuidref=\"A\"><child uuidref=\"B\"><child uuidref=\"A\"/></child></child>",
         {u"A<root"_s, u"B<A"_s},
         u"B"_s,
         {u"A"_s}},
        {"second reference",
         "<child uuidref=\"N\"/><child uuidref=\"A\"><child uuidref=\"N\"/></child>",
         {u"N<root"_s, u"A<root"_s},
         u"A"_s,
         {u"N"_s}},
        {"self reference",
         "<child uuidref=\"A\"><child uuidref=\"A\"/><child uuidref=\"N\"/></child>"
         "<child uuidref=\"root\"/>",
         {u"A<root"_s, u"N<A"_s},
         u"A"_s,
         {u"A"_s, u"N"_s}},
    };
    for (const auto& example : cases) {
        SCOPED_TRACE(example.name);
        LoadCatalog(example.organization);
        EXPECT_EQ(Placement(), example.placement);
        EXPECT_EQ(Children(example.holder), example.held);
    }
}

TEST_F(NavigatorDataSourceTest, RemovingAnItemOfACycleForGoodKeepsWhatHoldsIt) {
    WNavDS* model = LoadCatalog("<child uuidref=\"A\"><child uuidref=\"B\"><child uuidref=\"A\"/>"
                                "</child><child uuidref=\"N\"/></child>");
    model->SelectById(u"B"_s);
    model->DeleteSelected();
    model->SelectById(u"B"_s);
    model->DeleteSelected();
    EXPECT_EQ(Placement(), QStringList({u"A<root"_s, u"N<A"_s}));
    EXPECT_EQ(CatalogValue(u"A"_s, u"type"_s), u"folder"_s);

    model->Load();
    EXPECT_EQ(Placement(), QStringList({u"A<root"_s, u"N<A"_s}));
}

TEST_F(NavigatorDataSourceTest, LoadClosesItemsThatTheCatalogRecordsAsOpen) {
    const QString note = Add(u"note"_s, u"root"_s, kOpen);
    const QString document = Add(u"document"_s, u"root"_s, {{u"open"_s, u"TRUE"_s}});
    const QString deleted =
        Add(u"note"_s, u"root"_s, {{u"open"_s, u"true"_s}, {u"deleted"_s, u"true"_s}});

    WNavDS* model = Load();
    for (const QString& id : {note, document, deleted}) {
        EXPECT_FALSE(Item(id)->IsOpen());
        EXPECT_EQ(CatalogValue(id, u"open"_s), u"false"_s);
    }
    EXPECT_TRUE(launcher.starts.isEmpty());
    EXPECT_TRUE(model->IsChanged());
}

TEST_F(NavigatorDataSourceTest, SelectingExpandsAndPersistsEveryAncestor) {
    const QString outer = Folder();
    const QString inner = Folder(outer);
    const QString note = Add(u"note"_s, inner);
    WNavDS* model = Load();
    model->SetChanged(false);

    model->SelectById(note.toLower());
    EXPECT_EQ(model->GetSelected(), Item(note));
    for (const QString& folder : {outer, inner}) {
        EXPECT_TRUE(Item(folder)->IsExpanded());
        EXPECT_EQ(CatalogValue(folder, u"expanded"_s), u"true"_s);
    }
    EXPECT_EQ(NavigatorSettings::Instance()->GetLastSelectedItemId(), note);
    EXPECT_TRUE(model->IsChanged());

    model->SelectById(inner);
    model->CollapseSelected();
    EXPECT_EQ(CatalogValue(inner, u"expanded"_s), u"false"_s);
}

TEST_F(NavigatorDataSourceTest, FindItemIgnoresCaseAndAnswersTheFirstInListOrder) {
    WNavDS* model = Load();
    auto note = Set({{u"type"_s, u"note"_s}});
    NavListItemData* first = model->AddItemFromProperties(u"abc-1"_s, note.get(), nullptr);
    NavListItemData* second = model->AddItemFromProperties(u"ABC-1"_s, note.get(), nullptr);

    EXPECT_EQ(model->FindItem(u"ABC-1"_s), first);
    model->RemoveItemTree(first);
    EXPECT_EQ(model->FindItem(u"Abc-1"_s), second);
}

TEST_F(NavigatorDataSourceTest, UpdateItemWritesTheCatalogAndThenTheRecordByItsRules) {
    const QString note = Add(u"note"_s, u"root"_s, {{u"title"_s, u"Plan"_s}});
    const QString deleted = Add(u"note"_s, u"root"_s, kDeleted);
    Load();

    // The same title in other letters leaves the record as it was.
    Update(note, {{u"title"_s, u"PLAN"_s}});
    EXPECT_EQ(Item(note)->GetTitle(), u"Plan"_s);
    EXPECT_EQ(CatalogValue(note, u"title"_s), u"PLAN"_s);

    // Opening an item in Deleted Items is refused, but the catalog still gets the value.
    Update(deleted, kOpen);
    EXPECT_FALSE(Item(deleted)->IsOpen());
    EXPECT_EQ(CatalogValue(deleted, u"open"_s), u"true"_s);

    // Only an open item's program is told, and only when asked to.
    Update(note, {{u"title"_s, u"Draft"_s}});
    Update(note, kOpen);
    Update(note, {{u"title"_s, u"Budget"_s}});
    Update(note, {{u"title"_s, u"Final"_s}}, false);
    ASSERT_EQ(hub.calls.size(), 1);
    EXPECT_EQ(hub.calls[0].operation, u"UpdateNoteProperties"_s);
    EXPECT_EQ(hub.calls[0].properties.value(u"title"_s), u"Budget"_s);
    EXPECT_EQ(Item(note)->GetTitle(), u"Final"_s);
}

TEST_F(NavigatorDataSourceTest, OpeningStartsTheProgramOfTheKindOnceAndListsTheNoteAsRecent) {
    const QString note = Add(u"note"_s, u"root"_s, {{u"title"_s, u"Trip"_s}});
    const QString document = Linked(WriteFile(u"docs/a b.pdf"_s, "%PDF"), 1);
    Load();
    Update(note.toLower(), kOpen);
    Update(note, kOpen);
    Update(document, kOpen);

    ASSERT_EQ(launcher.starts.size(), 2);
    EXPECT_TRUE(launcher.starts[0].program.endsWith(u"/AmbrelNoteTool"_s));
    EXPECT_EQ(launcher.starts[0].arguments.value(0), ItemFile(note));
    EXPECT_TRUE(launcher.starts[0].arguments.value(2).contains(u"itemid|"_s + note + u'|'));
    EXPECT_TRUE(launcher.starts[1].program.endsWith(u"/AmbrelViewer"_s));
    EXPECT_EQ(launcher.starts[1].arguments, QStringList({u"/o"_s, u"/id:"_s + document}));

    ReleasePtr<IItemLink> link(GetNoteToolLink(host.get()));
    ASSERT_EQ(link->Items().size(), 1);
    EXPECT_EQ(link->Items()[0].title, u"Trip"_s);
    Update(note, {{u"title"_s, u"Journey"_s}});
    EXPECT_EQ(link->Items()[0].title, u"Journey"_s);
}

TEST_F(NavigatorDataSourceTest, LinkingBeyondTheLimitDropsTheLeastRecentlyUsed) {
    const QString oldest = Linked(u"/d/1.pdf"_s, 1000);
    const QString newer = Linked(u"/d/3.pdf"_s, 3000);
    const QString joining = Add(u"document"_s, u"root"_s, {{u"dateaccessed"_s, Time(500)}});
    const QString later = Add(u"document"_s, u"root"_s, {{u"dateaccessed"_s, Time(2000)}});
    NavigatorSettings::Instance()->SetMaxLinkedDocuments(2);
    Load();

    // The joining document is itself the oldest: it goes at once, and nothing touches it after.
    Update(joining, kLinked, false);
    EXPECT_EQ(Item(joining), nullptr);
    EXPECT_TRUE(CatalogValue(joining, u"type"_s).isNull());
    EXPECT_NE(Item(oldest), nullptr);

    Update(later, kLinked, false);
    EXPECT_EQ(Item(oldest), nullptr);
    EXPECT_NE(Item(newer), nullptr);
    EXPECT_NE(Item(later), nullptr);
}

// Only documents are linked: a folder so marked would fall to the limit with all it holds.
// Other programs change no special folder and never what is linked.
TEST_F(NavigatorDataSourceTest, OnlyDocumentsAreLinkedAndOtherProgramsNeverChangeWhich) {
    const QString folder = Folder();
    const QString inner = Add(u"note"_s, folder);
    const QString marked = Add(u"folder"_s, u"root"_s, kLinked);
    const QString document = Add(u"document"_s, u"root"_s, {{u"subtype"_s, u"pdf"_s}});
    const QString linked = Linked(u"/d/x.pdf"_s, 100);
    NavigatorSettings::Instance()->SetMaxLinkedDocuments(1);
    WNavDS* model = Load();
    EXPECT_EQ(Item(marked)->GetParent(), model->GetNotebook());

    Update(folder, kLinked);
    model->EnforceLinkedLimit();
    ASSERT_NE(Item(inner), nullptr);
    EXPECT_FALSE(Item(folder)->IsLinked());
    EXPECT_TRUE(CatalogValue(folder, u"linked"_s).isNull());

    const Props outside{
        {u"title"_s, u"X"_s}, {u"linked"_s, u"true"_s}, {u"expanded"_s, u"false"_s}};
    for (NavListItemData* special :
         {model->GetNotebook(), model->GetLinkedDocuments(), model->GetDeletedItems()}) {
        model->UpdateItemFromOutside(special->GetItemId().toUpper(), Set(outside).get());
        EXPECT_NE(special->GetTitle(), u"X"_s);
        EXPECT_FALSE(special->IsLinked());
    }
    EXPECT_TRUE(model->GetNotebook()->IsExpanded());

    // Saving to the Notebook from outside moves linked documents only.
    model->MoveById(inner);
    model->MoveById(document);
    EXPECT_EQ(Item(inner)->GetParent(), Item(folder));
    EXPECT_EQ(Children(u"root"_s).last(), linked);

    model->UpdateItemFromOutside(document, Set(outside).get());
    model->UpdateItemFromOutside(linked, Set({{u"linked"_s, u"false"_s}}).get());
    ASSERT_NE(Item(document), nullptr);
    EXPECT_EQ(Item(document)->GetTitle(), u"X"_s);
    EXPECT_FALSE(Item(document)->IsLinked());
    EXPECT_TRUE(CatalogValue(document, u"linked"_s).isNull());
    EXPECT_TRUE(Item(linked)->IsLinked());
}

TEST_F(NavigatorDataSourceTest, ClearTellsTheProgramsThatOpenItemsAreClosed) {
    const QString note = Add(u"note"_s);
    const QString document = Add(u"document"_s);
    WNavDS* model = Load();
    Item(note)->SetOpen(true);
    Item(document)->SetOpen(true);

    model->Clear();
    ASSERT_EQ(hub.calls.size(), 2);
    EXPECT_EQ(hub.calls[0].operation, u"UpdateNoteProperties"_s);
    EXPECT_EQ(hub.calls[1].operation, u"UpdateDocumentProperties"_s);
    EXPECT_EQ(hub.calls[1].properties, (Props{{u"open"_s, u"false"_s}}));
    EXPECT_TRUE(model->GetItems().empty());
}

} // namespace
