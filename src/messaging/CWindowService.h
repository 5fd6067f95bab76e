#pragma once

#include "messaging/IWindowService.h"
#include "platform/IForeignWindows.h"

#include <atomic>

class CWindowService final : public IWindowService {
public:
    explicit CWindowService(Platform::WindowHandle window) : m_window(window) {}

    unsigned long AddRef() override;
    HRESULT BringToFront() override;
    HRESULT Focus() override;
    unsigned long Release() override;
    HRESULT Show(int showCommand) override;

private:
    ~CWindowService() override = default;

    std::atomic<unsigned long> m_references{0};
    Platform::WindowHandle m_window;
};

// A new window service holding one reference for the caller.
IWindowService* CreateWindowService(Platform::WindowHandle window);
