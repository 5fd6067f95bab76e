#include "companion/CompanionBus.h"
#include "notetool/CNoteToolApp.h"
#include "notetool/CNoteToolCommandLine.h"
#include "ui/TerminationSignals.h"

#include <QApplication>

#include <cstdio>

// AmbrelNoteTool <note.htm path> [/PROPERTY <pipe-delimited properties>]
int main(int argc, char* argv[]) {
    QApplication application(argc, argv);
    QApplication::setApplicationName(QStringLiteral("AmbrelNoteTool"));
    const CNoteToolCommandLine commandLine(QApplication::arguments().mid(1));
    if (commandLine.NotePath().isEmpty()) {
        std::fputs("usage: AmbrelNoteTool <note file> [/PROPERTY <properties>]\n", stderr);
        return 2;
    }
    CompanionBus bus;
    CNoteToolApp note(&bus, commandLine.NotePath(), commandLine.Properties());
    if (!note.Start())
        return 0;
    QObject::connect(&note, &CNoteToolApp::Closed, &application, &QApplication::quit,
                     Qt::QueuedConnection);
    // Ending the session closes the note as its window's close button does: saved first.
    const TerminationSignals termination;
    QObject::connect(&termination, &TerminationSignals::Received, &note, &CNoteToolApp::Close);
    return QApplication::exec();
}
