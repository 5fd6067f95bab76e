#pragma once

#include <QDBusConnection>
#include <QMap>
#include <QObject>
#include <QString>

class QDBusServiceWatcher;

// The companion programs' side of the session bus: the note tool, the viewer and the start
// panel post their messages to the navigator through it and hear the navigator's notifications.
// A post never waits for the navigator; when no navigator runs it simply reaches nobody.
class CompanionBus final : public QObject {
    Q_OBJECT
public:
    using Properties = QMap<QString, QString>;

    // connection: the session bus; tests give a connection of their own.
    explicit CompanionBus(const QDBusConnection& connection = QDBusConnection::sessionBus(),
                          QObject* parent = nullptr);
    ~CompanionBus() override;

    // Whether the session bus could be reached at all.
    bool IsConnected() const;
    // Whether a navigator owns its name on the bus now (asks the bus, so it waits for it).
    bool IsNavigatorRunning() const;
    // Hands a message to the navigator's broker; false without a bus or when it cannot be sent.
    bool Post(const QString& name, const Properties& properties);
    // Takes a well-known name for this program (the start panel's, or one per open note);
    // false when another program holds it.
    bool RegisterName(const QString& name);
    // Whether some program holds the name now.
    bool IsNameTaken(const QString& name) const;
    QString UniqueName() const;
    QDBusConnection Connection() const { return m_connection; }

Q_SIGNALS:
    // A notification of the item window hub ("ActivateNote", "UpdateNoteProperties",
    // "OpenDocumentInViewer", ...). Every program hears every item's: compare "itemid".
    void HubNotified(const QString& name, const CompanionBus::Properties& properties);
    // A window command meant for this program: `handle` is the program's own window number as
    // it reported it, `command` is "show", "close", "activate" or "focus", and `showCommand`
    // the show command's number with "show" (-1 otherwise).
    void WindowCommandReceived(qint64 handle, const QString& command, int showCommand);
    // The navigator left the bus: it ended, or it crashed.
    void NavigatorGone();

private Q_SLOTS:
    void OnNotify(const QString& name, const QMap<QString, QString>& properties);

private:
    QDBusConnection m_connection;
    QDBusServiceWatcher* m_watcher = nullptr;
};
