#include "CatalogTestSupport.h"

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "dataexchange/CBasicStringIDReporter.h"
#include "dataexchange/CRecursiveChildrenReporter.h"
#include "dataexchange/WProperties.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "support/FileSizeLimit.h"
#include "support/FileWatch.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QRegularExpression>

#include <functional>
#include <initializer_list>
#include <utility>

namespace {

using DataExchange::IProperties;
using Creator = HRESULT (IDataStoreService::*)(IProperties*, IUnicodeString*);
const QString kRoot = QStringLiteral("root");

ReleasePtr<IProperties>
Properties(std::initializer_list<std::pair<const char*, const char*>> pairs) {
    ReleasePtr<IProperties> properties(DataExchange::CreateProperties());
    for (const auto& [name, value] : pairs)
        properties->SetProperty(QString::fromUtf8(name), QString::fromUtf8(value));
    return properties;
}

class DataStoreServiceTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        m_host.reset(GetDataStoreHost());
        m_host->GetCatalogPath(&m_catalog, nullptr);
    }

    IDataStoreService* Service() {
        IDataStoreService* service = GetDataStoreService();
        return service != nullptr ? service : CreateDataStoreService(m_host.get());
    }

    QString Create(Creator create, IProperties* properties = nullptr) {
        QString id;
        UnicodeStringPtr sink(&id);
        EXPECT_EQ((Service()->*create)(properties, &sink), S_OK);
        return id;
    }
    QString Note(const char* title) {
        return Create(&IDataStoreService::CreateNote, Properties({{"title", title}}).get());
    }
    QString Folder() { return Create(&IDataStoreService::CreateFolder); }

    QString Property(const QString& id, const QString& name) {
        ReleasePtr<IProperties> properties(DataExchange::CreateProperties());
        Service()->GetProperties(id, properties.get());
        QString value;
        UnicodeStringPtr sink(&value);
        properties->GetProperty(name, &sink);
        return value;
    }

    // Saves, then answers the property names of the only item in the order the file holds them.
    QString SavedPropertyOrder() {
        EXPECT_EQ(Service()->Save(), S_OK);
        const QByteArray bytes = ReadBytes(m_catalog).mid(2);
        const QString text =
            QString::fromUtf16(reinterpret_cast<const char16_t*>(bytes.data()), bytes.size() / 2);
        QStringList names;
        for (const auto& match :
             QRegularExpression(QStringLiteral("<(\\w+)>[^<]*</\\1>")).globalMatch(text))
            names.append(match.captured(1));
        return names.join(u' ');
    }

    ReleasePtr<IDataStoreHost> m_host;
    QString m_catalog;
};

// A navigator killed between writing its new catalog under a temporary name and renaming it
// leaves that file behind; the next start removes it, and nothing else.
TEST_F(DataStoreServiceTest, OpeningRemovesTheNewCatalogThatAKilledSaveLeft) {
    const QString folder = QFileInfo(m_catalog).absolutePath();
    ASSERT_TRUE(QDir().mkpath(folder));
    const QStringList left{QStringLiteral("catalog.xml.Tx4yFV")};
    const QStringList kept{QStringLiteral("catalog.xml.bak"), QStringLiteral("other.xml.Tx4yFV"),
                           QStringLiteral("catalog.xml.Tx4yFV2")};
    for (const QString& name : left + kept) {
        QFile file(folder + u'/' + name);
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
    }
    ASSERT_NE(Service(), nullptr);
    for (const QString& name : left)
        EXPECT_FALSE(QFile::exists(folder + u'/' + name)) << name.toStdString();
    for (const QString& name : kept)
        EXPECT_TRUE(QFile::exists(folder + u'/' + name)) << name.toStdString();
}

TEST_F(DataStoreServiceTest, ServiceIsCreatedOnceAndShutdownSaves) {
    EXPECT_EQ(CreateDataStoreService(nullptr), nullptr);
    IDataStoreService* service = CreateDataStoreService(m_host.get());
    ASSERT_NE(service, nullptr);
    EXPECT_EQ(CreateDataStoreService(m_host.get()), service);

    const QString id = Note("kept");
    service->Shutdown(1);
    EXPECT_EQ(GetDataStoreService(), nullptr);
    EXPECT_EQ(Property(id, QStringLiteral("title")), QStringLiteral("kept"));
}

TEST_F(DataStoreServiceTest, CreationFillsPropertiesAndMakesOnlyNoteFolders) {
    EXPECT_EQ(Service()->CreateNote(nullptr, nullptr), E_FAIL);
    const QString note = Note("N");
    const QString folder = Folder();
    const QString document =
        Create(&IDataStoreService::CreateDocument, Properties({{"title", "D"}}).get());
    QString itemFolder;
    EXPECT_EQ(m_host->GetItemFolder(&itemFolder, note, false), 1);
    EXPECT_EQ(m_host->GetItemFolder(&itemFolder, folder, false), 0);
    EXPECT_EQ(m_host->GetItemFolder(&itemFolder, document, false), 0);
    EXPECT_EQ(Property(note, QStringLiteral("title")), QStringLiteral("N"));

    ReleasePtr<IProperties> empty(DataExchange::CreateProperties());
    EXPECT_EQ(Service()->GetProperties(folder, empty.get()), E_FAIL); // no properties at all

    DataExchange::CBasicStringIDReporter children;
    EXPECT_EQ(Service()->ReportChildren(kRoot, &children), S_OK);
    EXPECT_EQ(children.StringIDs(), (QStringList{note, folder, document}));
}

