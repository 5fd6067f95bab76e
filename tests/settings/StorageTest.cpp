#include "common/ReleasePtr.h"
#include "dataexchange/WProperties.h"
#include "settings/Bool.h"
#include "settings/StorageRegistry.h"
#include "support/AmbrelTest.h"

#include <QStringList>

#include <memory>

using namespace Settings;

namespace {

class StorageTest : public AmbrelTest {
protected:
    QString Get(const QString& key) {
        QString value;
        UnicodeStringPtr sink(&value);
        m_set->GetProperty(key, &sink);
        return value;
    }

    ReleasePtr<DataExchange::IProperties> m_set{DataExchange::CreateProperties()};
};

// Notes the order in which the registry walks its storages.
class OrderStorage final : public IStorage {
public:
    OrderStorage(QStringList* log, QString name) : m_log(log), m_name(std::move(name)) {}
    void Load(DataExchange::IProperties*) override { m_log->append(m_name); }
    void Save(DataExchange::IProperties*) override { m_log->append(m_name); }

private:
    QStringList* m_log;
    QString m_name;
};

} // namespace

TEST_F(StorageTest, StoragesRegisterForTheirLifetime) {
    auto flag = std::make_unique<Bool>(QStringLiteral("temporary"), true);
    EXPECT_TRUE(StorageRegistry::Contains(flag.get()));
    StorageRegistry::SaveAll(m_set.get());
    EXPECT_EQ(Get(QStringLiteral("temporary")), QStringLiteral("true"));

    const IStorage* gone = flag.get();
    flag.reset();
    EXPECT_FALSE(StorageRegistry::Contains(gone));
}

TEST_F(StorageTest, RegistryWalksInRegistrationOrderWithoutDuplicates) {
    QStringList log;
    OrderStorage first(&log, QStringLiteral("first"));
    OrderStorage second(&log, QStringLiteral("second"));
    StorageRegistry::Register(&first);
    StorageRegistry::Register(&second);
    StorageRegistry::Register(&first);

    StorageRegistry::LoadAll(m_set.get());
    EXPECT_EQ(log, (QStringList{QStringLiteral("first"), QStringLiteral("second")}));

    StorageRegistry::Unregister(&first);
    log.clear();
    StorageRegistry::SaveAll(m_set.get());
    EXPECT_EQ(log, QStringList{QStringLiteral("second")});
    StorageRegistry::Unregister(&second);
}
