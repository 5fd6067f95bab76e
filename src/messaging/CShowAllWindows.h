#pragma once

#include "messaging/IWindowCallback.h"

#include <QString>

// Shows each window with one show command, chosen from a command type: "WindowShowMinimize",
// "WindowShowMaximize", "WindowShowRestore" (in any letter case), anything else shows the
// window without activating it.
class CShowAllWindows final : public IWindowCallback {
public:
    explicit CShowAllWindows(const QString& commandType);

    int ShowCommand() const { return m_showCommand; }
    // E_FAIL when the window is gone or does not take the request.
    HRESULT Apply(Platform::WindowHandle window, int flag) override;

private:
    int m_showCommand;
};
