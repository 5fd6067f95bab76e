#include "ui/CNavigatorWindows.h"

#include "ui/ShowCommand.h"

CNavigatorWindows::CNavigatorWindows(QWidget* ownWindow, Platform::IForeignWindows* others)
    : m_ownWindow(ownWindow), m_others(others) {}

QWidget* CNavigatorWindows::Own(Platform::WindowHandle window) const {
    return window == kOwnWindow ? m_ownWindow.data() : nullptr;
}

bool CNavigatorWindows::IsWindow(Platform::WindowHandle window) {
    return Own(window) != nullptr || m_others->IsWindow(window);
}

bool CNavigatorWindows::Show(Platform::WindowHandle window, int showCommand) {
    QWidget* own = Own(window);
    if (own == nullptr)
        return m_others->Show(window, showCommand);
    ApplyShowCommand(own, showCommand);
    return true;
}

bool CNavigatorWindows::Close(Platform::WindowHandle window) {
    if (QWidget* own = Own(window))
        return own->close();
    return m_others->Close(window);
}

bool CNavigatorWindows::BringToFront(Platform::WindowHandle window) {
    QWidget* own = Own(window);
    if (own == nullptr)
        return m_others->BringToFront(window);
    own->raise();
    return true;
}

bool CNavigatorWindows::Focus(Platform::WindowHandle window) {
    QWidget* own = Own(window);
    if (own == nullptr)
        return m_others->Focus(window);
    own->activateWindow();
    return true;
}
