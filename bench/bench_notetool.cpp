// The note tool with a note of about 1 MB: loading the file and showing it in the window,
// offscreen. The process's peak resident size is reported with the results.
#include "companion/CompanionBus.h"
#include "notetool/CNoteFile.h"
#include "notetool/CNoteToolApp.h"
#include "notetool/CNoteWindow.h"

#include <benchmark/benchmark.h>

#include <QApplication>
#include <QFile>
#include <QTemporaryDir>

#include <sys/resource.h>

namespace {

QString g_notePath;

// Paragraphs of mixed plain, bold and italic text until the file holds about 1 MB.
void WriteLargeNote(const QString& path) {
    NoteContent content;
    content.title = QStringLiteral("A long note");
    QString body;
    for (int paragraph = 0; body.size() < 1000 * 1000; ++paragraph) {
        body += QStringLiteral("<P>Paragraph %1 holds <B>some bold words</B>, <I>a few in "
                               "italics</I> and a plain tail that runs on for a while so that "
                               "the line wraps in the note window.</P>")
                    .arg(paragraph);
    }
    content.body = body;
    QFile file(path);
    if (file.open(QIODevice::WriteOnly))
        file.write(CNoteFile::Format(content));
}

double PeakResidentMegabytes() {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return static_cast<double>(usage.ru_maxrss) / 1024.0;
}

void BM_NoteToolShowsLargeNote(benchmark::State& state) {
    CompanionBus bus;
    for (auto _ : state) {
        CNoteToolApp note(&bus, g_notePath, {});
        note.Start();
        // Until the window has been laid out and painted once.
        QApplication::processEvents();
        benchmark::DoNotOptimize(note.Window()->grab());
        state.PauseTiming();
        note.Close();
        QApplication::processEvents();
        state.ResumeTiming();
    }
    state.counters["peak_rss_MB"] = PeakResidentMegabytes();
}

BENCHMARK(BM_NoteToolShowsLargeNote)->Unit(benchmark::kMillisecond)->Iterations(5);

} // namespace

int main(int argc, char** argv) {
    qputenv("QT_QPA_PLATFORM", "offscreen");
    QApplication application(argc, argv);
    const QTemporaryDir folder;
    g_notePath = folder.filePath(QStringLiteral("note.htm"));
    WriteLargeNote(g_notePath);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
