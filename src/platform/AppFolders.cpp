#include "platform/AppFolders.h"

#include <QCoreApplication>
#include <QDir>
#include <QFileInfo>
#include <QStandardPaths>
#include <QSysInfo>

#include <utility>

#include <sys/stat.h>
#include <unistd.h>

namespace Platform {

QString ApplicationDataFolder() {
    return QStandardPaths::writableLocation(QStandardPaths::GenericDataLocation) +
           QStringLiteral("/Brindle/Quillmark Ambrel");
}

QString ProgramFolder() {
    if (QCoreApplication::instance() != nullptr)
        return QCoreApplication::applicationDirPath();
    return QFileInfo(QStringLiteral("/proc/self/exe")).canonicalFilePath().section(u'/', 0, -2);
}

namespace {

// A folder is private when it is a real folder (not a link), ours, and closed to others.
bool IsPrivateFolder(const QString& path) {
    struct stat info {};
    if (::lstat(QFile::encodeName(path).constData(), &info) != 0)
        return false;
    return S_ISDIR(info.st_mode) && info.st_uid == ::geteuid() && (info.st_mode & 077) == 0;
}

} // namespace

QString RuntimeFolder() {
    const QString runtime = qEnvironmentVariable("XDG_RUNTIME_DIR");
    if (!runtime.isEmpty() && IsPrivateFolder(runtime))
        return QDir::cleanPath(runtime);

    // Anyone can make the first one before us, so it may well be refused; the cache folder is
    // ours. A home shared between machines gets one folder per machine there: sockets are local.
    const std::pair<QString, QString> candidates[] = {
        {QDir::tempPath(), QStringLiteral("ambrel-runtime-") + QString::number(::geteuid())},
        {QStandardPaths::writableLocation(QStandardPaths::GenericCacheLocation),
         QStringLiteral("ambrel-runtime-") + QSysInfo::machineHostName()},
    };
    for (const auto& [parent, name] : candidates) {
        if (!QFileInfo(parent).isAbsolute() || !QDir().mkpath(parent))
            continue;
        const QString folder = QDir::cleanPath(parent) + u'/' + name;
        ::mkdir(QFile::encodeName(folder).constData(), 0700);
        if (IsPrivateFolder(folder))
            return folder;
    }
    return {};
}

} // namespace Platform
