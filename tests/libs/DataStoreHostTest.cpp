#include "common/ReleasePtr.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "libs/toolwell/ItemIdentifier.h"
#include "support/AmbrelTest.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

namespace {

class DataStoreHostTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        host.reset(GetDataStoreHost());
    }
    QString StoreFolder() const { return AppDataFolder() + QStringLiteral("/Catalog"); }
    ReleasePtr<IDataStoreHost> host;
};

TEST_F(DataStoreHostTest, ItemFoldersLieInTheStoreAndAreMadeOnlyWhenAskedFor) {
    QString folder, catalog;
    bool exists = true;
    ASSERT_NE(host->GetStoreFolder(&folder, &exists), 0);
    EXPECT_TRUE(folder == StoreFolder() && !exists) << folder.toStdString();
    ASSERT_NE(host->GetCatalogPath(&catalog, nullptr), 0);
    EXPECT_EQ(catalog, StoreFolder() + QStringLiteral("/catalog.xml"));

    const QString id = NewItemIdentifier();
    EXPECT_EQ(id, id.toUpper());
    EXPECT_EQ(host->GetItemFolder(&folder, id, false), 0);
    EXPECT_FALSE(QFileInfo::exists(StoreFolder() + u'/' + id));

    EXPECT_EQ(host->GetItemFolder(&folder, id, true), 1);
    EXPECT_EQ(folder, StoreFolder() + u'/' + id);
    EXPECT_TRUE(QFileInfo(folder).isDir());
    EXPECT_EQ(host->GetItemFolder(&folder, id, false), 1);
    EXPECT_EQ(host->GetItemFolder(&folder, id.toLower(), true), 1) << "either case is an id";
}

TEST_F(DataStoreHostTest, IdentifiersThatAreNotGuidsNeverBecomeFolders) {
    const QString tooLong = NewItemIdentifier() + u'0';
    for (const QString& bad :
         {QStringLiteral("../x"), QStringLiteral(""), QStringLiteral("root"), tooLong,
          QStringLiteral("../../../../../../../tmp/AAAAAAAA-BBBB-CCCC-DDDD-EEEEEEEEEEEE"),
          QStringLiteral("AAAAAAAA-BBBB-CCCC-DDDD-EEEEEEEEEEEG"),
          QStringLiteral("{AAAAAAAA-BBBB-CCCC-DDDD-EEEEEEEEEEE}")}) {
        QString folder;
        EXPECT_EQ(host->GetItemFolder(&folder, bad, true), 0) << bad.toStdString();
    }
    // Nothing was made anywhere below the home folder but the configuration folders.
    EXPECT_FALSE(QFileInfo::exists(StoreFolder()));
    EXPECT_FALSE(QFileInfo::exists(Home() + QStringLiteral("/x")));
}

TEST_F(DataStoreHostTest, AnItemFolderThatIsALinkIsNotTrusted) {
    const QString id = NewItemIdentifier();
    ASSERT_TRUE(QDir().mkpath(StoreFolder()));
    ASSERT_TRUE(QDir().mkpath(Home() + QStringLiteral("/elsewhere")));
    ASSERT_TRUE(QFile::link(Home() + QStringLiteral("/elsewhere"), StoreFolder() + u'/' + id));
    QString folder;
    EXPECT_EQ(host->GetItemFolder(&folder, id, false), 0);
    EXPECT_EQ(host->GetItemFolder(&folder, id, true), 0);
}

} // namespace
