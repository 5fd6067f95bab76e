#pragma once

#include "platform/IMessageBox.h"

#include <QList>

// Records every message box instead of showing it, answering a chosen button.
class RecordingMessageBox final : public Platform::IMessageBox {
public:
    struct Shown {
        QString text;
        QString caption;
        unsigned style;
    };

    int Show(const QString& text, const QString& caption, unsigned style) override {
        shown.append({text, caption, style});
        return answer;
    }

    QList<Shown> shown;
    int answer = Platform::MessageBoxAnswer::Ok;
};
