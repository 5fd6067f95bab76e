#include "companion/CompanionBus.h"
#include "viewer/CViewerSession.h"
#include "viewer/CViewerWindow.h"
#include "viewer/ViewerCommandLine.h"

#include <QApplication>

#include <cstdio>

int main(int argc, char* argv[]) {
    QApplication application(argc, argv);
    QApplication::setApplicationName(QStringLiteral("AmbrelViewer"));
    QApplication::setOrganizationName(QStringLiteral("Brindle"));

    const ViewerCommandLine line = ViewerCommandLine::Parse(application.arguments().mid(1));
    if (!line.IsValid()) {
        std::fprintf(stderr, "AmbrelViewer: %s\nusage: AmbrelViewer [/o [<file>]] /id:<item id>\n",
                     qPrintable(line.Problem()));
        return 2;
    }

    CompanionBus bus;
    CViewerWindow window;
    CViewerSession session(&bus, &window, line.ItemId());
    if (!line.File().isEmpty())
        session.StartWithFile(line.File());
    else if (line.HasOpenSwitch())
        session.StartAwaitingFile();
    else
        session.StartAskingForFile();
    return application.exec();
}
