#include "CatalogTestSupport.h"

#include "catalog/XmlDataStore.h"
#include "common/ReleasePtr.h"
#include "dataexchange/CRecursiveChildrenReporter.h"
#include "libs/toolwell/IDataStoreHost.h"

#include <QDir>
#include <QFileInfo>

#include <memory>
#include <random>

using Brindle::Data::XmlAccess::XmlDataStore;

namespace {

const QString kA = QStringLiteral("AAAAAAAA-0000-0000-0000-000000000001");
const QString kB = QStringLiteral("BBBBBBBB-0000-0000-0000-000000000002");
const QString kC = QStringLiteral("CCCCCCCC-0000-0000-0000-000000000003");
const QString kRoot = QStringLiteral("root");

QString Text(const char* value) {
    return QString::fromUtf8(value);
}

QStringList Children(const XmlDataStore& store, const QString& id) {
    QStringList children;
    store.GetChildren(id, &children);
    return children;
}

QStringList ElementNames(const pugi::xml_node& parent) {
    QStringList names;
    for (const pugi::xml_node& n : parent.children())
        names.append(Text(n.name()));
    return names;
}

class XmlDataStoreTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        m_host.reset(GetDataStoreHost());
        m_host->GetStoreFolder(&m_folder, nullptr);
        m_host->GetCatalogPath(&m_catalog, nullptr);
    }

    std::unique_ptr<XmlDataStore> OpenStore(bool* loaded = nullptr) {
        auto store = std::make_unique<XmlDataStore>(m_catalog, m_host.get());
        EXPECT_TRUE(store->Initialize());
        const bool ok = store->Load();
        if (loaded != nullptr)
            *loaded = ok;
        return store;
    }

    void WriteCatalog(const QByteArray& bytes) {
        QDir().mkpath(m_folder);
        QFile file(m_catalog);
        ASSERT_TRUE(file.open(QIODevice::WriteOnly | QIODevice::Truncate));
        ASSERT_EQ(file.write(bytes), bytes.size());
    }

    ReleasePtr<IDataStoreHost> m_host;
    QString m_folder;
    QString m_catalog;
};

TEST_F(XmlDataStoreTest, MissingCatalogIsCreatedFromTheTemplateAndLoadsEmpty) {
    bool loaded = false;
    auto store = OpenStore(&loaded);
    ASSERT_TRUE(loaded);
    EXPECT_EQ(ReadBytes(m_catalog), ExpectedEmptyArchive());
    EXPECT_EQ(ReadBytes(m_catalog).size(), 388);
    EXPECT_TRUE(Children(*store, kRoot).isEmpty());
    EXPECT_FALSE(store->Document().select_node("/archive/items/*"));

    // An existing file, whatever it holds, is not replaced by the template.
    WriteCatalog("<archive/>");
    XmlDataStore again(m_catalog, m_host.get());
    EXPECT_TRUE(again.Initialize());
    EXPECT_EQ(ReadBytes(m_catalog), QByteArray("<archive/>"));
}

TEST_F(XmlDataStoreTest, BrokenCatalogsAreRefusedAndNeverWrittenOver) {
    QByteArray deep;
    for (int i = 0; i < 600; ++i)
        deep += "<child uuidref=\"x\">";
    for (int i = 0; i < 600; ++i)
        deep += "</child>";
    const QByteArray good = CatalogText("", "");
    const QList<QByteArray> broken = {
        QByteArray("<archive><items></archive>"), // malformed
        good.left(good.size() / 2),               // truncated
        QByteArray(),                             // empty
        QByteArray("<?xml version=\"1.0\"?>"),    // no document element
        CatalogText(deep.constData(), ""),        // nested beyond the bound
    };
    for (const QByteArray& content : broken) {
        SCOPED_TRACE(content.left(60).toStdString());
        WriteCatalog(content);
        bool loaded = true;
        auto store = OpenStore(&loaded);
        EXPECT_FALSE(loaded);
        EXPECT_TRUE(store->IsOpen());
        EXPECT_TRUE(store->CreateItem(QStringLiteral("note")).isEmpty());
        EXPECT_FALSE(store->FindOrganizationNode(kRoot));
        EXPECT_FALSE(store->Save());
        EXPECT_EQ(ReadBytes(m_catalog), content);
    }
}

