#include "NavigatorProcess.h"
#include "support/AmbrelTest.h"

#include <QFile>

namespace {

class StartupTest : public AmbrelTest {};

TEST_F(StartupTest, TerminationSignalShutsTheProgramDownCleanly) {
    NavigatorProcess navigator(Home());
    navigator.Start();
    ASSERT_TRUE(navigator.WaitUntilRunning());
    ASSERT_TRUE(navigator.Terminate());
    EXPECT_EQ(navigator.Process().exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(navigator.Process().exitCode(), 0);

    // The window options applied at start-up reached the settings file, in UTF-16; the window
    // was not moved, so no position was recorded.
    QFile settings(Home() + QStringLiteral("/data/Brindle/Quillmark Ambrel/NavSettings.dat"));
    ASSERT_TRUE(settings.open(QIODevice::ReadOnly));
    const QByteArray bytes = settings.readAll();
    const QString text =
        QString::fromUtf16(reinterpret_cast<const char16_t*>(bytes.constData()), bytes.size() / 2);
    EXPECT_TRUE(text.startsWith(QStringLiteral("applicationposition|0,0,0,0|")))
        << text.toStdString();
    EXPECT_TRUE(text.endsWith(QStringLiteral("|showqmd|false|")));
}

} // namespace
