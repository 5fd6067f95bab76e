#pragma once

#include "platform/IMessageBox.h"

// Message boxes as Qt dialogs, over the active window.
class QtMessageBox final : public Platform::IMessageBox {
public:
    int Show(const QString& text, const QString& caption, unsigned style) override;
};
