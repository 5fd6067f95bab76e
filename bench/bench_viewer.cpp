// The viewer's first page: loading a generated 100-page PDF and rendering its first page at
// the size the view shows it, offscreen.
#include "viewer/SamplePdf.h"

#include <QApplication>
#include <QPdfDocument>
#include <QTemporaryDir>

#include <benchmark/benchmark.h>

namespace {

constexpr int kPages = 100;

const QString& SamplePath() {
    static QTemporaryDir folder;
    static const QString path = [] {
        const QString file = folder.path() + QStringLiteral("/hundred pages.pdf");
        WriteSamplePdf(file, kPages);
        return file;
    }();
    return path;
}

// Load, then render page 1 at the size the viewer's page view draws it at its first zoom
// (one point is one pixel at 72 dots per inch, the screen has 96).
void BM_LoadAndRenderFirstPage(benchmark::State& state) {
    const QString path = SamplePath();
    for (auto _ : state) {
        QPdfDocument document;
        document.load(path);
        const QSize size = (document.pagePointSize(0) * 96.0 / 72.0).toSize();
        const QImage image = document.render(0, size);
        benchmark::DoNotOptimize(image.constBits());
    }
}
BENCHMARK(BM_LoadAndRenderFirstPage)->Unit(benchmark::kMillisecond);

} // namespace

int main(int argc, char** argv) {
    qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication application(argc, argv);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
