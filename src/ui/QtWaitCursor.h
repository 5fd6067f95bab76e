#pragma once

#include "platform/IWaitCursor.h"

// The wait cursor as the application's override cursor.
class QtWaitCursor final : public Platform::IWaitCursor {
public:
    void Begin() override;
    void End() override;
};
