#include "libs/toolwell/IItemWindowHub.h"

namespace {

IItemWindowHub* g_hub = nullptr;

} // namespace

IItemWindowHub* GetItemWindowHub() {
    return g_hub;
}

void SetItemWindowHub(IItemWindowHub* hub) {
    g_hub = hub;
}
