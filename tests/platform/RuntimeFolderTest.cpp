#include "support/AmbrelTest.h"

#include "platform/AppFolders.h"
#include "platform/SharedMemory.h"
#include "platform/StartupMutex.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <unistd.h>

namespace {

using namespace Qt::StringLiterals;

constexpr QFile::Permissions kPrivate = QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner;
constexpr QFile::Permissions kOpen =
    kPrivate | QFile::ReadGroup | QFile::ExeGroup | QFile::ReadOther | QFile::ExeOther; // 0755

// The runtime folder is where the lock and the socket live: only a private folder will do.
// Failing that, the program makes one of its own in the temporary folder.
class RuntimeFolderTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        m_savedTmp = qgetenv("TMPDIR");
        ASSERT_TRUE(QDir().mkpath(Home() + u"/tmp"_s));
        qputenv("TMPDIR", QFile::encodeName(Home() + u"/tmp"_s));
    }
    void TearDown() override {
        qputenv("TMPDIR", m_savedTmp);
        AmbrelTest::TearDown();
    }
    QString Fallback() const {
        return Home() + u"/tmp/ambrel-runtime-"_s + QString::number(::geteuid());
    }

    QByteArray m_savedTmp;
};

TEST_F(RuntimeFolderTest, PassesOverALinkedOrOpenFolderForAPrivateOneOfItsOwn) {
    const QString target = Home() + u"/elsewhere"_s;
    ASSERT_TRUE(QDir().mkpath(target));
    QFile::setPermissions(target, kPrivate);
    ASSERT_TRUE(QFile::link(target, Home() + u"/linked-runtime"_s));
    qputenv("XDG_RUNTIME_DIR", QFile::encodeName(Home() + u"/linked-runtime"_s));
    EXPECT_EQ(Platform::RuntimeFolder(), Fallback());
    EXPECT_FALSE(QFileInfo(Fallback()).permissions() & QFile::Permissions(0x0077))
        << "open to group or others";

    QFile::setPermissions(RuntimeHome(), kOpen);
    qputenv("XDG_RUNTIME_DIR", QFile::encodeName(RuntimeHome()));
    EXPECT_EQ(Platform::RuntimeFolder(), Fallback());
}

TEST_F(RuntimeFolderTest, WithoutAnyPrivateFolderNeitherLockNorSocketIsMade) {
    QFile::setPermissions(RuntimeHome(), kOpen);
    ASSERT_TRUE(QDir().mkpath(Fallback()));
    QFile::setPermissions(Fallback(), kOpen);

    EXPECT_TRUE(Platform::RuntimeFolder().isEmpty());
    StartupMutex mutex;
    EXPECT_FALSE(mutex.Create(u"AmbrelNavigator-test"_s));
    EXPECT_FALSE(mutex.Wait(std::chrono::milliseconds(0)));
    SharedMemory channel;
    EXPECT_FALSE(channel.Listen(u"AmbrelNavigator-test"_s));
    EXPECT_TRUE(QDir(RuntimeHome()).isEmpty());
    EXPECT_TRUE(QDir(Fallback()).isEmpty());
}

} // namespace
