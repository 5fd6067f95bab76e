#pragma once

#include "libs/toolwell/IHarborUtils.h"

#include <QList>

// A utility engine whose readiness and message centre the test chooses, recording the
// shutting-down flags it is given and the start actions it runs.
class FakeHarborUtils final : public IHarborUtils {
public:
    bool IsReady() override { return ready; }
    bool IsEnabled() override { return enabled; }
    void* GetMessageCenter() override { return nullptr; }
    int IsFeatureAvailable(int featureId) override {
        return featureId == 6 && messageCentre ? 1 : 0;
    }
    void ShowMessageArchive() override {}
    void CheckForUpdates() override {}
    void SetStartupBubbleEnabled(bool) override {}
    int IsStartupBubbleEnabled() override { return 0; }
    void SetNavigatorRect(const QRect&) override {}
    void OnNavigatorClosing() override {}
    void GetMessageCenterSize(int*, int*) override {}
    void SetShuttingDown(bool flag) override { shuttingDownCalls.append(flag); }
    void RunQmoStartAction() override { ++qmoStartActions; }

    bool ready = true;
    bool enabled = true;
    bool messageCentre = false;
    QList<bool> shuttingDownCalls;
    int qmoStartActions = 0;
};
