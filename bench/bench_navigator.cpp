// Timings of loading the navigator's model from generated notebooks, beside the catalog load
// that precedes it at start-up.

#include "CatalogGenerator.h"

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "navigator/WNavDS.h"
#include "platform/IProcessLauncher.h"

#include <benchmark/benchmark.h>

#include <QCoreApplication>
#include <QTemporaryDir>

namespace {

// The service over the catalog, with a fresh model over the same host whenever the catalog
// changes.
IDataStoreService* ModelServiceFor(const Bench::GeneratedCatalog& catalog) {
    return Bench::ServiceFor(catalog, [](IDataStoreHost* host) {
        WNavDS::DestroyInstance();
        WNavDS::Instance()->SetDataStoreHost(host);
    });
}

void BM_CatalogOpen(benchmark::State& state) {
    IDataStoreService* service =
        ModelServiceFor(Bench::PrepareCatalog(static_cast<int>(state.range(0))));
    for (auto _ : state) {
        if (service->Open() != S_OK)
            state.SkipWithError("catalog did not load");
    }
}

void BM_WNavDSLoad(benchmark::State& state) {
    const int itemCount = static_cast<int>(state.range(0));
    ModelServiceFor(Bench::PrepareCatalog(itemCount));
    WNavDS* model = WNavDS::Instance();
    for (auto _ : state)
        model->Load();
    // Every catalog item plus the three special folders.
    if (model->GetItems().size() != static_cast<std::size_t>(itemCount) + 3)
        state.SkipWithError("the model does not hold every item");
}

// The note tool is not started: only the navigator's side of opening a note is measured.
class NoLauncher final : public Platform::IProcessLauncher {
public:
    bool StartDetached(const QString&, const QStringList&) override { return true; }
};

// The model over the catalog, loaded with its services as at start-up.
WNavDS* ModelFor(const Bench::GeneratedCatalog& catalog) {
    ModelServiceFor(catalog);
    WNavDS* model = WNavDS::Instance();
    if (model->GetNoteToolService() == nullptr)
        model->Initialize();
    return model;
}

void BM_NewNote(benchmark::State& state) {
    const Bench::GeneratedCatalog& catalog =
        Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    WNavDS* model = ModelFor(catalog);
    NavListItemData* folder = model->FindItem(catalog.folders.front());
    for (auto _ : state) {
        model->SelectItem(folder);
        model->NewNote(nullptr, nullptr);
    }
}

void BM_MoveItemTo(benchmark::State& state) {
    const Bench::GeneratedCatalog& catalog =
        Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    WNavDS* model = ModelFor(catalog);
    NavListItemData* folders[] = {model->FindItem(catalog.folders[0]),
                                  model->FindItem(catalog.folders[1])};
    NavListItemData* note = model->FindItem(catalog.notes[catalog.notes.size() / 2]);
    std::size_t turn = 0;
    if (note == nullptr || folders[0] == nullptr || folders[1] == nullptr ||
        !model->CanDrop(note, folders[0]) || !model->CanDrop(note, folders[1]))
        state.SkipWithError("the note cannot move between the folders");
    for (auto _ : state)
        model->MoveItemTo(note, folders[turn++ % 2]);
    if (note->GetParent() != folders[(turn + 1) % 2])
        state.SkipWithError("the note did not move");
}

void BM_DeleteSelected(benchmark::State& state) {
    const Bench::GeneratedCatalog& catalog =
        Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    WNavDS* model = ModelFor(catalog);
    NavListItemData* note = model->FindItem(catalog.notes[catalog.notes.size() / 3]);
    for (auto _ : state) {
        state.PauseTiming();
        model->SelectItem(note);
        state.ResumeTiming();
        model->DeleteSelected();
        state.PauseTiming();
        model->SelectItem(note);
        model->RestoreSelected();
        state.ResumeTiming();
    }
}

void BM_EmptyDeletedItems(benchmark::State& state) {
    const Bench::GeneratedCatalog& catalog =
        Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    WNavDS* model = ModelFor(catalog);
    IDataStoreService* service = GetDataStoreService();
    for (auto _ : state) {
        state.PauseTiming();
        // The catalog as generated, about one item in fifty deleted.
        service->Open();
        model->Load();
        state.ResumeTiming();
        model->EmptyDeletedItems();
    }
    service->Open();
    model->Load();
}

BENCHMARK(BM_CatalogOpen)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_WNavDSLoad)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_NewNote)->Arg(10000)->Arg(100000)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_MoveItemTo)->Arg(10000)->Arg(100000)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_DeleteSelected)->Arg(10000)->Arg(100000)->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_EmptyDeletedItems)
    ->Arg(10000)
    ->Arg(100000)
    ->Iterations(3)
    ->Unit(benchmark::kMillisecond);

} // namespace

int main(int argc, char** argv) {
    // The operations write the recently used lists and settings: keep them out of the
    // user's own folders.
    QTemporaryDir home;
    qputenv("XDG_CONFIG_HOME", home.path().toUtf8());
    qputenv("XDG_DATA_HOME", home.path().toUtf8());
    NoLauncher launcher;
    Platform::SetProcessLauncher(&launcher);
    QCoreApplication application(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    WNavDS::DestroyInstance();
    if (IDataStoreService* service = GetDataStoreService())
        service->Release();
    Platform::SetProcessLauncher(nullptr);
    benchmark::Shutdown();
    return 0;
}
