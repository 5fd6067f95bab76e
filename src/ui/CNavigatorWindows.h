#pragma once

#include "platform/IForeignWindows.h"

#include <QPointer>
#include <QWidget>

// The windows the navigator acts on: its own main window directly, every other program's
// window through the implementation underneath (the bus). "Show all windows" from a note tool
// thereby reaches the navigator's window too.
class CNavigatorWindows final : public Platform::IForeignWindows {
public:
    CNavigatorWindows(QWidget* ownWindow, Platform::IForeignWindows* others);

    // The number under which the navigator names its own window. The other programs' windows
    // are numbered from 1 up, so the own window takes one that none of them can have.
    static constexpr Platform::WindowHandle kOwnWindow = -1;
    static Platform::WindowHandle HandleOf(const QWidget* window) {
        return window != nullptr ? kOwnWindow : 0;
    }

    bool IsWindow(Platform::WindowHandle window) override;
    bool Show(Platform::WindowHandle window, int showCommand) override;
    bool Close(Platform::WindowHandle window) override;
    bool BringToFront(Platform::WindowHandle window) override;
    bool Focus(Platform::WindowHandle window) override;
    Platform::WindowHandle FindStartPanel() override { return m_others->FindStartPanel(); }

private:
    // The own window when `window` names it and it still exists, else null.
    QWidget* Own(Platform::WindowHandle window) const;

    QPointer<QWidget> m_ownWindow;
    Platform::IForeignWindows* m_others;
};
