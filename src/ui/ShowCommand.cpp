#include "ui/ShowCommand.h"

#include "platform/IForeignWindows.h"

#include <QWidget>

void ApplyShowCommand(QWidget* window, int showCommand) {
    if (window == nullptr)
        return;
    switch (showCommand) {
    case Platform::ShowCommand::Hide:
        window->hide();
        break;
    case Platform::ShowCommand::Maximize:
        window->showMaximized();
        break;
    case Platform::ShowCommand::Minimize:
        window->showMinimized();
        break;
    case Platform::ShowCommand::ShowNoActivate: {
        const bool activating = !window->testAttribute(Qt::WA_ShowWithoutActivating);
        window->setAttribute(Qt::WA_ShowWithoutActivating);
        window->show();
        window->setAttribute(Qt::WA_ShowWithoutActivating, !activating);
        break;
    }
    default:
        window->showNormal();
        break;
    }
}
