// Timings of the navigator tree over generated notebooks: the first window with the whole
// tree, and the idle pass after one change. The peak memory of the process is reported with
// the largest notebook.

#include "CatalogGenerator.h"

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "dataexchange/WProperties.h"
#include "navigator/WNavDS.h"
#include "navigator/WNavigatorTree.h"

#include <benchmark/benchmark.h>

#include <QApplication>
#include <QTemporaryDir>

#include <sys/resource.h>

#include <memory>

namespace {

WNavDS* ModelFor(const Bench::GeneratedCatalog& catalog) {
    Bench::ServiceFor(catalog, [](IDataStoreHost* host) {
        WNavDS::DestroyInstance();
        WNavDS::Instance()->SetDataStoreHost(host);
    });
    WNavDS* model = WNavDS::Instance();
    if (model->GetItems().empty())
        model->Load();
    return model;
}

void ReportPeakMemory(benchmark::State& state) {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    state.counters["maxrss_MB"] = static_cast<double>(usage.ru_maxrss) / 1024.0;
}

std::unique_ptr<WNavigatorTree> ShownTree() {
    auto tree = std::make_unique<WNavigatorTree>();
    tree->resize(300, 600);
    tree->show();
    return tree;
}

// The idle pass's share of the tree, then the paint the user waits for.
void IdlePassAndPaint(WNavigatorTree& tree) {
    tree.OnIdle();
    tree.repaint();
    QApplication::processEvents();
}

// A shown tree that already holds the whole notebook.
std::unique_ptr<WNavigatorTree> FilledTree(WNavDS* model) {
    std::unique_ptr<WNavigatorTree> tree = ShownTree();
    model->SetChanged(true);
    IdlePassAndPaint(*tree);
    return tree;
}

// From an empty window to the whole tree painted.
void BM_TreeFirstWindow(benchmark::State& state) {
    WNavDS* model = ModelFor(Bench::PrepareCatalog(static_cast<int>(state.range(0))));
    for (auto _ : state) {
        std::unique_ptr<WNavigatorTree> tree = FilledTree(model);
        state.PauseTiming();
        tree.reset();
        state.ResumeTiming();
    }
    ReportPeakMemory(state);
}

// One retitled note, then the idle pass and the repaint.
void BM_TreeRebuildAfterChange(benchmark::State& state) {
    const Bench::GeneratedCatalog& catalog =
        Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    WNavDS* model = ModelFor(catalog);
    std::unique_ptr<WNavigatorTree> tree = FilledTree(model);
    const QString note = catalog.notes[catalog.notes.size() / 2];
    int turn = 0;
    for (auto _ : state) {
        state.PauseTiming();
        ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
        set->SetProperty(QStringLiteral("title"), QStringLiteral("Title %1").arg(++turn));
        model->UpdateItem(note, set.get(), false);
        state.ResumeTiming();
        IdlePassAndPaint(*tree);
    }
    ReportPeakMemory(state);
}

// A note moved into another folder: items leave one parent and join another.
void BM_TreeRebuildAfterMove(benchmark::State& state) {
    const Bench::GeneratedCatalog& catalog =
        Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    WNavDS* model = ModelFor(catalog);
    std::unique_ptr<WNavigatorTree> tree = FilledTree(model);
    NavListItemData* folders[] = {model->FindItem(catalog.folders[0]),
                                  model->FindItem(catalog.folders[1])};
    NavListItemData* note = model->FindItem(catalog.notes[catalog.notes.size() / 3]);
    std::size_t turn = 0;
    for (auto _ : state) {
        state.PauseTiming();
        model->MoveItemTo(note, folders[turn++ % 2]);
        state.ResumeTiming();
        IdlePassAndPaint(*tree);
    }
    ReportPeakMemory(state);
}

BENCHMARK(BM_TreeFirstWindow)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_TreeRebuildAfterChange)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);
BENCHMARK(BM_TreeRebuildAfterMove)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond);

} // namespace

int main(int argc, char** argv) {
    QTemporaryDir home;
    qputenv("XDG_CONFIG_HOME", home.path().toUtf8());
    qputenv("XDG_DATA_HOME", home.path().toUtf8());
    qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication application(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    WNavDS::DestroyInstance();
    if (IDataStoreService* service = GetDataStoreService())
        service->Release();
    benchmark::Shutdown();
    return 0;
}
