#include "support/AmbrelTest.h"
#include "support/NavigatorProcess.h"

#include <QDeadlineTimer>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QThread>

namespace {

class StartupTest : public AmbrelTest {};

TEST_F(StartupTest, TerminationSignalShutsTheProgramDownCleanly) {
    NavigatorProcess navigator(Home());
    navigator.Start();
    ASSERT_TRUE(navigator.WaitUntilRunning());
    ASSERT_TRUE(navigator.Terminate());
    EXPECT_EQ(navigator.Process().exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(navigator.Process().exitCode(), 0);

    // The window options and the window's place reached the settings file, in UTF-16.
    QFile settings(Home() + QStringLiteral("/data/Brindle/Quillmark Ambrel/NavSettings.dat"));
    ASSERT_TRUE(settings.open(QIODevice::ReadOnly));
    const QByteArray bytes = settings.readAll();
    const QString text =
        QString::fromUtf16(reinterpret_cast<const char16_t*>(bytes.constData()), bytes.size() / 2);
    EXPECT_TRUE(text.startsWith(QStringLiteral("applicationposition|0,0,280,650|")))
        << text.toStdString();
    EXPECT_TRUE(text.endsWith(QStringLiteral("|showqmd|false|")));
}

TEST_F(StartupTest, TerminationWhileAMessageBoxIsOpenStillSavesAndEndsCleanly) {
    const QString source = WriteFile(QStringLiteral("in/ab.txt"), "ab");
    NavigatorProcess navigator(Home());
    navigator.Start({QStringLiteral("/NewNoteFromFile"), source});
    ASSERT_TRUE(navigator.WaitUntilRunning());
    // The refused note's folder exists from just before its message box opens until the box
    // has been answered, so the signal is handled inside the box's event loop.
    const QDir catalog(AppDataFolder() + QStringLiteral("/Catalog"));
    const auto itemFolders = [&] { return catalog.entryList(QDir::Dirs | QDir::NoDotAndDotDot); };
    const QDeadlineTimer deadline(15000);
    while (itemFolders().isEmpty() && !deadline.hasExpired())
        QThread::msleep(20);
    ASSERT_FALSE(itemFolders().isEmpty());
    // A second start is answered from inside the box's loop too.
    EXPECT_EQ(navigator.RunToEnd({}), 0);

    ASSERT_TRUE(navigator.Terminate());
    EXPECT_EQ(navigator.Process().exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(navigator.Process().exitCode(), 0);
    EXPECT_TRUE(itemFolders().isEmpty()) << "the refused note was left behind";
    EXPECT_TRUE(QFile::exists(source));
    QFile catalogFile(catalog.filePath(QStringLiteral("catalog.xml")));
    ASSERT_TRUE(catalogFile.open(QIODevice::ReadOnly));
    EXPECT_FALSE(catalogFile.readAll().contains(QByteArrayLiteral("n\0o\0t\0e\0.\0h\0t\0m\0")));
    EXPECT_TRUE(QFileInfo(navigator.SettingsFile()).size() > 0);
}

} // namespace