TEST_F(DataStoreServiceTest, LinkingTheSamePathTwiceHandsOutTheFirstDocument) {
    const Creator document = &IDataStoreService::CreateDocument;
    const auto linked = Properties({{"path", "/home/user/it's.pdf"}, {"linked", "true"}});
    const QString first = Create(document, linked.get());
    EXPECT_EQ(Create(document, linked.get()), first);
    // Stored copies have an empty path; they are distinct documents.
    const auto copy = Properties({{"path", ""}, {"filename", "a.pdf"}});
    EXPECT_NE(Create(document, copy.get()), Create(document, copy.get()));
    DataExchange::CBasicStringIDReporter children;
    Service()->ReportChildren(kRoot, &children);
    EXPECT_EQ(children.StringIDs().size(), 3);
}

TEST_F(DataStoreServiceTest, SetReplacesAllPropertiesAndUpdateReplacesNamedOnes) {
    const QString id =
        Create(&IDataStoreService::CreateNote,
               Properties({{"title", "Old"}, {"type", "note"}, {"size", "5,4"}}).get());
    EXPECT_EQ(SavedPropertyOrder(), QStringLiteral("size title type"));

    EXPECT_EQ(Service()->UpdateProperties(id, Properties({{"title", "New"}}).get()), S_OK);
    EXPECT_EQ(SavedPropertyOrder(), QStringLiteral("size type title"));
    EXPECT_EQ(Property(id, QStringLiteral("title")), QStringLiteral("New"));

    EXPECT_EQ(Service()->SetProperties(id, Properties({}).get()), S_FALSE);
    EXPECT_EQ(Property(id, QStringLiteral("size")), QStringLiteral("5,4"));
    EXPECT_EQ(Service()->SetProperties(id, Properties({{"open", "true"}}).get()), S_OK);
    EXPECT_EQ(SavedPropertyOrder(), QStringLiteral("open"));

    EXPECT_EQ(Service()->SetProperties(id, Properties({{"bad name", "x"}}).get()), E_FAIL);
    EXPECT_EQ(
        Service()->UpdateProperties(QStringLiteral("missing"), Properties({{"a", "x"}}).get()),
        E_FAIL);
}

TEST_F(DataStoreServiceTest, ChildrenAndDescendantsOfFolders) {
    const QString outer = Folder();
    const QString inner = Folder();
    const QString note = Note("n");
    const QString empty = Folder();
    ASSERT_EQ(Service()->MoveItem(inner, outer), S_OK);
    ASSERT_EQ(Service()->MoveItem(note, inner), S_OK);
    ASSERT_EQ(Service()->MoveItemBefore(empty, outer, inner), S_OK);

    DataExchange::CBasicStringIDReporter children;
    EXPECT_EQ(Service()->ReportChildren(empty, &children), E_FAIL);
    CRecursiveChildrenReporter descendants;
    EXPECT_EQ(Service()->ReportDescendants(empty, &descendants), 0);
    EXPECT_EQ(Service()->ReportDescendants(kRoot, &descendants), 4);
    EXPECT_EQ(descendants.Items(), (QStringList{outer, empty, inner, note}));

    EXPECT_EQ(Service()->DeleteItem(outer), S_OK);
    EXPECT_EQ(Service()->ReportChildren(kRoot, &children), E_FAIL);
}

TEST_F(DataStoreServiceTest, SuspendedServiceRefusesEverythingAndLeavesTheFileAlone) {
    const QString id = Note("t");
    const QByteArray before = ReadBytes(m_catalog);
    ASSERT_EQ(Service()->Suspend(), S_OK);
    int suspended = 0;
    EXPECT_EQ(Service()->IsSuspended(&suspended), S_OK);
    EXPECT_EQ(suspended, 1);
    EXPECT_EQ(Service()->Save(), E_FAIL);
    EXPECT_EQ(Service()->CreateFolder(nullptr, nullptr), E_FAIL);
    EXPECT_EQ(Service()->UpdateProperties(id, Properties({{"title", "u"}}).get()), E_FAIL);
    CRecursiveChildrenReporter descendants;
    EXPECT_EQ(Service()->ReportDescendants(kRoot, &descendants), E_FAIL);
    EXPECT_EQ(ReadBytes(m_catalog), before);

    ASSERT_EQ(Service()->Resume(), S_OK);
    EXPECT_EQ(Service()->Save(), S_OK);
    EXPECT_NE(ReadBytes(m_catalog), before);
    EXPECT_EQ(Property(id, QStringLiteral("title")), QStringLiteral("t"));
}

