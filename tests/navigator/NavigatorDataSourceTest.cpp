#include "NavigatorModelFixture.h"

#include "libs/toolwell/Formats.h"
#include "libs/toolwell/IItemLink.h"
#include "settings/NavigatorSettings.h"

namespace {

class NavigatorDataSourceTest : public NavigatorModelFixture {};

const QString kTrue = QStringLiteral("true");
const QString kFalse = QStringLiteral("false");
const QString kOpen = QStringLiteral("open");

QString Time(std::int64_t seconds) {
    QString text;
    FormatTime(&text, seconds);
    return text;
}

TEST_F(NavigatorDataSourceTest, LoadClosesItemsThatTheCatalogRecordsAsOpen) {
    const QString note = Add(QStringLiteral("note"), QStringLiteral("root"), {{kOpen, kTrue}});
    const QString document =
        Add(QStringLiteral("document"), QStringLiteral("root"), {{kOpen, QStringLiteral("TRUE")}});
    const QString deleted = Add(QStringLiteral("note"), QStringLiteral("root"),
                                {{kOpen, kTrue}, {QStringLiteral("deleted"), kTrue}});

    WNavDS* model = Load();
    for (const QString& id : {note, document, deleted}) {
        EXPECT_FALSE(model->FindItem(id)->IsOpen());
        EXPECT_EQ(CatalogValue(id, kOpen), kFalse);
    }
    EXPECT_TRUE(launcher.starts.isEmpty());
    EXPECT_TRUE(model->IsChanged());
}

TEST_F(NavigatorDataSourceTest, SelectingExpandsAndPersistsEveryAncestor) {
    const QString outer = Add(QStringLiteral("folder"), QStringLiteral("root"));
    const QString inner = Add(QStringLiteral("folder"), outer);
    const QString note = Add(QStringLiteral("note"), inner);
    WNavDS* model = Load();
    ASSERT_FALSE(model->FindItem(outer)->IsExpanded());
    model->SetChanged(false);

    model->SelectById(note.toLower());
    EXPECT_EQ(model->GetSelected(), model->FindItem(note));
    for (const QString& folder : {outer, inner}) {
        EXPECT_TRUE(model->FindItem(folder)->IsExpanded());
        EXPECT_EQ(CatalogValue(folder, QStringLiteral("expanded")), kTrue);
    }
    EXPECT_EQ(CatalogValue(note, QStringLiteral("expanded")), QString());
    EXPECT_EQ(NavigatorSettings::Instance()->GetLastSelectedItemId(), note);
    EXPECT_TRUE(NavigatorSettings::Instance()->IsDirty());
    EXPECT_TRUE(model->IsChanged());

    // Collapsing is kept too, so the folder loads collapsed next time.
    model->SelectById(inner);
    model->CollapseSelected();
    EXPECT_EQ(CatalogValue(inner, QStringLiteral("expanded")), kFalse);
    model->Load();
    EXPECT_FALSE(model->FindItem(inner)->IsExpanded());
    EXPECT_TRUE(model->FindItem(outer)->IsExpanded());

    // An unknown id keeps the selection.
    model->SelectById(QStringLiteral("no such item"));
    EXPECT_EQ(model->GetSelected(), model->GetNotebook());
}

TEST_F(NavigatorDataSourceTest, FindItemIgnoresCaseAndAnswersTheFirstInListOrder) {
    WNavDS* model = Load();
    ReleasePtr<DataExchange::IProperties> set =
        Set({{QStringLiteral("type"), QStringLiteral("note")}});
    NavListItemData* first =
        model->AddItemFromProperties(QStringLiteral("abc-1"), set.get(), nullptr);
    NavListItemData* second =
        model->AddItemFromProperties(QStringLiteral("ABC-1"), set.get(), nullptr);

    EXPECT_EQ(model->FindItem(QStringLiteral("Abc-1")), first);
    EXPECT_EQ(model->FindItem(QStringLiteral("ABC-1")), first);
    EXPECT_EQ(first->GetParent(), model->GetNotebook());
    model->RemoveItemTree(first);
    EXPECT_EQ(model->FindItem(QStringLiteral("abc-1")), second);
    EXPECT_EQ(model->FindItem(QString()), nullptr);
}

TEST_F(NavigatorDataSourceTest, UpdateItemWritesTheCatalogFirstAndOnlyThenTheRecord) {
    const QString note = Add(QStringLiteral("note"), QStringLiteral("root"),
                             {{QStringLiteral("title"), QStringLiteral("Plan")}});
    const QString deleted =
        Add(QStringLiteral("note"), QStringLiteral("root"), {{QStringLiteral("deleted"), kTrue}});
    WNavDS* model = Load();
    NavListItemData* record = model->FindItem(note);

    // The same title in other letters leaves the record as it was.
    auto retitle = Set({{QStringLiteral("title"), QStringLiteral("PLAN")}});
    model->UpdateItem(note, retitle.get(), true);
    EXPECT_EQ(record->GetTitle(), QStringLiteral("Plan"));
    EXPECT_EQ(CatalogValue(note, QStringLiteral("title")), QStringLiteral("PLAN"));

    // Opening an item in Deleted Items is refused, but the catalog still gets the value.
    auto open = Set({{kOpen, kTrue}});
    model->UpdateItem(deleted, open.get(), true);
    EXPECT_FALSE(model->FindItem(deleted)->IsOpen());
    EXPECT_EQ(CatalogValue(deleted, kOpen), kTrue);
    EXPECT_TRUE(launcher.starts.isEmpty());

    // A closed item's program is not told; an open one's is.
    model->UpdateItem(note, retitle.get(), true);
    EXPECT_TRUE(hub.calls.isEmpty());
    model->UpdateItem(note, open.get(), true);
    EXPECT_TRUE(record->IsOpen());
    EXPECT_TRUE(hub.calls.isEmpty());
    auto renamed = Set({{QStringLiteral("title"), QStringLiteral("Budget")}});
    model->UpdateItem(note, renamed.get(), true);
    ASSERT_EQ(hub.calls.size(), 1);
    EXPECT_EQ(hub.calls[0].operation, QStringLiteral("UpdateNoteProperties"));
    EXPECT_EQ(hub.calls[0].properties.value(QStringLiteral("title")), QStringLiteral("Budget"));
    model->UpdateItem(note, renamed.get(), false);
    EXPECT_EQ(hub.calls.size(), 1);
}

TEST_F(NavigatorDataSourceTest, OpeningANoteStartsTheNoteToolAndListsItAsRecent) {
    const QString note = Add(QStringLiteral("note"), QStringLiteral("root"),
                             {{QStringLiteral("title"), QStringLiteral("Trip")}});
    WNavDS* model = Load();
    auto open = Set({{kOpen, kTrue}});
    model->UpdateItem(note.toLower(), open.get(), true);

    ASSERT_EQ(launcher.starts.size(), 1);
    const QStringList arguments = launcher.starts[0].arguments;
    ASSERT_EQ(arguments.size(), 3);
    EXPECT_TRUE(launcher.starts[0].program.endsWith(QStringLiteral("/AmbrelNoteTool")));
    EXPECT_EQ(arguments[0],
              AppDataFolder() + QStringLiteral("/Catalog/") + note + QStringLiteral("/note.htm"));
    EXPECT_EQ(arguments[1], QStringLiteral("/PROPERTY"));
    EXPECT_TRUE(arguments[2].contains(QStringLiteral("itemid|") + note + u'|'));
    EXPECT_TRUE(arguments[2].contains(QStringLiteral("title|Trip|")));

    // Opening it again starts nothing new, but it is still announced as recent.
    model->UpdateItem(note, open.get(), true);
    EXPECT_EQ(launcher.starts.size(), 1);
    ReleasePtr<IItemLink> link(GetNoteToolLink(host.get()));
    ASSERT_EQ(link->Items().size(), 1);
    EXPECT_EQ(link->Items()[0].title, QStringLiteral("Trip"));

    auto renamed = Set({{QStringLiteral("title"), QStringLiteral("Journey")}});
    model->UpdateItem(note, renamed.get(), true);
    EXPECT_EQ(link->Items()[0].title, QStringLiteral("Journey"));
}

TEST_F(NavigatorDataSourceTest, OpeningALinkedDocumentStartsTheViewerOnItsFile) {
    const QString file = WriteFile(QStringLiteral("docs/a b.pdf"), "%PDF");
    const QString document = Add(QStringLiteral("document"), QStringLiteral("root"),
                                 {{QStringLiteral("linked"), kTrue},
                                  {QStringLiteral("path"), file},
                                  {QStringLiteral("subtype"), QStringLiteral("pdf")}});
    WNavDS* model = Load();
    auto open = Set({{kOpen, kTrue}});
    model->UpdateItem(document, open.get(), true);

    ASSERT_EQ(launcher.starts.size(), 1);
    EXPECT_TRUE(launcher.starts[0].program.endsWith(QStringLiteral("/AmbrelViewer")));
    EXPECT_EQ(launcher.starts[0].arguments,
              QStringList({QStringLiteral("/o"), QStringLiteral("/id:") + document}));
}

TEST_F(NavigatorDataSourceTest, LinkingBeyondTheLimitDropsTheLeastRecentlyUsed) {
    const QString oldest =
        Add(QStringLiteral("document"), QStringLiteral("root"),
            {{QStringLiteral("linked"), kTrue}, {QStringLiteral("dateaccessed"), Time(1000)}});
    const QString newer =
        Add(QStringLiteral("document"), QStringLiteral("root"),
            {{QStringLiteral("linked"), kTrue}, {QStringLiteral("dateaccessed"), Time(3000)}});
    const QString deleted = Add(QStringLiteral("document"), QStringLiteral("root"),
                                {{QStringLiteral("linked"), kTrue},
                                 {QStringLiteral("deleted"), kTrue},
                                 {QStringLiteral("dateaccessed"), Time(10)}});
    const QString joining = Add(QStringLiteral("document"), QStringLiteral("root"),
                                {{QStringLiteral("dateaccessed"), Time(500)}});
    NavigatorSettings::Instance()->SetMaxLinkedDocuments(2);
    WNavDS* model = Load();

    // The joining document is itself the oldest: it goes at once, and nothing touches it after.
    auto link = Set({{QStringLiteral("linked"), kTrue}});
    model->UpdateItem(joining, link.get(), false);
    EXPECT_EQ(model->FindItem(joining), nullptr);
    EXPECT_TRUE(CatalogValue(joining, QStringLiteral("type")).isNull());
    ASSERT_NE(model->FindItem(oldest), nullptr);

    auto fresh =
        Set({{QStringLiteral("linked"), kTrue}, {QStringLiteral("dateaccessed"), Time(2000)}});
    const QString third = Add(QStringLiteral("document"), QStringLiteral("root"));
    model->AddItemFromProperties(
        third, Set({{QStringLiteral("type"), QStringLiteral("document")}}).get(), nullptr);
    model->UpdateItem(third, fresh.get(), false);
    EXPECT_EQ(model->FindItem(oldest), nullptr);
    EXPECT_NE(model->FindItem(newer), nullptr);
    EXPECT_NE(model->FindItem(third), nullptr);
    EXPECT_NE(model->FindItem(deleted), nullptr);
}

TEST_F(NavigatorDataSourceTest, ClearTellsTheProgramsThatOpenItemsAreClosed) {
    const QString note = Add(QStringLiteral("note"), QStringLiteral("root"));
    const QString document = Add(QStringLiteral("document"), QStringLiteral("root"));
    WNavDS* model = Load();
    model->FindItem(note)->SetOpen(true);
    model->FindItem(document)->SetOpen(true);

    model->Clear();
    ASSERT_EQ(hub.calls.size(), 2);
    EXPECT_EQ(hub.calls[0].operation, QStringLiteral("UpdateNoteProperties"));
    EXPECT_EQ(hub.calls[1].operation, QStringLiteral("UpdateDocumentProperties"));
    EXPECT_EQ(hub.calls[1].properties, (QMap<QString, QString>{{kOpen, kFalse}}));
    EXPECT_EQ(model->GetNotebook(), nullptr);
    EXPECT_TRUE(model->GetItems().empty());
    // The catalog still holds what it held.
    EXPECT_EQ(CatalogValue(note, kOpen), QString());
}

} // namespace
