#pragma once

#include <QString>

namespace Platform {

// The login name of the user running the program; empty when it cannot be read.
QString UserName();

// The desktop the program shows on: the Wayland display, else the X display; empty when
// neither is set (offscreen).
QString DesktopName();

} // namespace Platform
