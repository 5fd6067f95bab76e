#include "platform/IForeignWindows.h"

namespace Platform {

namespace {

class NoForeignWindows final : public IForeignWindows {
public:
    bool IsWindow(WindowHandle) override { return false; }
    bool Show(WindowHandle, int) override { return false; }
    bool Close(WindowHandle) override { return false; }
    bool BringToFront(WindowHandle) override { return false; }
    bool Focus(WindowHandle) override { return false; }
    WindowHandle FindStartPanel() override { return 0; }
};

IForeignWindows* g_windows = nullptr;

} // namespace

IForeignWindows& ForeignWindows() {
    static NoForeignWindows none;
    return g_windows != nullptr ? *g_windows : none;
}

void SetForeignWindows(IForeignWindows* windows) {
    g_windows = windows;
}

} // namespace Platform
