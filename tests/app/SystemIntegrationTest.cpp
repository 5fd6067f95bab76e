#include "app/SystemIntegration.h"
#include "messaging/ActivityCenter.h"
#include "platform/Registry.h"
#include "support/AmbrelTest.h"
#include "support/RecordingProcessLauncher.h"

#include <QCoreApplication>
#include <QFile>
#include <QProcess>
#include <QSettings>

namespace {

using namespace Qt::StringLiterals;

class SystemIntegrationTest : public AmbrelTest {};

TEST_F(SystemIntegrationTest, TheAutostartEntryIsValidAndGoesAgain) {
    ASSERT_TRUE(AddToRun());
    EXPECT_EQ(AutostartFile(), ConfigHome() + u"/autostart/quillmark-ambrel.desktop"_s);
    QFile entry(AutostartFile());
    ASSERT_TRUE(entry.open(QIODevice::ReadOnly));
    EXPECT_TRUE(entry.readAll().contains(
        "\nExec=\"" + QCoreApplication::applicationFilePath().toUtf8() + "\"\n"));
    QProcess validate;
    validate.start(u"desktop-file-validate"_s, {AutostartFile()});
    ASSERT_TRUE(validate.waitForFinished());
    EXPECT_EQ(validate.exitCode(), 0) << validate.readAllStandardOutput().toStdString();
    RemoveFromRun();
    EXPECT_FALSE(QFile::exists(AutostartFile()));
}

TEST_F(SystemIntegrationTest, TheBrowserEntryIsWrittenOnceAndNeverRewritten) {
    const QString key = u"SOFTWARE\\Microsoft\\Internet Explorer\\MenuExt\\Copy to &Ambrel Note"_s;
    RegisterBrowserMenuEntry(u"/opt/first"_s);
    EXPECT_EQ(Platform::Registry::UserValue(key, {}).toString(),
              u"/opt/first/QMAmbrelCopyToNote.hta"_s);
    EXPECT_EQ(Platform::Registry::UserValue(key, u"Contexts"_s).toInt(), 0x10);
    RegisterBrowserMenuEntry(u"/opt/moved"_s);
    EXPECT_EQ(Platform::Registry::UserValue(key, {}).toString(),
              u"/opt/first/QMAmbrelCopyToNote.hta"_s);
}

TEST_F(SystemIntegrationTest, TheActivityCentreStartsOnlyWhenItsFileExists) {
    RecordingProcessLauncher launcher;
    Platform::SetProcessLauncher(&launcher);
    LaunchActivityCenter(true);
    const QString program = WriteFile(u"opt/activity"_s, "");
    QSettings machine(Platform::Registry::MachineFile(), QSettings::IniFormat);
    machine.setValue(u"SOFTWARE/Brindle/AppLauncher/Activity Center"_s, Home() + u"/opt/gone"_s);
    machine.sync();
    LaunchActivityCenter(true);
    EXPECT_TRUE(launcher.starts.isEmpty());
    machine.setValue(u"SOFTWARE/Brindle/AppLauncher/Activity Center"_s, program);
    machine.sync();
    LaunchActivityCenter(true);
    LaunchActivityCenter(false);
    ASSERT_EQ(launcher.starts.size(), 2);
    EXPECT_EQ(launcher.starts[0].program, program);
    EXPECT_EQ(launcher.starts[0].arguments, QStringList{u"/p"_s});
    EXPECT_TRUE(launcher.starts[1].arguments.isEmpty());
}

} // namespace
