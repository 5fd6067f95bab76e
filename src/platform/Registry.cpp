#include "platform/Registry.h"

#include <QSettings>
#include <QStandardPaths>

namespace Platform {

namespace {

QString g_machineFile;

// "SOFTWARE\Brindle\X\" + "Value" → "SOFTWARE/Brindle/X/Value". The default value of a key
// (an empty name) is kept under "Default".
QString SettingsKey(const QString& keyPath, const QString& name) {
    QString key = keyPath;
    key.replace(u'\\', u'/');
    while (key.endsWith(u'/'))
        key.chop(1);
    return key + u'/' + (name.isEmpty() ? QStringLiteral("Default") : name);
}

QString GroupOf(const QString& keyPath) {
    QString group = keyPath;
    group.replace(u'\\', u'/');
    while (group.endsWith(u'/'))
        group.chop(1);
    return group;
}

} // namespace

QString Registry::UserFile() {
    return QStandardPaths::writableLocation(QStandardPaths::GenericConfigLocation) +
           QStringLiteral("/Brindle/Quillmark Ambrel.ini");
}

QString Registry::MachineFile() {
    return g_machineFile.isEmpty() ? QStringLiteral("/etc/xdg/Brindle/Quillmark Ambrel.ini")
                                   : g_machineFile;
}

void Registry::SetMachineFile(const QString& path) {
    g_machineFile = path;
}

QVariant Registry::UserValue(const QString& keyPath, const QString& name) {
    const QSettings settings(UserFile(), QSettings::IniFormat);
    return settings.value(SettingsKey(keyPath, name));
}

bool Registry::HasUserKey(const QString& keyPath) {
    QSettings settings(UserFile(), QSettings::IniFormat);
    settings.beginGroup(GroupOf(keyPath));
    return !settings.allKeys().isEmpty();
}

bool Registry::SetUserValue(const QString& keyPath, const QString& name, const QVariant& value) {
    QSettings settings(UserFile(), QSettings::IniFormat);
    settings.setValue(SettingsKey(keyPath, name), value);
    settings.sync();
    return settings.status() == QSettings::NoError;
}

bool Registry::RemoveUserValue(const QString& keyPath, const QString& name) {
    QSettings settings(UserFile(), QSettings::IniFormat);
    const QString key = SettingsKey(keyPath, name);
    if (!settings.contains(key))
        return false;
    settings.remove(key);
    settings.sync();
    return settings.status() == QSettings::NoError;
}

QVariant Registry::MachineValue(const QString& keyPath, const QString& name) {
    const QSettings settings(MachineFile(), QSettings::IniFormat);
    return settings.value(SettingsKey(keyPath, name));
}

} // namespace Platform
