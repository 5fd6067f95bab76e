#pragma once

#include "platform/SharedMemory.h"
#include "platform/StartupMutex.h"

#include <QList>
#include <QString>
#include <QStringList>

#include <chrono>
#include <functional>

class IStartActions;

// One navigator per user and desktop. A start takes the start-up lock and either becomes the
// running navigator (it listens on the instance socket and keeps the lock until its start-up is
// over) or hands its command line to the navigator already running and waits until that one
// has taken it in. The running navigator keeps the handed-over command lines until its idle
// pass runs their start actions, so that an action waiting for the user holds up no start.
class SingleInstance final {
public:
    enum class Outcome {
        Running,     // this process is the navigator now
        HandedOver,  // the running navigator has queued this command line
        NotCarried,  // the command line cannot be sent, or the running navigator refused it
        NoAnswer,    // a navigator holds the lock or the socket but did not answer in time
        Unavailable, // no private runtime folder, or the socket cannot be used
    };

    // How long a start waits for a running navigator to answer.
    static constexpr std::chrono::milliseconds kPatience{10000};

    // "AmbrelNavigator-<version>" followed by "-<desktop>" and "-<user>" for the names that
    // could be read. "/" (a display may be a path) and "%" are written as %2F and %25 so that
    // the name stays one file name.
    static QString InstanceName(const QString& desktop, const QString& user);
    // The name for this process's desktop and user.
    static QString InstanceName();

    explicit SingleInstance(const QString& name = InstanceName());
    ~SingleInstance();
    SingleInstance(const SingleInstance&) = delete;
    SingleInstance& operator=(const SingleInstance&) = delete;

    // Start-up check. `arguments` is the whole command line, the program first. Blocks for at
    // most `patience` (a navigator that shuts down meanwhile is waited for within it).
    Outcome Start(const QStringList& arguments, std::chrono::milliseconds patience = kPatience);

    // The running navigator starts answering: every handed-over command line is queued, its
    // sender answered, and `arrived` called (to bring the window to the front).
    void Publish(std::function<void()> arrived);

    // Runs the start actions of the queued command lines, in the order they came, each once.
    void RunHandedOver(IStartActions& actions);

    // Start-up is over: later starts may take the lock.
    void EndStartup();

    // Shut-down: takes the lock back and stops answering, so that a later start waits until
    // this process has ended rather than starting a second navigator on the same notebook.
    // The lock goes when this object does.
    void Withdraw();

    const QString& Name() const { return m_name; }
    bool HoldsLock() const { return m_mutex.IsOwned(); }
    SharedMemory& Channel() { return m_channel; }

    // One line for standard error about an outcome other than Running and HandedOver.
    static QString Describe(Outcome outcome);

private:
    QString m_name;
    StartupMutex m_mutex;
    SharedMemory m_channel;
    QList<QStringList> m_handedOver;
};
