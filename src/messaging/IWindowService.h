#pragma once

#include "common/Result.h"

// One window of the note tool or viewer, for callers that want it in front. Reference-counted;
// the holder ends with Release().
class IWindowService {
public:
    virtual unsigned long AddRef() = 0;
    // E_FAIL, changing nothing, when the window is no longer alive.
    virtual HRESULT BringToFront() = 0;
    virtual HRESULT Focus() = 0;
    virtual unsigned long Release() = 0;
    // Shows the window with a show command (Platform::ShowCommand), e.g. to restore it.
    virtual HRESULT Show(int showCommand) = 0;

protected:
    virtual ~IWindowService() = default;
};
