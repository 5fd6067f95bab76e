#pragma once

#include "platform/IProcessLauncher.h"

#include <QList>

// Records every program start instead of running it; answers `succeed`.
class RecordingProcessLauncher final : public Platform::IProcessLauncher {
public:
    struct Start {
        QString program;
        QStringList arguments;
    };

    bool StartDetached(const QString& program, const QStringList& arguments) override {
        starts.append({program, arguments});
        return succeed;
    }

    QList<Start> starts;
    bool succeed = true;
};
