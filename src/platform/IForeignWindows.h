#pragma once

#include <QtGlobal>

namespace Platform {

// A window of another program of the product, known only by the number that program reported.
using WindowHandle = qint64;

// Show commands, with the values the product's programs exchange.
namespace ShowCommand {
enum : int {
    Hide = 0,
    ShowNormal = 1,
    Maximize = 3,
    Minimize = 6,
    ShowNoActivate = 8,
    Restore = 9
};
}

// Acts on windows of the note tool and the viewer. The peer program owns the window: every
// operation is a request to it, answering false when no live peer owns that window.
class IForeignWindows {
public:
    virtual ~IForeignWindows() = default;
    virtual bool IsWindow(WindowHandle window) = 0;
    virtual bool Show(WindowHandle window, int showCommand) = 0;
    virtual bool Close(WindowHandle window) = 0;
    virtual bool BringToFront(WindowHandle window) = 0;
    virtual bool Focus(WindowHandle window) = 0;
    // The start panel's window while the panel runs, else 0.
    virtual WindowHandle FindStartPanel() = 0;
};

// The implementation in use (null restores the built-in one). The built-in one reaches no
// peer, so every window counts as gone; the message broker installs its own while it runs.
IForeignWindows& ForeignWindows();
void SetForeignWindows(IForeignWindows* windows);

} // namespace Platform
