#pragma once

#include "messaging/IWindowCallback.h"

// Asks each window to close and returns at once; the owning program decides when it goes.
class CCloseAllWindows final : public IWindowCallback {
public:
    HRESULT Apply(Platform::WindowHandle window, int flag) override;
};
