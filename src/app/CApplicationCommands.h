#pragma once

#include <functional>

class CCommandRouter;
class QWidget;

// The commands the application answers itself rather than the data source: the window
// options, help, mail, screen snapshots, the start panel and the activity centre, and saving
// a copy of the selected document.
class CApplicationCommands {
public:
    // mainWindow answers the navigator's window as it is now (null when there is none): the
    // owner of the save dialog, and what a snapshot hides while it grabs the screen.
    static void Register(CCommandRouter& router, std::function<QWidget*()> mainWindow);

    // How long a snapshot waits after hiding the window, so that the window system has
    // taken it off the screen before the grab.
    static constexpr int kHideBeforeSnapshot = 300;
};
