#include "libs/sheen/ThemeUtilities.h"

#include "libs/sheen/ThemedToolbar.h"

#include <QApplication>
#include <QPalette>

#include <optional>

namespace {

std::optional<BrindleTheming::ToolbarLook> g_look;

BrindleTheming::ToolbarLook LookFromPalette(const QPalette& palette) {
    const QColor window = palette.color(QPalette::Window);
    return {window.lighter(106), window.darker(104), palette.color(QPalette::Mid)};
}

} // namespace

namespace BrindleTheming {

const ToolbarLook* CurrentToolbarLook() {
    return g_look ? &*g_look : nullptr;
}

} // namespace BrindleTheming

void InitializeThemeUtilities() {
    g_look = LookFromPalette(QApplication::palette());
}

void UpdateThemeUtilities() {
    if (!g_look)
        return;
    g_look = LookFromPalette(QApplication::palette());
    for (QWidget* widget : QApplication::allWidgets()) {
        if (auto* toolbar = qobject_cast<BrindleTheming::ThemedToolbar*>(widget))
            toolbar->ApplyTheme();
    }
}

void ShutdownThemeUtilities() {
    g_look.reset();
}
