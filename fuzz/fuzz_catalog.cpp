// The catalog file and the item operations on what it holds. The input is the catalog's bytes,
// then the operations, two bytes each (what, and which items), then one byte: how many
// operations there are. After the operations the catalog is saved as the idle pass saves it,
// and a saved catalog must load again with the same items.
#include "FuzzEnvironment.h"

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "dataexchange/WProperties.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "navigator/WNavDS.h"

#include <cstddef>
#include <cstdint>

namespace {

class Counter final : public IDataStoreReporter {
public:
    HRESULT ReportItem(const QString&) override {
        ++count;
        return S_OK;
    }
    int SkipChildren() override { return 0; }
    int count = 0;
};

// The catalog items below the Notebook; -1 when the catalog did not load.
int CountItems(IDataStoreService* service) {
    Counter counter;
    if (service->ReportDescendants(QStringLiteral("root"), &counter) < 0)
        return -1;
    return counter.count;
}

NavListItemData* Pick(WNavDS* model, std::uint8_t which) {
    const auto& items = model->GetItems();
    if (items.empty())
        return nullptr;
    auto item = items.begin();
    std::advance(item, which % items.size());
    return item->get();
}

void Operate(WNavDS* model, std::uint8_t what, std::uint8_t which) {
    NavListItemData* item = Pick(model, which & 15);
    NavListItemData* other = Pick(model, which >> 4);
    switch (what % 14) {
    case 0:
        model->NewNote(nullptr, nullptr);
        break;
    case 1:
        model->NewFolder(nullptr);
        break;
    case 2:
        model->SelectItem(item);
        break;
    case 3:
        model->SetDropTarget(item);
        break;
    case 4:
        if (item != nullptr)
            model->MoveItemTo(item, other);
        break;
    case 5:
        model->SelectItem(item);
        model->DeleteSelected();
        break;
    case 6:
        model->SelectItem(item);
        model->RestoreSelected();
        break;
    case 7:
        model->EmptyDeletedItems();
        break;
    case 8:
        model->RestoreAllDeleted();
        break;
    case 9:
        if (item != nullptr) {
            ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
            set->SetProperty(QStringLiteral("title"), QStringLiteral("Renamed %1").arg(which));
            model->UpdateItem(item->GetItemId(), set.get(), true);
        }
        break;
    case 10:
        model->SetExpanded(item, (which & 1) != 0);
        break;
    case 11:
        if (item != nullptr)
            model->OpenItem(item, true);
        break;
    case 12:
        if (item != nullptr)
            model->CloseTree(item->GetItemId());
        break;
    default:
        model->Load();
        break;
    }
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv) {
    FuzzEnvironment::SetUp(argc, argv, FuzzEnvironment::Application::Core);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::size_t operations = size > 0 ? data[size - 1] % 16 : 0;
    operations = std::min(operations, size > 0 ? (size - 1) / 2 : 0);
    const std::size_t catalogSize = size > 0 ? size - 1 - 2 * operations : 0;
    const std::uint8_t* operation = data + catalogSize;

    FuzzEnvironment::RemoveAppData();
    const QString catalog =
        FuzzEnvironment::AppDataFolder() + QStringLiteral("/Catalog/catalog.xml");
    FuzzEnvironment::Require(
        FuzzEnvironment::WriteFile(
            catalog, QByteArray(reinterpret_cast<const char*>(data), qsizetype(catalogSize))),
        "catalog written");

    const FuzzEnvironment::RecordingPlatform recording;

    int before = -1;
    {
        ReleasePtr<IDataStoreHost> host(GetDataStoreHost());
        IDataStoreService* service = CreateDataStoreService(host.get());
        FuzzEnvironment::Require(service != nullptr, "a data store service over any catalog");
        WNavDS* model = WNavDS::Instance();
        model->SetDataStoreHost(host.get());
        model->Initialize();
        for (std::size_t i = 0; i < operations; ++i)
            Operate(model, operation[2 * i], operation[2 * i + 1]);
        before = CountItems(service);
        service->Save();
        FuzzEnvironment::ResetProgram();
    }
    if (before >= 0) {
        ReleasePtr<IDataStoreHost> host(GetDataStoreHost());
        IDataStoreService* service = CreateDataStoreService(host.get());
        FuzzEnvironment::Require(service != nullptr && CountItems(service) == before,
                                 "a saved catalog loads again with the same items");
    }
    FuzzEnvironment::ResetProgram();
    return 0;
}