TEST_F(XmlDataStoreTest, CreatedItemsGetIdentifierElementAndReferenceAtTheEnd) {
    auto store = OpenStore();
    const QString folder = store->CreateItem(QStringLiteral("folder"));
    const QString note = store->CreateItem(QStringLiteral("note"));
    ASSERT_EQ(note.size(), 36);
    EXPECT_EQ(note, note.toUpper());
    EXPECT_NE(note, folder);

    const pugi::xml_node items = store->Document().select_node("/archive/items").node();
    EXPECT_STREQ(items.last_child().name(), "note");
    EXPECT_EQ(Text(items.last_child().attribute("uuid").value()), note);
    EXPECT_EQ(store->FindItem(note), items.last_child());
    EXPECT_EQ(Children(*store, kRoot), (QStringList{folder, note}));
    EXPECT_TRUE(store->CreateItem(QStringLiteral("not a name")).isEmpty());
}

TEST_F(XmlDataStoreTest, PropertiesElementIsMadeOnDemandAndKeepsOrder) {
    WriteCatalog(CatalogText("<child uuidref=\"AAAAAAAA-0000-0000-0000-000000000001\"/>",
                             "<note uuid=\"AAAAAAAA-0000-0000-0000-000000000001\"/>"));
    auto store = OpenStore();
    const pugi::xml_node item = store->FindItem(kA);
    ASSERT_TRUE(item);
    QString value = QStringLiteral("untouched");
    EXPECT_FALSE(store->ReadProperty(kA, QStringLiteral("title"), &value));
    EXPECT_EQ(value, QStringLiteral("untouched"));
    EXPECT_EQ(ElementNames(item), QStringList{QStringLiteral("properties")});

    EXPECT_TRUE(store->AddProperty(kA, QStringLiteral("title"), QStringLiteral("one")));
    EXPECT_TRUE(store->AddProperty(kA, QStringLiteral("type"), QStringLiteral("note")));
    EXPECT_TRUE(store->AddProperty(kA, QStringLiteral("title"), QStringLiteral("two")));
    EXPECT_TRUE(store->ReadProperty(kA, QStringLiteral("title"), &value));
    EXPECT_EQ(value, QStringLiteral("one")); // the first of that name

    EXPECT_TRUE(store->RemoveProperty(kA, QStringLiteral("title")));
    EXPECT_FALSE(store->RemoveProperty(kA, QStringLiteral("missing")));
    EXPECT_EQ(ElementNames(item.child("properties")),
              (QStringList{QStringLiteral("type"), QStringLiteral("title")}));

    // Names that would make the file unreadable are refused.
    for (const QString& bad : {QStringLiteral(""), QStringLiteral("two words"),
                               QStringLiteral("1st"), QStringLiteral("a<b")})
        EXPECT_FALSE(store->AddProperty(kA, bad, QStringLiteral("x"))) << bad.toStdString();

    store->ClearProperties(kA);
    EXPECT_EQ(ElementNames(item), QStringList{QStringLiteral("properties")});
    EXPECT_FALSE(item.child("properties").first_child());

    EXPECT_FALSE(store->AddProperty(kB, QStringLiteral("title"), QStringLiteral("x")));
    EXPECT_FALSE(store->GetPropertiesNode(kB));
}

TEST_F(XmlDataStoreTest, MovesChangeOnlyTheOrganizationTree) {
    auto store = OpenStore();
    const QString folder = store->CreateItem(QStringLiteral("folder"));
    const QString a = store->CreateItem(QStringLiteral("note"));
    const QString b = store->CreateItem(QStringLiteral("note"));
    const pugi::xml_node items = store->Document().select_node("/archive/items").node();
    const QStringList itemOrder = ElementNames(items);

    EXPECT_TRUE(store->MoveItem(b, kRoot, folder));
    EXPECT_EQ(Children(*store, kRoot), (QStringList{b, folder, a}));
    EXPECT_EQ(ElementNames(items), itemOrder);

    // An unknown sibling puts the item last.
    EXPECT_TRUE(store->MoveItem(b, kRoot, kC));
    EXPECT_EQ(Children(*store, kRoot), (QStringList{folder, a, b}));

    EXPECT_TRUE(store->MoveItem(a, folder, QString()));
    EXPECT_TRUE(store->MoveItem(b, a, QString()));
    EXPECT_EQ(Children(*store, folder), QStringList{a});

    // Into its own subtree, onto itself, the root itself, unknown parents: nothing changes.
    EXPECT_FALSE(store->MoveItem(folder, b, QString()));
    EXPECT_FALSE(store->MoveItem(folder, folder, QString()));
    EXPECT_FALSE(store->MoveItem(kRoot, a, QString()));
    EXPECT_FALSE(store->MoveItem(a, kC, QString()));
    EXPECT_EQ(Children(*store, kRoot), QStringList{folder});
    EXPECT_EQ(Children(*store, a), QStringList{b});
    EXPECT_EQ(store->FindOrganizationNode(b).parent(), store->FindOrganizationNode(a));
}

