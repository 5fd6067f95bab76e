#pragma once

#include <QRect>

namespace Platform {

// The virtual screen: the union of every screen's geometry; empty without a GUI application.
QRect VirtualScreenRect();

} // namespace Platform
