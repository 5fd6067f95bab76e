#pragma once

#include <QString>

// The product's activity centre, found through the machine's registry value "Activity Center"
// under "SOFTWARE\Brindle\AppLauncher".

// The program's path; empty when the value is missing or not text.
QString GetActivityCenterPath();
// False when the path is empty or names no existing file.
bool IsActivityCenterInstalled();
// Starts the activity centre when it is installed, with "/p" when the navigator is starting.
void LaunchActivityCenter(bool atStart);
