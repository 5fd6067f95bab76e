#include "CatalogTestSupport.h"

#include "catalog/XmlDataStore.h"
#include "common/ReleasePtr.h"
#include "dataexchange/CRecursiveChildrenReporter.h"
#include "libs/toolwell/IDataStoreHost.h"

#include <QFileInfo>

#include <memory>
#include <random>
#include <utility>

using Brindle::Data::XmlAccess::XmlDataStore;

namespace {

// Identifiers of hand-edited catalogs need not have the GUID form.
const QString kA = QStringLiteral("A");
const QString kB = QStringLiteral("B");
const QString kC = QStringLiteral("C");
const QString kRoot = QStringLiteral("root");

QStringList Children(const XmlDataStore& store, const QString& id) {
    QStringList children;
    store.GetChildren(id, &children);
    return children;
}

QStringList ElementNames(const pugi::xml_node& parent) {
    QStringList names;
    for (const pugi::xml_node& n : parent.children())
        names.append(QString::fromUtf8(n.name()));
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
        WriteFile(m_catalog.mid(Home().size() + 1), bytes);
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
    EXPECT_TRUE(Children(*store, kRoot).isEmpty());

    // An existing file, whatever it holds, is not replaced by the template.
    WriteCatalog("<archive/>");
    XmlDataStore again(m_catalog, m_host.get());
    EXPECT_TRUE(again.Initialize());
    EXPECT_EQ(ReadBytes(m_catalog), QByteArray("<archive/>"));
}

TEST_F(XmlDataStoreTest, BrokenCatalogsAreRefusedAndNeverWrittenOver) {
    const QByteArray deep =
        QByteArray("<child uuidref=\"x\">").repeated(600) + QByteArray("</child>").repeated(600);
    // Elements one level short of the bound, with text at the bound.
    const QByteArray deepText = QByteArray("<child uuidref=\"x\">").repeated(509) + "x" +
                                QByteArray("</child>").repeated(509);
    const QByteArray good = CatalogText("", "");
    const QList<QByteArray> broken = {
        QByteArray("<archive><items></archive>"), // malformed
        good.left(good.size() / 2),               // truncated
        QByteArray(),                             // empty
        QByteArray("<?xml version=\"1.0\"?>"),    // no document element
        CatalogText(deep.constData(), ""),        // nested beyond the bound
        CatalogText(deepText.constData(), ""),    // its text nested beyond the bound
    };
    for (const QByteArray& content : broken) {
        SCOPED_TRACE(content.left(60).toStdString());
        WriteCatalog(content);
        bool loaded = true;
        auto store = OpenStore(&loaded);
        EXPECT_FALSE(loaded);
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
    const pugi::xml_node items = store->Document().select_node("/archive/items").node();
    EXPECT_STREQ(items.last_child().name(), "note");
    EXPECT_EQ(QString::fromUtf8(items.last_child().attribute("uuid").value()), note);
    EXPECT_EQ(Children(*store, kRoot), (QStringList{folder, note}));
    EXPECT_TRUE(store->CreateItem(QStringLiteral("not a name")).isEmpty());
}

TEST_F(XmlDataStoreTest, PropertiesElementIsMadeOnDemandAndKeepsOrder) {
    WriteCatalog(CatalogText("<child uuidref=\"A\"/>", "<note uuid=\"A\"/>"));
    auto store = OpenStore();
    const pugi::xml_node item = store->FindItem(kA);
    ASSERT_TRUE(item);
    QString value = QStringLiteral("untouched");
    EXPECT_FALSE(store->ReadProperty(kA, QStringLiteral("title"), &value));
    EXPECT_EQ(value, QStringLiteral("untouched"));
    EXPECT_EQ(ElementNames(item), QStringList{QStringLiteral("properties")});

    for (const char* name : {"title", "type", "title"})
        EXPECT_TRUE(
            store->AddProperty(kA, QString::fromUtf8(name), QString::fromUtf8(name) + u'1'));
    EXPECT_TRUE(store->ReadProperty(kA, QStringLiteral("title"), &value));
    EXPECT_EQ(value, QStringLiteral("title1")); // the first of that name

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
    // Into its own subtree, onto itself, the root itself, unknown parents: nothing changes.
    EXPECT_FALSE(store->MoveItem(folder, b, QString()));
    EXPECT_FALSE(store->MoveItem(folder, folder, QString()));
    EXPECT_FALSE(store->MoveItem(kRoot, a, QString()));
    EXPECT_FALSE(store->MoveItem(a, kC, QString()));
    EXPECT_EQ(Children(*store, kRoot), QStringList{folder});
    EXPECT_EQ(Children(*store, folder), QStringList{a});
    EXPECT_EQ(Children(*store, a), QStringList{b});
}

TEST_F(XmlDataStoreTest, MovesCannotNestBeyondWhatALoadAccepts) {
    auto store = OpenStore();
    QString parent = kRoot;
    for (int i = 0; i < XmlDataStore::kMaxEditDepth - 3; ++i) {
        const QString folder = store->CreateItem(QStringLiteral("folder"));
        ASSERT_TRUE(store->MoveItem(folder, parent, QString()));
        parent = folder;
    }
    EXPECT_FALSE(store->MoveItem(store->CreateItem(QStringLiteral("folder")), parent, QString()));
    ASSERT_TRUE(store->Save());
    bool loaded = false;
    OpenStore(&loaded);
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
    QString noteFolder, keepFolder;
    ASSERT_EQ(m_host->GetItemFolder(&noteFolder, note, true), 1);
    ASSERT_EQ(m_host->GetItemFolder(&keepFolder, keep, true), 1);
    WriteFile(QStringLiteral("outside/precious.txt"), "keep me");
    ASSERT_TRUE(
        QFile::link(Home() + QStringLiteral("/outside"), noteFolder + QStringLiteral("/link")));
    WriteFile(noteFolder.mid(Home().size() + 1) + QStringLiteral("/note.htm"), "<html/>");

    EXPECT_FALSE(store->DeleteItem(kRoot));
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

TEST_F(XmlDataStoreTest, HandEditedIdentifiersAreMatchedExactlyAndSafely) {
    WriteCatalog(CatalogText("<child uuidref=\"..\"/><child uuidref=\"it's\"/>"
                             "<child uuidref='say \"hi\"'/>",
                             "<note uuid=\"..\"/><note uuid=\"it's\"/><note uuid='say \"hi\"'/>"));
    auto store = OpenStore();
    EXPECT_TRUE(store->FindItem(QStringLiteral("it's")));
    EXPECT_TRUE(store->FindOrganizationNode(QStringLiteral("say \"hi\"")));
    EXPECT_FALSE(store->FindItem(QStringLiteral("x' or '1'='1")));
    EXPECT_FALSE(store->FindItem(QStringLiteral("IT'S")));

    // Deleting the item named "..": no folder outside the store may go with it.
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
    const QString copyFolder = m_folder + u'/' + copy;
    EXPECT_EQ(store->FindDocumentByPath(copyFolder + QStringLiteral("/Report.doc")), copy);
    EXPECT_TRUE(store->FindDocumentByPath(copyFolder + QStringLiteral("/report.doc")).isEmpty());
}

// Only an item's first reference places it: a later one, even one inside the item itself,
// is passed over by the walks, so deleting what holds it never takes the item away.
TEST_F(XmlDataStoreTest, RepeatedReferencesAreWalkedOnceAndNeverDeleteTheItem) {
    const QString kD = QStringLiteral("D");
    WriteCatalog(CatalogText("<child uuidref=\"A\"><child uuidref=\"B\"><child uuidref=\"A\"/>"
                             "</child></child><child uuidref=\"C\"><child uuidref=\"C\"/></child>"
                             "<child uuidref=\"D\"><child uuidref=\"C\"/></child>",
                             "<folder uuid=\"A\"/><folder uuid=\"B\"/><folder uuid=\"C\"/>"
                             "<folder uuid=\"D\"/>"));
    auto store = OpenStore();
    CRecursiveChildrenReporter all;
    EXPECT_EQ(store->ReportDescendants(kRoot, &all), 4);
    EXPECT_EQ(all.Items(), (QStringList{kA, kB, kC, kD}));

    EXPECT_TRUE(store->DeleteItem(kB));
    EXPECT_TRUE(store->DeleteItem(kD));
    EXPECT_TRUE(store->FindItem(kA));
    EXPECT_TRUE(store->FindItem(kC));
    EXPECT_EQ(Children(*store, kRoot), (QStringList{kA, kC}));
    EXPECT_TRUE(Children(*store, kA).isEmpty());
}

TEST_F(XmlDataStoreTest, SavedCatalogIsUtf16AndKeepsEveryCharacter) {
    WriteCatalog(CatalogText("", "")); // read as UTF-8, written back as UTF-16
    auto store = OpenStore();
    const QString id = store->CreateItem(QStringLiteral("note"));
    const QList<std::pair<QString, QString>> values = {
        {QStringLiteral("title"),
         QStringLiteral("Ærø & <Zürich> \"quoted\" 'single' \u6F22\u5B57 \U0001F600")},
        {QStringLiteral("blank"), QStringLiteral("   ")},
        {QStringLiteral("empty"), QStringLiteral("")},
        {QStringLiteral("r\u00E9sum\u00E9"), QStringLiteral("x")}};
    for (const auto& [name, value] : values)
        ASSERT_TRUE(store->AddProperty(id, name, value));
    ASSERT_TRUE(store->Save());

    const QByteArray bytes = ReadBytes(m_catalog);
    ASSERT_TRUE(bytes.startsWith("\xFF\xFE<\0?\0x\0m\0l\0"));
    const QString text = QString::fromUtf16(
        reinterpret_cast<const char16_t*>(bytes.constData() + 2), (bytes.size() - 2) / 2);
    EXPECT_TRUE(text.startsWith(QStringLiteral("<?xml version=\"1.0\" encoding=\"UTF-16\"?>")));
    EXPECT_TRUE(text.contains(u'\n')); // readable, one element a line

    bool loaded = false;
    auto reloaded = OpenStore(&loaded);
    ASSERT_TRUE(loaded);
    for (const auto& [name, value] : values) {
        QString read;
        EXPECT_TRUE(reloaded->ReadProperty(id, name, &read));
        EXPECT_EQ(read, value);
    }
}

TEST_F(XmlDataStoreTest, BytesThatAreNotUtf8ReadAsTheyWillBeWritten) {
    // A damaged element name beside the reference, and a damaged title.
    WriteCatalog(CatalogText("<c\xC8\xC8hild uuidref=\"A\"/><child uuidref=\"B\"/>",
                             "<note uuid=\"A\"/><note uuid=\"B\"><properties>"
                             "<title>caf\xE9</title></properties></note>"));
    auto store = OpenStore();
    const QStringList before = Children(*store, kRoot);
    QString title;
    ASSERT_TRUE(store->ReadProperty(kB, QStringLiteral("title"), &title));
    EXPECT_EQ(title, QStringLiteral("caf\uFFFD"));
    ASSERT_TRUE(store->Save());

    auto reloaded = OpenStore();
    EXPECT_EQ(Children(*reloaded, kRoot), before);
    ASSERT_TRUE(reloaded->ReadProperty(kB, QStringLiteral("title"), &title));
    EXPECT_EQ(title, QStringLiteral("caf\uFFFD"));
}

TEST_F(XmlDataStoreTest, LargeUtf16CatalogReadsBackEveryCharacter) {
    // The file is read a mebibyte at a time: a surrogate pair is put across the first boundary.
    const QString head = QString::fromUtf8(CatalogText("<child uuidref=\"A\"/>", ""))
                             .chopped(18) + // "</items></archive>"
                         QStringLiteral("<note uuid=\"A\"><properties><title>");
    const qsizetype lead = (1 << 19) - 1; // the unit that ends the first piece
    const QString title =
        QString(lead - head.size(), u'x') + QStringLiteral("\U0001F600\u00E9 end");
    const QString text =
        head + title + QStringLiteral("</title></properties></note></items></archive>");
    QByteArray bytes("\xFF\xFE");
    for (const QChar c : text) {
        bytes.append(static_cast<char>(c.unicode() & 0xFF));
        bytes.append(static_cast<char>(c.unicode() >> 8));
    }
    WriteCatalog(bytes);
    bool loaded = false;
    auto store = OpenStore(&loaded);
    ASSERT_TRUE(loaded);
    QString read;
    EXPECT_TRUE(store->ReadProperty(kA, QStringLiteral("title"), &read));
    EXPECT_EQ(read.right(8), title.right(8));
    EXPECT_EQ(read.size(), title.size());
    EXPECT_EQ(Children(*store, kRoot), QStringList{kA});
}

// The indexes must answer exactly what the catalog's XPath queries answer, whatever sequence
// of edits came before, on a hand-edited file with duplicates and a reference to A inside A.
TEST_F(XmlDataStoreTest, IndexesAnswerAsTheXPathQueriesAfterRandomEdits) {
    WriteCatalog(
        CatalogText("<child uuidref=\"A\"><child uuidref=\"B\"/><child uuidref=\"A\"/>"
                    "</child><child/><child uuidref=\"B\"/><child uuidref=\"C\" uuid=\"A\"/>",
                    "<folder uuid=\"A\"/><note uuid=\"B\"/><note uuid=\"B\"/><note uuid=\"C\"/>"));
    auto store = OpenStore();
    EXPECT_EQ(Children(*store, kRoot), (QStringList{kA, kB, kC}));
    CRecursiveChildrenReporter reporter; // each item once, despite A below A
    EXPECT_EQ(store->ReportDescendants(kRoot, &reporter), 3);
    EXPECT_EQ(reporter.Items(), (QStringList{kA, kB, kC}));

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
        SCOPED_TRACE(id.toStdString());
        const pugi::xml_node items = store->Document().select_node("/archive/items").node();
        ASSERT_EQ(store->FindItem(id), itemQuery.evaluate_node(items).node());
        ASSERT_EQ(store->FindOrganizationNode(id), nodeQuery.evaluate_node(items).node());
    };

    for (int step = 0; step < 3000; ++step) {
        const unsigned operation = random() % 10;
        const QString id = pick(ids);
        if (operation < 3 || ids.size() < 8) {
            ids.append(store->CreateItem(random() % 2 ? QStringLiteral("note")
                                                      : QStringLiteral("folder")));
            ASSERT_FALSE(ids.last().isEmpty());
        } else if (operation < 8) {
            const QString parent = random() % 4 == 0 ? kRoot : pick(ids);
            store->MoveItem(id, parent, random() % 3 == 0 ? QString() : pick(ids));
        } else if (operation < 9) {
            store->DeleteItem(id);
            if (!store->FindItem(id) && !store->FindOrganizationNode(id))
                ids.removeOne(id);
        } else {
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
