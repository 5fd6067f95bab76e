#pragma once

#include <QString>

namespace Brindle::Application {
class IApplicationInfo;
}

// How the navigator ties itself into the user's desktop.

// The desktop's autostart entry that starts the navigator at log-on.
QString AutostartFile();
// Writes the autostart entry for the running program; false when it cannot be written.
bool AddToRun();
void RemoveFromRun();

// The browser context-menu entry, in the user's registry; written once, never rewritten.
void RegisterBrowserMenuEntry(const QString& programFolder);

// Starts the start panel from the program folder.
void LaunchStartPanel(Brindle::Application::IApplicationInfo* applicationInfo);
// The panel's own choice; true when it never made one.
bool IsStartPanelLaunchOnStart();
void SetStartPanelLaunchOnStart(bool launch);
// Asks a running start panel to close, as the navigator's window closes.
void CloseStartPanel();
