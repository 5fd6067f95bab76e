#include "FuzzEnvironment.h"

#include "libs/toolwell/IItemWindowHub.h"
#include "platform/IForeignWindows.h"
#include "platform/IMessageBox.h"
#include "platform/IProcessLauncher.h"
#include "platform/Registry.h"
#include "support/ResetSingletons.h"

#include <QApplication>
#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QTemporaryDir>

#include <cstdio>
#include <cstdlib>
#include <memory>

namespace FuzzEnvironment {

namespace {

QString g_home;
// Made once and kept to the end of the process, as in the program.
QCoreApplication* g_application = nullptr;

QString MachineFile() {
    return g_home + QStringLiteral("/etc/Quillmark Ambrel.ini");
}

} // namespace

void SetUp(int* argc, char*** argv, Application application) {
    // Removed when the run ends: libFuzzer ends a run with exit().
    static QTemporaryDir home(QDir::tempPath() + QStringLiteral("/ambrel-fuzz-XXXXXX"));
    if (!home.isValid()) {
        std::fprintf(stderr, "no temporary folder: %s\n", qPrintable(home.errorString()));
        std::abort();
    }
    g_home = home.path();
    const QString data = g_home + QStringLiteral("/data");
    const QString config = g_home + QStringLiteral("/config");
    const QString runtime = g_home + QStringLiteral("/runtime");
    for (const QString& folder : {data, config, runtime})
        QDir().mkpath(folder);
    QFile::setPermissions(runtime, QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
    qputenv("HOME", QFile::encodeName(g_home));
    qputenv("XDG_DATA_HOME", QFile::encodeName(data));
    qputenv("XDG_CONFIG_HOME", QFile::encodeName(config));
    qputenv("XDG_RUNTIME_DIR", QFile::encodeName(runtime));
    qputenv("QT_QPA_PLATFORM", "offscreen");
    // No session bus: the program then runs without a broker, as it does on a bare desktop.
    qunsetenv("DBUS_SESSION_BUS_ADDRESS");
    if (application == Application::Gui)
        g_application = new QApplication(*argc, *argv);
    else
        g_application = new QCoreApplication(*argc, *argv);
    Platform::Registry::SetMachineFile(MachineFile());
}

QString Home() {
    return g_home;
}

QString AppDataFolder() {
    return g_home + QStringLiteral("/data/Brindle/Quillmark Ambrel");
}

void RemoveAppData() {
    QDir(AppDataFolder()).removeRecursively();
}

void ResetProgram() {
    ResetSingletons();
    Platform::Registry::SetMachineFile(MachineFile());
}

RecordingPlatform::RecordingPlatform() {
    Platform::SetProcessLauncher(&m_launcher);
    Platform::SetMessageBox(&m_messages);
    Platform::SetForeignWindows(&m_windows);
    SetItemWindowHub(&m_hub);
}

RecordingPlatform::~RecordingPlatform() {
    Platform::SetProcessLauncher(nullptr);
    Platform::SetMessageBox(nullptr);
    Platform::SetForeignWindows(nullptr);
    SetItemWindowHub(nullptr);
}

QByteArray ReadFile(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

bool WriteFile(const QString& path, const QByteArray& bytes) {
    QDir().mkpath(QFileInfo(path).absolutePath());
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size();
}

void Require(bool condition, const char* what) {
    if (condition)
        return;
    std::fprintf(stderr, "fuzz property broken: %s\n", what);
    std::abort();
}

} // namespace FuzzEnvironment
