#pragma once

#include "platform/IForeignWindows.h"

#include <QList>
#include <QSet>

// Records every request on foreign windows; only the windows in `alive` count as live.
class RecordingForeignWindows final : public Platform::IForeignWindows {
public:
    struct Request {
        QString operation;
        Platform::WindowHandle window;
        int showCommand;
    };

    bool IsWindow(Platform::WindowHandle window) override { return alive.contains(window); }
    bool Show(Platform::WindowHandle window, int showCommand) override {
        return Record(QStringLiteral("Show"), window, showCommand);
    }
    bool Close(Platform::WindowHandle window) override {
        return Record(QStringLiteral("Close"), window);
    }
    bool BringToFront(Platform::WindowHandle window) override {
        return Record(QStringLiteral("BringToFront"), window);
    }
    bool Focus(Platform::WindowHandle window) override {
        return Record(QStringLiteral("Focus"), window);
    }

    Platform::WindowHandle FindStartPanel() override { return startPanel; }

    QList<Request> requests;
    QSet<Platform::WindowHandle> alive;
    Platform::WindowHandle startPanel = 0;

private:
    bool Record(const QString& operation, Platform::WindowHandle window, int showCommand = -1) {
        requests.append({operation, window, showCommand});
        return alive.contains(window);
    }
};