TEST_F(XmlDataStoreTest, MovesCannotNestBeyondWhatALoadAccepts) {
    auto store = OpenStore();
    QString parent = kRoot;
    for (int i = 0; i < XmlDataStore::kMaxEditDepth - 3; ++i) {
        const QString folder = store->CreateItem(QStringLiteral("folder"));
        ASSERT_TRUE(store->MoveItem(folder, parent, QString()));
        parent = folder;
    }
    const QString last = store->CreateItem(QStringLiteral("folder"));
    EXPECT_FALSE(store->MoveItem(last, parent, QString()));
    ASSERT_TRUE(store->Save());
    bool loaded = false;
    auto reloaded = OpenStore(&loaded);
    EXPECT_TRUE(loaded);
}

TEST_F(XmlDataStoreTest, DeletingAFolderRemovesDescendantsAndTheirFolders) {
    auto store = OpenStore();
    const QString folder = store->CreateItem(QStringLiteral("folder"));
    const QString inner = store->CreateItem(QStringLiteral("folder"));
    const QString note = store->CreateItem(QStringLiteral("note"));
    const QString keep = store->CreateItem(QStringLiteral("note"));
    ASSERT_TRUE(store->MoveItem(inner, folder, QString()));
    ASSERT_TRUE(store->MoveItem(note, inner, QString()));
    QString noteFolder;
    QString keepFolder;
    ASSERT_EQ(m_host->GetItemFolder(&noteFolder, note, true), 1);
    ASSERT_EQ(m_host->GetItemFolder(&keepFolder, keep, true), 1);
    WriteFile(QStringLiteral("outside/precious.txt"), "keep me");
    ASSERT_TRUE(
        QFile::link(Home() + QStringLiteral("/outside"), noteFolder + QStringLiteral("/link")));
    WriteFile(noteFolder.mid(Home().size() + 1) + QStringLiteral("/note.htm"), "<html/>");

    EXPECT_FALSE(store->DeleteItem(kRoot));
    EXPECT_EQ(Children(*store, kRoot).size(), 2);

    EXPECT_TRUE(store->DeleteItem(folder));
    for (const QString& gone : {folder, inner, note}) {
        EXPECT_FALSE(store->FindItem(gone));
        EXPECT_FALSE(store->FindOrganizationNode(gone));
    }
    EXPECT_EQ(Children(*store, kRoot), QStringList{keep});
    EXPECT_FALSE(QFileInfo::exists(noteFolder));
    EXPECT_TRUE(QFileInfo::exists(keepFolder));
    EXPECT_EQ(ReadBytes(Home() + QStringLiteral("/outside/precious.txt")), QByteArray("keep me"));
}

TEST_F(XmlDataStoreTest, DeletingNeverLeavesTheStoreForOddIdentifiers) {
    // A hand-edited catalog naming an item "..": its deletion must not touch the data folder.
    WriteCatalog(CatalogText("<child uuidref=\"..\"/>", "<note uuid=\"..\"/>"));
    auto store = OpenStore();
    WriteFile(QStringLiteral("data/Brindle/Quillmark Ambrel/NavSettings.dat"), "settings");
    EXPECT_TRUE(store->DeleteItem(QStringLiteral("..")));
    EXPECT_FALSE(store->FindItem(QStringLiteral("..")));
    EXPECT_TRUE(QFileInfo::exists(AppDataFolder() + QStringLiteral("/NavSettings.dat")));
    EXPECT_TRUE(QFileInfo::exists(m_catalog));
}

TEST_F(XmlDataStoreTest, DocumentsAreFoundByPathOrByTheirItemFolder) {
    auto store = OpenStore();
    const QString linked = store->CreateItem(QStringLiteral("document"));
    const QString quoted = Home() + QStringLiteral("/it's a \"quoted\" file.pdf");
    ASSERT_TRUE(store->AddProperty(linked, QStringLiteral("path"), quoted));
    EXPECT_EQ(store->FindDocumentByPath(quoted), linked);
    EXPECT_TRUE(store->FindDocumentByPath(quoted + QStringLiteral("x")).isEmpty());
    EXPECT_TRUE(store->FindDocumentByPath(QStringLiteral("' or '1'='1")).isEmpty());

    // A stored copy has an empty path and lives in the folder named after its identifier.
    const QString copy = store->CreateItem(QStringLiteral("document"));
    ASSERT_TRUE(store->AddProperty(copy, QStringLiteral("path"), QStringLiteral("")));
    ASSERT_TRUE(store->AddProperty(copy, QStringLiteral("filename"), QStringLiteral("Report.doc")));
    EXPECT_EQ(store->FindDocumentByPath(m_folder + u'/' + copy + QStringLiteral("/Report.doc")),
              copy);
    EXPECT_TRUE(store->FindDocumentByPath(m_folder + u'/' + copy + QStringLiteral("/report.doc"))
                    .isEmpty());
    EXPECT_TRUE(store->FindDocumentByPath(QStringLiteral("")).isEmpty());
}

