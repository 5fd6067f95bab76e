#include "libs/toolwell/BusForeignWindows.h"

#include "libs/toolwell/AmbrelBus.h"

#include <QDBusConnectionInterface>
#include <QDBusMessage>
#include <QDBusReply>
#include <QMap>

BusForeignWindows::BusForeignWindows(QDBusConnection connection, QString objectPath,
                                     QString interface)
    : m_connection(std::move(connection)), m_objectPath(std::move(objectPath)),
      m_interface(std::move(interface)) {
    m_watcher.setConnection(m_connection);
    m_watcher.setWatchMode(QDBusServiceWatcher::WatchForUnregistration);
    connect(&m_watcher, &QDBusServiceWatcher::serviceUnregistered, this,
            &BusForeignWindows::OnPeerGone);
}

Platform::WindowHandle BusForeignWindows::Pair(const QString& peer, qint64 reported) {
    const QPair<QString, qint64> key(peer, reported);
    if (const auto known = m_handles.constFind(key); known != m_handles.cend())
        return known.value();
    if (!m_watcher.watchedServices().contains(peer)) {
        m_watcher.addWatchedService(peer);
        // A program that left before it was watched would never be seen leaving.
        if (!m_connection.interface()->isServiceRegistered(peer)) {
            m_watcher.removeWatchedService(peer);
            return 0;
        }
    }
    const Platform::WindowHandle handle = m_nextHandle++;
    m_windows.insert(handle, {peer, reported});
    m_handles.insert(key, handle);
    return handle;
}

bool BusForeignWindows::IsWindow(Platform::WindowHandle window) {
    return m_windows.contains(window);
}

bool BusForeignWindows::Show(Platform::WindowHandle window, int showCommand) {
    return Send(window, QStringLiteral("show"), QString::number(showCommand));
}

bool BusForeignWindows::Close(Platform::WindowHandle window) {
    return Send(window, QStringLiteral("close"), {});
}

bool BusForeignWindows::BringToFront(Platform::WindowHandle window) {
    return Send(window, QStringLiteral("activate"), {});
}

bool BusForeignWindows::Focus(Platform::WindowHandle window) {
    return Send(window, QStringLiteral("focus"), {});
}

Platform::WindowHandle BusForeignWindows::FindStartPanel() {
    const QDBusReply<QString> owner =
        m_connection.interface()->serviceOwner(AmbrelBus::kStartPanelName);
    if (!owner.isValid() || owner.value().isEmpty())
        return 0;
    // The panel's one window is its window 0.
    return Pair(owner.value(), 0);
}

bool BusForeignWindows::Send(Platform::WindowHandle window, const QString& command,
                             const QString& showCommand) {
    const auto found = m_windows.constFind(window);
    if (found == m_windows.cend())
        return false;
    QMap<QString, QString> properties{{QStringLiteral("handle"), QString::number(found->reported)},
                                      {QStringLiteral("command"), command}};
    if (!showCommand.isEmpty())
        properties.insert(QStringLiteral("showcommand"), showCommand);
    QDBusMessage signal = QDBusMessage::createTargetedSignal(found->peer, m_objectPath, m_interface,
                                                             AmbrelBus::kNotify);
    signal << AmbrelBus::kWindowCommand << QVariant::fromValue(properties);
    return m_connection.send(signal);
}

void BusForeignWindows::OnPeerGone(const QString& peer) {
    m_watcher.removeWatchedService(peer);
    QList<Platform::WindowHandle> gone;
    for (auto window = m_windows.begin(); window != m_windows.end();) {
        if (window->peer == peer) {
            gone.append(window.key());
            m_handles.remove({peer, window->reported});
            window = m_windows.erase(window);
        } else {
            ++window;
        }
    }
    if (!gone.isEmpty() && m_goneHandler)
        m_goneHandler(gone);
}
