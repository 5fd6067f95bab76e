#include "common/ReleasePtr.h"
#include "dataexchange/WProperties.h"
#include "settings/Bool.h"
#include "settings/StorageRegistry.h"
#include "settings/StringTemplate.h"
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

TEST_F(StorageTest, BoolReadsTrueIgnoringCaseAndAnythingElseAsFalse) {
    Bool flag(QStringLiteral("flag"), true);
    flag.Load(m_set.get());
    EXPECT_TRUE(flag.Value()) << "a missing key leaves the value";

    for (const char* text : {"false", "yes", "1", "", "true "}) {
        flag.SetValue(true);
        m_set->SetProperty(QStringLiteral("flag"), QString::fromLatin1(text));
        flag.Load(m_set.get());
        EXPECT_FALSE(flag.Value()) << text;
    }
    for (const char* text : {"true", "TRUE", "tRuE"}) {
        flag.SetValue(false);
        m_set->SetProperty(QStringLiteral("flag"), QString::fromLatin1(text));
        flag.Load(m_set.get());
        EXPECT_TRUE(flag.Value()) << text;
    }

    flag.Save(m_set.get());
    EXPECT_EQ(Get(QStringLiteral("flag")), QStringLiteral("true"));
    flag.SetValue(false);
    flag.Save(m_set.get());
    EXPECT_EQ(Get(QStringLiteral("flag")), QStringLiteral("false"));
}

TEST_F(StorageTest, StringTemplateReplacesOnlyWhenTheKeyExists) {
    StringTemplate font(QStringLiteral("font"), QStringLiteral("Serif"));
    font.Load(m_set.get());
    EXPECT_EQ(font.Value(), QStringLiteral("Serif"));

    m_set->SetProperty(QStringLiteral("font"), QString());
    font.Load(m_set.get());
    EXPECT_TRUE(font.Value().isEmpty()) << "a present empty value replaces the text";

    font.SetValue(QStringLiteral("Sans | Bold"));
    font.Save(m_set.get());
    EXPECT_EQ(Get(QStringLiteral("font")), QStringLiteral("Sans | Bold"));
}

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
