#pragma once

#include "platform/IForeignWindows.h"

#include <QDBusConnection>
#include <QDBusServiceWatcher>
#include <QHash>
#include <QList>
#include <QObject>
#include <QPair>
#include <QString>

#include <functional>

// The windows of the product's other programs, reached over the session bus. A program reports
// its windows by its own numbers; each (program, number) pair gets a navigator-wide handle, so
// two programs can never be confused, and every request goes to the owning program only, as a
// "WindowCommand" notification addressed to it. A window lives as long as its program stays on
// the bus.
class BusForeignWindows final : public QObject, public Platform::IForeignWindows {
    Q_OBJECT
public:
    using GoneHandler = std::function<void(const QList<Platform::WindowHandle>&)>;

    BusForeignWindows(QDBusConnection connection, QString objectPath, QString interface);

    // The handle for the window `reported` of the program with the unique bus name `peer`.
    Platform::WindowHandle Pair(const QString& peer, qint64 reported);
    // Told the handles of a program that has left the bus.
    void SetGoneHandler(GoneHandler handler) { m_goneHandler = std::move(handler); }

    bool IsWindow(Platform::WindowHandle window) override;
    bool Show(Platform::WindowHandle window, int showCommand) override;
    bool Close(Platform::WindowHandle window) override;
    bool BringToFront(Platform::WindowHandle window) override;
    bool Focus(Platform::WindowHandle window) override;
    Platform::WindowHandle FindStartPanel() override;

private:
    struct Window {
        QString peer;
        qint64 reported;
    };

    bool Send(Platform::WindowHandle window, const QString& command, const QString& showCommand);
    void OnPeerGone(const QString& peer);

    QDBusConnection m_connection;
    QString m_objectPath;
    QString m_interface;
    QDBusServiceWatcher m_watcher;
    QHash<Platform::WindowHandle, Window> m_windows;
    QHash<QPair<QString, qint64>, Platform::WindowHandle> m_handles;
    Platform::WindowHandle m_nextHandle = 1;
    GoneHandler m_goneHandler;
};
