#include "startpanel/StartPanelMain.h"

#include "companion/CompanionBus.h"
#include "startpanel/CStartPanelDlg.h"
#include "startpanel/StartPanelActions.h"
#include "startpanel/StartPanelInstance.h"

#include <QApplication>

#include <cstdio>

int RunStartPanel() {
    CompanionBus bus;
    if (!bus.IsConnected()) {
        std::fputs("No session bus: the start panel cannot reach the navigator.\n", stderr);
        return 1;
    }
    StartPanelInstance instance(bus);
    if (!instance.Claim())
        return 0;
    // The panel belongs to a running navigator, which starts it: without one it has nothing to
    // steer and nobody to close it.
    if (!bus.IsNavigatorRunning()) {
        std::fputs("The navigator is not running: the start panel ends.\n", stderr);
        return 0;
    }

    StartPanelActions actions(QApplication::applicationDirPath(),
                              [&bus](const QString& name, const CompanionBus::Properties& values) {
                                  return bus.Post(name, values);
                              });
    CStartPanelDlg panel(actions);
    QObject::connect(&instance, &StartPanelInstance::ActivateRequested, &panel,
                     &CStartPanelDlg::BringToFront);
    QObject::connect(&bus, &CompanionBus::WindowCommandReceived, &panel,
                     &CStartPanelDlg::ApplyWindowCommand);
    QObject::connect(&bus, &CompanionBus::NavigatorGone, &panel, &CStartPanelDlg::reject);
    // Every way out (closed, Escape, told to close while hidden) finishes the dialog, and only
    // that ends the program: a hidden or minimised panel stays.
    QApplication::setQuitOnLastWindowClosed(false);
    QObject::connect(&panel, &CStartPanelDlg::finished, qApp, &QApplication::quit,
                     Qt::QueuedConnection);
    panel.show();
    return QApplication::exec();
}
