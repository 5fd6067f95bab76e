#include "common/ReleasePtr.h"
#include "dataexchange/WProperties.h"
#include "settings/Bool.h"
#include "settings/StorageRegistry.h"
#include "support/AmbrelTest.h"

#include <memory>

using namespace Settings;

namespace {

class StorageTest : public AmbrelTest {};

} // namespace

TEST_F(StorageTest, StoragesRegisterForTheirLifetime) {
    ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
    auto flag = std::make_unique<Bool>(QStringLiteral("temporary"), true);
    StorageRegistry::SaveAll(set.get());
    QString value;
    UnicodeStringPtr sink(&value);
    set->GetProperty(QStringLiteral("temporary"), &sink);
    EXPECT_EQ(value, QStringLiteral("true"));

    const IStorage* gone = flag.get();
    flag.reset();
    EXPECT_FALSE(StorageRegistry::Contains(gone)) << "no dangling storage after destruction";
}
