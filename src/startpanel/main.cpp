#include "startpanel/StartPanelMain.h"

#include <QApplication>

int main(int argc, char* argv[]) {
    QApplication application(argc, argv);
    QApplication::setApplicationName(QStringLiteral("Quillmark Ambrel"));
    QApplication::setOrganizationName(QStringLiteral("Brindle"));
    return RunStartPanel();
}