TEST_F(DataStoreServiceTest, CatalogThatFailedToLoadSurvivesShutdownUntouched) {
    const QByteArray broken("<?xml version=\"1.0\"?><archive><organization><root>");
    WriteFile(QFileInfo(m_catalog).absoluteFilePath().mid(Home().size() + 1), broken);
    IDataStoreService* service = CreateDataStoreService(m_host.get());
    ASSERT_NE(service, nullptr);
    EXPECT_EQ(service->Open(), E_FAIL);
    EXPECT_EQ(service->CreateNote(Properties({{"title", "t"}}).get(), nullptr), E_FAIL);
    EXPECT_EQ(service->Save(), E_FAIL);
    service->Shutdown(1);
    EXPECT_EQ(ReadBytes(m_catalog), broken);
    EXPECT_EQ(QDir(QFileInfo(m_catalog).path()).entryList(QDir::Files),
              QStringList{QStringLiteral("catalog.xml")});
}

TEST_F(DataStoreServiceTest, SaveWritesTheFileOnlyAfterTheCatalogChanged) {
    const QString note = Note("n");
    const QString folder = Create(&IDataStoreService::CreateFolder,
                                  Properties({{"title", "f"}, {"type", "folder"}}).get());
    const QString bare = Folder();
    ASSERT_EQ(Service()->Save(), S_OK);

    const auto expectUntouched = [&](const char* what, const std::function<void()>& act) {
        const FileWatch watch(m_catalog);
        act();
        EXPECT_EQ(Service()->Save(), S_OK) << what;
        EXPECT_TRUE(watch.Untouched()) << what;
    };
    expectUntouched("reading", [&] {
        ReleasePtr<IProperties> read(DataExchange::CreateProperties());
        Service()->GetProperties(note, read.get());
        Service()->GetProperties(bare, read.get()); // makes its empty "properties" element
        CRecursiveChildrenReporter descendants;
        Service()->ReportDescendants(kRoot, &descendants);
    });
    // Replacing the last property by its own value would rebuild the same document.
    expectUntouched("same last value", [&] {
        Service()->UpdateProperties(note, Properties({{"title", "n"}}).get());
    });
    expectUntouched("reloading", [&] {
        Service()->Shutdown(1);
        Service();
    });
    expectUntouched("same last value, read back", [&] {
        Service()->UpdateProperties(note, Properties({{"title", "n"}}).get());
    });

    const std::pair<const char*, std::function<void()>> changes[] = {
        {"note", [&] { Note("x"); }},
        {"folder", [&] { Folder(); }},
        {"document", [&] { Create(&IDataStoreService::CreateDocument); }},
        {"set",
         [&] {
             Service()->SetProperties(bare, Properties({{"title", "b"}}).get());
         }},
        {"rename",
         [&] {
             Service()->UpdateProperties(note, Properties({{"title", "m"}}).get());
         }},
        {"same value, moved last",
         [&] {
             Service()->UpdateProperties(folder, Properties({{"title", "f"}}).get());
         }},
        {"move", [&] { Service()->MoveItem(note, folder); }},
        {"move before", [&] { Service()->MoveItemBefore(bare, folder, note); }},
        {"delete", [&] { Service()->DeleteItem(bare); }},
    };
    for (const auto& [what, change] : changes) {
        const FileWatch watch(m_catalog);
        change();
        EXPECT_EQ(Service()->Save(), S_OK) << what;
        EXPECT_FALSE(watch.Untouched()) << what;
    }
}

TEST_F(DataStoreServiceTest, AFailedSaveLeavesTheOldCatalogWhole) {
    Note("n");
    ASSERT_EQ(Service()->Save(), S_OK);
    const QByteArray old = ReadBytes(m_catalog);
    Create(
        &IDataStoreService::CreateFolder,
        Properties({{"title", "A title far too long to fit in what is left of the disk"}}).get());
    {
        const FileSizeLimit full(old.size() + 8);
        EXPECT_EQ(Service()->Save(), E_FAIL);
    }
    EXPECT_EQ(ReadBytes(m_catalog), old);
    EXPECT_EQ(QDir(QFileInfo(m_catalog).path()).entryList(QDir::Files),
              QStringList{QStringLiteral("catalog.xml")});
    // The caller learns which file failed and why, to tell the user.
    QString path;
    QString reason;
    UnicodeStringPtr pathSink(&path);
    UnicodeStringPtr reasonSink(&reason);
    EXPECT_EQ(Service()->GetSaveError(&pathSink, &reasonSink), S_OK);
    EXPECT_EQ(path, m_catalog);
    EXPECT_EQ(reason, QStringLiteral("File too large"));

    ASSERT_EQ(Service()->Save(), S_OK) << "the change waits for the next save";
    EXPECT_EQ(Service()->GetSaveError(&pathSink, &reasonSink), S_FALSE);
}

} // namespace
