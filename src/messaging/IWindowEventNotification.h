#pragma once

#include <QString>

// Told when a window of the note tool or viewer shows an item.
class IWindowEventNotification {
public:
    virtual ~IWindowEventNotification() = default;
    virtual void OnWindowEvent(const QString& itemId) = 0;
};
