#pragma once

#include "common/Result.h"
#include "platform/IForeignWindows.h"

// Applied to each window that a service tracks (ForEachWindow).
class IWindowCallback {
public:
    virtual ~IWindowCallback() = default;
    virtual HRESULT Apply(Platform::WindowHandle window, int flag) = 0;
};
