// Timings of loading the navigator's model from generated notebooks, beside the catalog load
// that precedes it at start-up.

#include "CatalogGenerator.h"

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "libs/toolwell/CDataStoreHost.h"
#include "navigator/WNavDS.h"

#include <benchmark/benchmark.h>

#include <QCoreApplication>

namespace {

IDataStoreService* ServiceFor(const Bench::GeneratedCatalog& catalog) {
    static QString loaded;
    IDataStoreService* service = GetDataStoreService();
    if (service != nullptr && loaded == catalog.appDataFolder)
        return service;
    if (service != nullptr)
        service->Shutdown(0);
    ReleasePtr<IDataStoreHost> host(new CDataStoreHost(catalog.appDataFolder));
    loaded = catalog.appDataFolder;
    IDataStoreService* created = CreateDataStoreService(host.get());
    WNavDS::DestroyInstance();
    WNavDS::Instance()->SetDataStoreHost(host.get());
    return created;
}

void BM_CatalogOpen(benchmark::State& state) {
    IDataStoreService* service =
        ServiceFor(Bench::PrepareCatalog(static_cast<int>(state.range(0))));
    for (auto _ : state) {
        if (service->Open() != S_OK)
            state.SkipWithError("catalog did not load");
    }
}

void BM_WNavDSLoad(benchmark::State& state) {
    const int itemCount = static_cast<int>(state.range(0));
    ServiceFor(Bench::PrepareCatalog(itemCount));
    WNavDS* model = WNavDS::Instance();
    for (auto _ : state)
        model->Load();
    // Every catalog item plus the three special folders.
    if (model->GetItems().size() != static_cast<std::size_t>(itemCount) + 3)
        state.SkipWithError("the model does not hold every item");
}

BENCHMARK(BM_CatalogOpen)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_WNavDSLoad)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);

} // namespace

int main(int argc, char** argv) {
    QCoreApplication application(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    WNavDS::DestroyInstance();
    if (IDataStoreService* service = GetDataStoreService())
        service->Release();
    benchmark::Shutdown();
    return 0;
}
