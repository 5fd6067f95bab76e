#pragma once

#include <QRect>

// The utility engine's shared services object.
class IHarborUtils {
public:
    virtual ~IHarborUtils() = default;
    virtual bool IsReady() = 0;
    virtual bool IsEnabled() = 0;
    // The message centre object; none is built on this platform yet.
    virtual void* GetMessageCenter() = 0;
    virtual int IsFeatureAvailable(int featureId) = 0;
    virtual void ShowMessageArchive() = 0;
    virtual void CheckForUpdates() = 0;
    virtual void SetStartupBubbleEnabled(bool enabled) = 0;
    virtual int IsStartupBubbleEnabled() = 0;
    virtual void SetNavigatorRect(const QRect& rect) = 0;
    virtual void OnNavigatorClosing() = 0;
    virtual void GetMessageCenterSize(int* width, int* height) = 0;
    virtual void SetShuttingDown(bool shuttingDown) = 0;
    virtual void RunQmoStartAction() = 0;
};

// The singleton, made on first call; released once at shut-down.
IHarborUtils* GetHarborUtilsInterface();
void ReleaseHarborUtilsInterface();
