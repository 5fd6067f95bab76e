#include "support/AmbrelTest.h"

#include "platform/AppFolders.h"
#include "platform/SharedMemory.h"
#include "platform/StartupMutex.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <unistd.h>

namespace {

// The runtime folder is where the lock and the socket live: only a private folder will do.
class RuntimeFolderTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        m_savedTmp = qgetenv("TMPDIR");
        ASSERT_TRUE(QDir().mkpath(Temp()));
        qputenv("TMPDIR", QFile::encodeName(Temp()));
    }
    void TearDown() override {
        qputenv("TMPDIR", m_savedTmp);
        AmbrelTest::TearDown();
    }
    QString Temp() const { return Home() + QStringLiteral("/tmp"); }
    QString Fallback() const {
        return Temp() + QStringLiteral("/ambrel-runtime-") + QString::number(::geteuid());
    }

private:
    QByteArray m_savedTmp;
};

constexpr QFile::Permissions kPrivate = QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner;
constexpr QFile::Permissions kOthers = QFile::ReadGroup | QFile::WriteGroup | QFile::ExeGroup |
                                       QFile::ReadOther | QFile::WriteOther | QFile::ExeOther;
// Mode 0755.
constexpr QFile::Permissions kOpen =
    kPrivate | QFile::ReadGroup | QFile::ExeGroup | QFile::ReadOther | QFile::ExeOther;

TEST_F(RuntimeFolderTest, PassesOverALinkedOrOpenFolderForAPrivateOneOfItsOwn) {
    const QString target = Home() + QStringLiteral("/elsewhere");
    ASSERT_TRUE(QDir().mkpath(target));
    QFile::setPermissions(target, kPrivate);
    const QString link = Home() + QStringLiteral("/linked-runtime");
    ASSERT_TRUE(QFile::link(target, link));

    qputenv("XDG_RUNTIME_DIR", QFile::encodeName(link));
    EXPECT_EQ(Platform::RuntimeFolder(), Fallback());
    EXPECT_FALSE(QFileInfo(Fallback()).permissions() & kOthers);

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
    EXPECT_FALSE(mutex.Create(QStringLiteral("AmbrelNavigator-test")));
    EXPECT_FALSE(mutex.Wait(std::chrono::milliseconds(0)));
    SharedMemory channel;
    EXPECT_FALSE(channel.Listen(QStringLiteral("AmbrelNavigator-test")));
    EXPECT_TRUE(QDir(RuntimeHome()).isEmpty());
    EXPECT_TRUE(QDir(Fallback()).isEmpty());
}

} // namespace
