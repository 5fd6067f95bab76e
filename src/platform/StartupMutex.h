#pragma once

#include <QString>

#include <chrono>
#include <memory>

class QLockFile;

// Makes the start-ups (and the shut-down) of navigators of one instance name mutually
// exclusive: a lock file in the per-user runtime folder. A lock whose owner died is taken over.
class StartupMutex final {
public:
    StartupMutex();
    ~StartupMutex();
    StartupMutex(const StartupMutex&) = delete;
    StartupMutex& operator=(const StartupMutex&) = delete;

    // Prepares the lock "<name>-StartupMutex" in the runtime folder; false when there is no
    // safe runtime folder or the name is not a plain file name.
    bool Create(const QString& name);

    // Waits for the lock, without end by default; true once owned. A zero timeout only looks.
    bool Wait(std::chrono::milliseconds timeout = std::chrono::milliseconds(-1));

    // Gives the lock up when owned; answers whether it is no longer owned.
    bool Release();

    bool IsOwned() const { return m_owned; }
    QString FilePath() const;

private:
    std::unique_ptr<QLockFile> m_lock;
    bool m_owned = false;
};
