// Timings of the catalog store over generated notebooks of 1,000, 10,000 and 100,000 items.

#include "CatalogGenerator.h"

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "dataexchange/CRecursiveChildrenReporter.h"
#include "dataexchange/WProperties.h"

#include <benchmark/benchmark.h>

#include <random>

namespace {

using Bench::ServiceFor;

ReleasePtr<DataExchange::IProperties> NoteProperties(const QString& title) {
    ReleasePtr<DataExchange::IProperties> properties(DataExchange::CreateProperties());
    const char* const pairs[][2] = {{"type", "note"},         {"filename", "note.htm"},
                                    {"open", "false"},        {"datecreated", "2024"},
                                    {"dateaccessed", "2024"}, {"font", "Segoe Print"},
                                    {"fontsize", "12"},       {"backgroundcolor", "255,255,204"},
                                    {"backgroundimage", ""},  {"size", "525,400"},
                                    {"keepontop", "false"}};
    for (const auto& pair : pairs)
        properties->SetProperty(QString::fromUtf8(pair[0]), QString::fromUtf8(pair[1]));
    properties->SetProperty(QStringLiteral("title"), title);
    return properties;
}

const QString kRoot = QStringLiteral("root");

void BM_RawParse(benchmark::State& state) {
    const auto& catalog = Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    const QByteArray path = catalog.catalogPath.toLocal8Bit();
    for (auto _ : state) {
        pugi::xml_document document;
        benchmark::DoNotOptimize(
            document.load_file(path.constData(), pugi::parse_default | pugi::parse_declaration));
    }
}

void BM_Open(benchmark::State& state) {
    const auto& catalog = Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    IDataStoreService* service = ServiceFor(catalog);
    for (auto _ : state) {
        if (service->Open() != S_OK)
            state.SkipWithError("catalog did not load");
    }
}

void BM_ReportDescendants(benchmark::State& state) {
    IDataStoreService* service =
        ServiceFor(Bench::PrepareCatalog(static_cast<int>(state.range(0))));
    for (auto _ : state) {
        CRecursiveChildrenReporter reporter;
        benchmark::DoNotOptimize(service->ReportDescendants(kRoot, &reporter));
    }
}

void BM_GetPropertiesOfEveryItem(benchmark::State& state) {
    const auto& catalog = Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    IDataStoreService* service = ServiceFor(catalog);
    std::vector<QString> ids = catalog.folders;
    ids.insert(ids.end(), catalog.notes.begin(), catalog.notes.end());
    ids.insert(ids.end(), catalog.documents.begin(), catalog.documents.end());
    for (auto _ : state) {
        for (const QString& id : ids) {
            ReleasePtr<DataExchange::IProperties> properties(DataExchange::CreateProperties());
            benchmark::DoNotOptimize(service->GetProperties(id, properties.get()));
        }
    }
    state.SetItemsProcessed(static_cast<int64_t>(state.iterations() * ids.size()));
}

void BM_UpdateProperties(benchmark::State& state) {
    const auto& catalog = Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    IDataStoreService* service = ServiceFor(catalog);
    ReleasePtr<DataExchange::IProperties> update(DataExchange::CreateProperties());
    update->SetProperty(QStringLiteral("title"), QStringLiteral("Renamed"));
    update->SetProperty(QStringLiteral("open"), QStringLiteral("true"));
    std::mt19937 random(7);
    for (auto _ : state) {
        const QString& id = catalog.notes[random() % catalog.notes.size()];
        benchmark::DoNotOptimize(service->UpdateProperties(id, update.get()));
    }
}

void BM_MoveItemBefore(benchmark::State& state) {
    const auto& catalog = Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    IDataStoreService* service = ServiceFor(catalog);
    std::mt19937 random(11);
    for (auto _ : state) {
        const QString& note = catalog.notes[random() % catalog.notes.size()];
        const QString& before = catalog.notes[random() % catalog.notes.size()];
        const QString& folder = catalog.folders[random() % catalog.folders.size()];
        benchmark::DoNotOptimize(service->MoveItemBefore(note, folder, before));
    }
}

void BM_CreateNote(benchmark::State& state) {
    IDataStoreService* service =
        ServiceFor(Bench::PrepareCatalog(static_cast<int>(state.range(0))));
    const auto properties = NoteProperties(QStringLiteral("New note"));
    for (auto _ : state) {
        QString id;
        UnicodeStringPtr sink(&id);
        benchmark::DoNotOptimize(service->CreateNote(properties.get(), &sink));
    }
}

// A folder of twenty notes under a folder of the notebook, made untimed, then deleted.
void BM_DeleteFolder(benchmark::State& state) {
    const auto& catalog = Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    IDataStoreService* service = ServiceFor(catalog);
    const auto properties = NoteProperties(QStringLiteral("Doomed"));
    std::mt19937 random(13);
    for (auto _ : state) {
        state.PauseTiming();
        QString folder;
        UnicodeStringPtr folderSink(&folder);
        service->CreateFolder(nullptr, &folderSink);
        service->MoveItem(folder, catalog.folders[random() % catalog.folders.size()]);
        for (int i = 0; i < 20; ++i) {
            QString note;
            UnicodeStringPtr noteSink(&note);
            service->CreateNote(properties.get(), &noteSink);
            service->MoveItem(note, folder);
        }
        state.ResumeTiming();
        benchmark::DoNotOptimize(service->DeleteItem(folder));
    }
}

// Writing a catalog with one changed item (an unchanged catalog is not written at all).
void BM_Save(benchmark::State& state) {
    const auto& catalog = Bench::PrepareCatalog(static_cast<int>(state.range(0)));
    IDataStoreService* service = ServiceFor(catalog);
    const auto renamed = NoteProperties(QStringLiteral("Renamed"));
    for (auto _ : state) {
        state.PauseTiming();
        service->UpdateProperties(catalog.notes.front(), renamed.get());
        state.ResumeTiming();
        if (service->Save() != S_OK)
            state.SkipWithError("catalog was not written");
    }
}

#define CATALOG_SIZES ->Arg(1000)->Arg(10000)->Arg(100000)->Unit(benchmark::kMillisecond)

BENCHMARK(BM_RawParse) CATALOG_SIZES;
BENCHMARK(BM_Open) CATALOG_SIZES;
BENCHMARK(BM_ReportDescendants) CATALOG_SIZES;
BENCHMARK(BM_GetPropertiesOfEveryItem) CATALOG_SIZES;
BENCHMARK(BM_UpdateProperties) CATALOG_SIZES->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_MoveItemBefore) CATALOG_SIZES->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_CreateNote) CATALOG_SIZES->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_DeleteFolder) CATALOG_SIZES->Unit(benchmark::kMicrosecond);
BENCHMARK(BM_Save) CATALOG_SIZES;

} // namespace

BENCHMARK_MAIN();
