#include "platform/StartupMutex.h"

#include "platform/AppFolders.h"

#include <QLockFile>

StartupMutex::StartupMutex() = default;

StartupMutex::~StartupMutex() {
    Release();
}

bool StartupMutex::Create(const QString& name) {
    Release();
    m_lock.reset();
    if (name.isEmpty() || name.contains(u'/') || name == u"." || name == u"..")
        return false;
    const QString folder = Platform::RuntimeFolder();
    if (folder.isEmpty())
        return false;
    m_lock = std::make_unique<QLockFile>(folder + u'/' + name + QStringLiteral("-StartupMutex"));
    // Only a dead owner makes the lock stale: a slow start-up must keep it however long it takes.
    m_lock->setStaleLockTime(0);
    return true;
}

bool StartupMutex::Wait(std::chrono::milliseconds timeout) {
    if (!m_lock)
        return false;
    if (!m_owned)
        m_owned = m_lock->tryLock(timeout);
    return m_owned;
}

bool StartupMutex::Release() {
    if (m_owned && m_lock) {
        m_lock->unlock();
        m_owned = m_lock->isLocked();
    }
    return !m_owned;
}

QString StartupMutex::FilePath() const {
    return m_lock ? m_lock->fileName() : QString();
}