TEST_F(XmlDataStoreTest, IdentifiersWithQuotesAreFoundAndCannotChangeTheQuery) {
    const char* organization = "<child uuidref=\"it's\"/><child uuidref='say \"hi\"'/>";
    const char* items = "<note uuid=\"it's\"/><note uuid='say \"hi\"'/>";
    WriteCatalog(CatalogText(organization, items));
    auto store = OpenStore();
    EXPECT_TRUE(store->FindItem(QStringLiteral("it's")));
    EXPECT_TRUE(store->FindOrganizationNode(QStringLiteral("say \"hi\"")));
    EXPECT_FALSE(store->FindItem(QStringLiteral("x' or '1'='1")));
    EXPECT_FALSE(store->FindItem(QStringLiteral("IT'S"))); // exact comparison
}

TEST_F(XmlDataStoreTest, SavedCatalogIsUtf16AndKeepsEveryCharacter) {
    WriteCatalog(CatalogText("", "")); // read as UTF-8, written back as UTF-16
    auto store = OpenStore();
    const QString id = store->CreateItem(QStringLiteral("note"));
    const QString title =
        QStringLiteral("Ærø & <Zürich> \"quoted\" 'single' \u6F22\u5B57 \U0001F600");
    ASSERT_TRUE(store->AddProperty(id, QStringLiteral("title"), title));
    ASSERT_TRUE(store->AddProperty(id, QStringLiteral("blank"), QStringLiteral("   ")));
    ASSERT_TRUE(store->AddProperty(id, QStringLiteral("empty"), QStringLiteral("")));
    ASSERT_TRUE(store->AddProperty(id, QStringLiteral("r\u00E9sum\u00E9"), QStringLiteral("x")));
    ASSERT_TRUE(store->Save());

    const QByteArray bytes = ReadBytes(m_catalog);
    ASSERT_TRUE(bytes.startsWith("\xFF\xFE<\0?\0x\0m\0l\0"));
    const QString text = QString::fromUtf16(
        reinterpret_cast<const char16_t*>(bytes.constData() + 2), (bytes.size() - 2) / 2);
    EXPECT_TRUE(text.startsWith(QStringLiteral("<?xml version=\"1.0\" encoding=\"UTF-16\"?>")));
    EXPECT_TRUE(text.contains(QStringLiteral("\n"))); // readable, one element a line

    bool loaded = false;
    auto reloaded = OpenStore(&loaded);
    ASSERT_TRUE(loaded);
    QString value;
    ASSERT_TRUE(reloaded->ReadProperty(id, QStringLiteral("title"), &value));
    EXPECT_EQ(value, title);
    ASSERT_TRUE(reloaded->ReadProperty(id, QStringLiteral("blank"), &value));
    EXPECT_EQ(value, QStringLiteral("   "));
    ASSERT_TRUE(reloaded->ReadProperty(id, QStringLiteral("empty"), &value));
    EXPECT_EQ(value, QStringLiteral(""));
    ASSERT_TRUE(reloaded->ReadProperty(id, QStringLiteral("r\u00E9sum\u00E9"), &value));
    EXPECT_EQ(value, QStringLiteral("x"));
    EXPECT_EQ(Children(*reloaded, kRoot), QStringList{id});
}

