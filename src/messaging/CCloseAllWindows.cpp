#include "messaging/CCloseAllWindows.h"

HRESULT CCloseAllWindows::Apply(Platform::WindowHandle window, int) {
    // A window whose program is already gone needs no closing: the request's answer is not
    // a failure of the close-all.
    Platform::ForeignWindows().Close(window);
    return S_OK;
}
