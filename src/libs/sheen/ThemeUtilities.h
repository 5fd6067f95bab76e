#pragma once

#include <QColor>

namespace BrindleTheming {

// How themed toolbars look under the current style: a soft vertical gradient and a line that
// separates the bar from the content beside it.
struct ToolbarLook {
    QColor top;
    QColor bottom;
    QColor border;
};

// The look worked out by the last initialise or update; null outside their lifetime, when
// toolbars draw as the plain style does.
const ToolbarLook* CurrentToolbarLook();

} // namespace BrindleTheming

// Works out the look from the application's current style and palette. Called once at start-up.
void InitializeThemeUtilities();
// Works the look out again after a style or colour change and re-applies it to every themed
// toolbar. Does nothing before initialisation.
void UpdateThemeUtilities();
// Forgets the look. Called once at shut-down.
void ShutdownThemeUtilities();
