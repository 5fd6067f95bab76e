#include "platform/IWaitCursor.h"

namespace Platform {

namespace {

class NoWaitCursor final : public IWaitCursor {
public:
    void Begin() override {}
    void End() override {}
};

IWaitCursor* g_cursor = nullptr;

} // namespace

IWaitCursor& WaitCursor() {
    static NoWaitCursor none;
    return g_cursor != nullptr ? *g_cursor : none;
}

void SetWaitCursor(IWaitCursor* cursor) {
    g_cursor = cursor;
}

} // namespace Platform
