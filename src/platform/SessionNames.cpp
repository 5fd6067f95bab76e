#include "platform/SessionNames.h"

#include <QFile>

#include <pwd.h>
#include <unistd.h>

namespace Platform {

QString UserName() {
    // The password database is the truth; $USER may be stale after su.
    if (const passwd* entry = ::getpwuid(::geteuid()); entry != nullptr && entry->pw_name)
        return QFile::decodeName(entry->pw_name);
    return qEnvironmentVariable("USER");
}

QString DesktopName() {
    const QString wayland = qEnvironmentVariable("WAYLAND_DISPLAY");
    return wayland.isEmpty() ? qEnvironmentVariable("DISPLAY") : wayland;
}

} // namespace Platform
