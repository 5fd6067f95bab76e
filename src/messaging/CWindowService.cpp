#include "messaging/CWindowService.h"

unsigned long CWindowService::AddRef() {
    return ++m_references;
}

unsigned long CWindowService::Release() {
    const unsigned long left = --m_references;
    if (left == 0)
        delete this;
    return left;
}

HRESULT CWindowService::BringToFront() {
    Platform::IForeignWindows& windows = Platform::ForeignWindows();
    if (!windows.IsWindow(m_window))
        return E_FAIL;
    return windows.BringToFront(m_window) ? S_OK : E_FAIL;
}

HRESULT CWindowService::Focus() {
    Platform::IForeignWindows& windows = Platform::ForeignWindows();
    if (!windows.IsWindow(m_window))
        return E_FAIL;
    return windows.Focus(m_window) ? S_OK : E_FAIL;
}

HRESULT CWindowService::Show(int showCommand) {
    Platform::IForeignWindows& windows = Platform::ForeignWindows();
    if (!windows.IsWindow(m_window))
        return E_FAIL;
    return windows.Show(m_window, showCommand) ? S_OK : E_FAIL;
}

IWindowService* CreateWindowService(Platform::WindowHandle window) {
    auto* service = new CWindowService(window);
    service->AddRef();
    return service;
}
