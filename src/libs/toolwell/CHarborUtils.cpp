#include "libs/toolwell/CHarborUtils.h"

#include "libs/toolwell/StartupBubble.h"

#include <memory>

namespace {

std::unique_ptr<CHarborUtils> g_instance;
IHarborUtils* g_testInstance = nullptr;

} // namespace

int CHarborUtils::IsFeatureAvailable(int) {
    return 0;
}

void CHarborUtils::SetStartupBubbleEnabled(bool enabled) {
    StartupBubble::SetEnabled(enabled);
}

int CHarborUtils::IsStartupBubbleEnabled() {
    return StartupBubble::IsEnabled() ? 1 : 0;
}

void CHarborUtils::SetNavigatorRect(const QRect& rect) {
    m_navigatorRect = rect;
    if (StartupBubble::IsEnabled() && StartupBubble::Show(rect))
        StartupBubble::SetEnabled(false);
}

void CHarborUtils::GetMessageCenterSize(int* width, int* height) {
    if (width != nullptr)
        *width = 0;
    if (height != nullptr)
        *height = 0;
}

IHarborUtils* GetHarborUtilsInterface() {
    if (g_testInstance != nullptr)
        return g_testInstance;
    if (!g_instance)
        g_instance = std::make_unique<CHarborUtils>();
    return g_instance.get();
}

void ReleaseHarborUtilsInterface() {
    g_instance.reset();
    g_testInstance = nullptr;
}

void SetHarborUtilsForTesting(IHarborUtils* utils) {
    g_testInstance = utils;
}
