#pragma once

#include "libs/toolwell/IHarborUtils.h"

#include <QList>
#include <QRect>
#include <QSize>

// A utility engine whose readiness, message centre and start-up bubble the test chooses,
// recording the shutting-down flags it is given, the start actions it runs and the window
// rectangles the bubble was shown for.
class FakeHarborUtils final : public IHarborUtils {
public:
    bool IsReady() override { return ready; }
    bool IsEnabled() override { return enabled; }
    void* GetMessageCenter() override { return messageCentre ? this : nullptr; }
    int IsFeatureAvailable(int featureId) override {
        return featureId == 6 && messageCentre ? 1 : 0;
    }
    void ShowMessageArchive() override {}
    void CheckForUpdates() override {}
    void SetStartupBubbleEnabled(bool) override {}
    int IsStartupBubbleEnabled() override { return startupBubble ? 1 : 0; }
    void SetNavigatorRect(const QRect& rect) override { bubbleRects.append(rect); }
    void OnNavigatorClosing() override {}
    void GetMessageCenterSize(int* width, int* height) override {
        *width = messageCentreSize.width();
        *height = messageCentreSize.height();
    }
    void SetShuttingDown(bool flag) override { shuttingDownCalls.append(flag); }
    void RunQmoStartAction() override { ++qmoStartActions; }

    bool ready = true;
    bool enabled = true;
    bool messageCentre = false;
    QSize messageCentreSize;
    bool startupBubble = false;
    QList<QRect> bubbleRects;
    QList<bool> shuttingDownCalls;
    int qmoStartActions = 0;
};
