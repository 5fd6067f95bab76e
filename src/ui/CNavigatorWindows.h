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

    // The number under which the navigator reports its own window.
    static Platform::WindowHandle HandleOf(const QWidget* window);

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
    Platform::WindowHandle m_ownHandle;
    Platform::IForeignWindows* m_others;
};