TEST_F(XmlDataStoreTest, DuplicateReferencesResolveToTheFirstAndWalksEnd) {
    // A hand-edited file: A refers to itself below itself, and A is listed twice.
    WriteCatalog(CatalogText("<child uuidref=\"AAAAAAAA-0000-0000-0000-000000000001\">"
                             "<child uuidref=\"BBBBBBBB-0000-0000-0000-000000000002\"/>"
                             "<child uuidref=\"AAAAAAAA-0000-0000-0000-000000000001\"/></child>"
                             "<child/>"
                             "<child uuidref=\"AAAAAAAA-0000-0000-0000-000000000001\"/>",
                             "<note uuid=\"AAAAAAAA-0000-0000-0000-000000000001\"/>"
                             "<note uuid=\"BBBBBBBB-0000-0000-0000-000000000002\"/>"));
    auto store = OpenStore();
    const pugi::xml_node root = store->FindOrganizationNode(kRoot);
    EXPECT_EQ(store->FindOrganizationNode(kA), root.first_child());
    EXPECT_EQ(Children(*store, kRoot), (QStringList{kA, kA}));

    CRecursiveChildrenReporter reporter;
    EXPECT_EQ(store->ReportDescendants(kRoot, &reporter), 4);
    EXPECT_EQ(reporter.Items(), (QStringList{kA, kB, kA, kA}));

    // Moving the first reference to the end makes the other one the answer.
    ASSERT_TRUE(store->MoveItem(kA, kRoot, QString()));
    EXPECT_EQ(store->FindOrganizationNode(kA), root.first_child().next_sibling());
    EXPECT_FALSE(store->FindOrganizationNode(kA).first_child());
    EXPECT_TRUE(store->DeleteItem(kA));
    EXPECT_FALSE(store->FindItem(kA));
}

// The indexes must answer exactly what the catalog's XPath queries answer, whatever sequence
// of edits came before, duplicates included.
TEST_F(XmlDataStoreTest, IndexesAnswerAsTheXPathQueriesAfterRandomEdits) {
    WriteCatalog(CatalogText("<child uuidref=\"AAAAAAAA-0000-0000-0000-000000000001\">"
                             "<child uuidref=\"BBBBBBBB-0000-0000-0000-000000000002\"/></child>"
                             "<child uuidref=\"BBBBBBBB-0000-0000-0000-000000000002\"/>"
                             "<child uuidref=\"CCCCCCCC-0000-0000-0000-000000000003\" "
                             "uuid=\"AAAAAAAA-0000-0000-0000-000000000001\"/>",
                             "<folder uuid=\"AAAAAAAA-0000-0000-0000-000000000001\"/>"
                             "<note uuid=\"BBBBBBBB-0000-0000-0000-000000000002\"/>"
                             "<note uuid=\"BBBBBBBB-0000-0000-0000-000000000002\"/>"
                             "<note uuid=\"CCCCCCCC-0000-0000-0000-000000000003\"/>"));
    auto store = OpenStore();
    pugi::xpath_variable_set variables;
    variables.add("id", pugi::xpath_type_string);
    const pugi::xpath_query itemQuery("//*[@uuid=$id]", &variables);
    const pugi::xpath_query nodeQuery("//child[@uuidref=$id]", &variables);

    QStringList ids{kA, kB, kC, QStringLiteral("missing")};
    std::mt19937 random(20240611);
    const auto pick = [&](const QStringList& from) {
        return from.at(static_cast<qsizetype>(random() % static_cast<unsigned>(from.size())));
    };
    const auto verify = [&](const QString& id) {
        variables.set("id", id.toUtf8().constData());
        const pugi::xml_node items = store->Document().select_node("/archive/items").node();
        ASSERT_EQ(store->FindItem(id), itemQuery.evaluate_node(items).node()) << id.toStdString();
        ASSERT_EQ(store->FindOrganizationNode(id), nodeQuery.evaluate_node(items).node())
            << id.toStdString();
    };

    for (int step = 0; step < 3000; ++step) {
        const unsigned operation = random() % 10;
        if (operation < 3 || ids.size() < 8) {
            const QString id =
                store->CreateItem(random() % 2 ? QStringLiteral("note") : QStringLiteral("folder"));
            ASSERT_FALSE(id.isEmpty());
            ids.append(id);
        } else if (operation < 8) {
            const QString parent = random() % 4 == 0 ? kRoot : pick(ids);
            const QString before = random() % 3 == 0 ? QString() : pick(ids);
            store->MoveItem(pick(ids), parent, before);
        } else if (operation < 9) {
            const QString id = pick(ids);
            store->DeleteItem(id);
            if (!store->FindItem(id) && !store->FindOrganizationNode(id))
                ids.removeOne(id);
        } else {
            const QString id = pick(ids);
            store->AddProperty(id, QStringLiteral("title"), QStringLiteral("t"));
            store->ClearProperties(id);
        }
        for (int i = 0; i < 12; ++i)
            verify(pick(ids));
    }
    for (const QString& id : ids)
        verify(id);
}

} // namespace
