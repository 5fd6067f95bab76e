#include "app/SystemIntegration.h"

#include "app/IApplicationInfo.h"
#include "common/StringTable.h"
#include "platform/IForeignWindows.h"
#include "platform/IProcessLauncher.h"
#include "platform/Registry.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QSaveFile>
#include <QStandardPaths>

namespace {

const QString kStartPanelKey =
    QStringLiteral("SOFTWARE\\Brindle\\Quillmark Ambrel\\Start Panel\\1.0\\Settings\\");
const QString kLaunchOnStart = QStringLiteral("LaunchOnAmbrelStart");

// One argument of an "Exec" line: quoted, with the quoting's and then the file's own escapes,
// so that any folder name (spaces, quotes, dollars, backslashes) survives. Null for a path
// that cannot be written on one line.
QString ExecArgument(const QString& path) {
    QString quoted;
    for (const QChar c : path) {
        if (c.category() == QChar::Other_Control)
            return {};
        if (c == u'"' || c == u'`' || c == u'$' || c == u'\\')
            quoted += u'\\';
        quoted += c;
    }
    quoted.replace(u'\\', QStringLiteral("\\\\"));
    quoted.replace(u'%', QStringLiteral("%%"));
    return u'"' + quoted + u'"';
}

} // namespace

QString AutostartFile() {
    return QStandardPaths::writableLocation(QStandardPaths::GenericConfigLocation) +
           QStringLiteral("/autostart/quillmark-ambrel.desktop");
}

bool AddToRun() {
    const QString exec = ExecArgument(QCoreApplication::applicationFilePath());
    if (exec.isEmpty() || !QDir().mkpath(QFileInfo(AutostartFile()).absolutePath()))
        return false;
    QSaveFile file(AutostartFile());
    if (!file.open(QIODevice::WriteOnly))
        return false;
    const QString entry = QStringLiteral("[Desktop Entry]\n"
                                         "Type=Application\n"
                                         "Name=Quillmark Ambrel\n"
                                         "Exec=%1\n")
                              .arg(exec);
    file.write(entry.toUtf8());
    return file.commit();
}

void RemoveFromRun() {
    QFile::remove(AutostartFile());
}

void RegisterBrowserMenuEntry(const QString& programFolder) {
    // No browser on this platform reads this key; it is kept so that the product's settings
    // stay the same everywhere.
    const QString key = QStringLiteral("SOFTWARE\\Microsoft\\Internet Explorer\\MenuExt\\") +
                        LoadString(StringId::BrowserMenuText);
    if (Platform::Registry::HasUserKey(key))
        return;
    Platform::Registry::SetUserValue(key, QString(),
                                     programFolder + QStringLiteral("/QMAmbrelCopyToNote.hta"));
    Platform::Registry::SetUserValue(key, QStringLiteral("Contexts"), 0x10);
    Platform::Registry::SetUserValue(key, QStringLiteral("Flags"), 1);
}

void LaunchStartPanel(Brindle::Application::IApplicationInfo* applicationInfo) {
    if (applicationInfo == nullptr)
        return;
    QString folder;
    UnicodeStringPtr sink(&folder);
    if (FAILED(applicationInfo->GetProgramFolder(&sink)) || folder.isEmpty())
        return;
    Platform::ProcessLauncher().StartDetached(folder + QStringLiteral("/AmbrelStartPanel"), {});
}

bool IsStartPanelLaunchOnStart() {
    const QVariant value = Platform::Registry::UserValue(kStartPanelKey, kLaunchOnStart);
    if (!value.isValid())
        return true;
    // One byte is read, whatever was stored: the first of a binary value, else the lowest.
    if (value.typeId() == QMetaType::QByteArray) {
        const QByteArray bytes = value.toByteArray();
        return !bytes.isEmpty() && bytes.at(0) == 1;
    }
    return (value.toInt() & 0xFF) == 1;
}

void SetStartPanelLaunchOnStart(bool launch) {
    Platform::Registry::SetUserValue(kStartPanelKey, kLaunchOnStart,
                                     QByteArray(1, launch ? '\1' : '\0'));
}

void CloseStartPanel() {
    Platform::IForeignWindows& windows = Platform::ForeignWindows();
    if (const Platform::WindowHandle panel = windows.FindStartPanel())
        windows.Close(panel);
}
