#pragma once

#include "libs/toolwell/IHarborUtils.h"

// The utility engine as far as the navigator needs it on Linux. There is no message centre
// and no update service here, so the features that depend on them answer "not available".
// The start-up bubble is a desktop notification shown once per user (see StartupBubble).
class CHarborUtils final : public IHarborUtils {
public:
    bool IsReady() override { return true; }
    bool IsEnabled() override { return true; }
    void* GetMessageCenter() override { return nullptr; }
    int IsFeatureAvailable(int featureId) override;
    void ShowMessageArchive() override {}
    void CheckForUpdates() override {}
    void SetStartupBubbleEnabled(bool enabled) override;
    int IsStartupBubbleEnabled() override;
    // Keeps the window's place and, while the bubble is enabled, shows it.
    void SetNavigatorRect(const QRect& rect) override;
    void OnNavigatorClosing() override { m_navigatorClosing = true; }
    void GetMessageCenterSize(int* width, int* height) override;
    void SetShuttingDown(bool shuttingDown) override { m_shuttingDown = shuttingDown; }
    void RunQmoStartAction() override {}

    bool IsShuttingDown() const { return m_shuttingDown; }
    QRect NavigatorRect() const { return m_navigatorRect; }

private:
    bool m_shuttingDown = false;
    bool m_navigatorClosing = false;
    QRect m_navigatorRect;
};

// Lets a test put its own utility engine in place of the real one until it is released
// (null restores the real one).
void SetHarborUtilsForTesting(IHarborUtils* utils);
