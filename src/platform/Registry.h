#pragma once

#include <QString>
#include <QVariant>

namespace Platform {

// The registry stand-in. Key paths keep their usual backslash form ("SOFTWARE\Brindle\...");
// the current user's values live in an INI file under $XDG_CONFIG_HOME/Brindle/ and can be
// written, the machine's under /etc/xdg/Brindle/ and are only read.
class Registry {
public:
    static QVariant UserValue(const QString& keyPath, const QString& name);
    static bool HasUserKey(const QString& keyPath);
    static bool SetUserValue(const QString& keyPath, const QString& name, const QVariant& value);
    static bool RemoveUserValue(const QString& keyPath, const QString& name);

    static QVariant MachineValue(const QString& keyPath, const QString& name);

    // The files behind both scopes; the machine's can be moved for tests.
    static QString UserFile();
    static QString MachineFile();
    static void SetMachineFile(const QString& path);
};

} // namespace Platform
