#include "support/AmbrelTest.h"

#include "platform/AppFolders.h"
#include "platform/SharedMemory.h"
#include "platform/StartupMutex.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QSysInfo>

#include <unistd.h>

namespace {

using namespace Qt::StringLiterals;

constexpr QFile::Permissions kPrivate = QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner;
constexpr QFile::Permissions kOpen =
    kPrivate | QFile::ReadGroup | QFile::ExeGroup | QFile::ReadOther | QFile::ExeOther; // 0755

// The runtime folder is where the lock and the socket live: only a private folder will do.
// Failing that, the program makes one of its own in the temporary folder, and failing that in
// the user's cache folder.
class RuntimeFolderTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        m_savedTmp = qgetenv("TMPDIR");
        m_savedCache = qgetenv("XDG_CACHE_HOME");
        ASSERT_TRUE(QDir().mkpath(Home() + u"/tmp"_s));
        qputenv("TMPDIR", QFile::encodeName(Home() + u"/tmp"_s));
        qputenv("XDG_CACHE_HOME", QFile::encodeName(Home() + u"/cache"_s));
    }
    void TearDown() override {
        qputenv("TMPDIR", m_savedTmp);
        qputenv("XDG_CACHE_HOME", m_savedCache);
        AmbrelTest::TearDown();
    }
    QString Fallback() const {
        return Home() + u"/tmp/ambrel-runtime-"_s + QString::number(::geteuid());
    }
    QString CacheFallback() const {
        return Home() + u"/cache/ambrel-runtime-"_s + QSysInfo::machineHostName();
    }

    QByteArray m_savedTmp;
    QByteArray m_savedCache;
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

// Another user can make the folder in the temporary folder first; the navigator must start all
// the same, and its socket path must stay short enough however deep the cache folder lies.
TEST_F(RuntimeFolderTest, AFolderTakenByAnotherUserGivesWayToOneInTheCacheFolder) {
    qunsetenv("XDG_RUNTIME_DIR");
    ASSERT_TRUE(QDir().mkpath(Fallback()));
    if (::geteuid() == 0)
        ASSERT_EQ(::chown(QFile::encodeName(Fallback()).constData(), 65534, 65534), 0);
    else
        QFile::setPermissions(Fallback(), kOpen | QFile::WriteGroup | QFile::WriteOther);

    // A runtime folder of 80 bytes leaves no room for the instance name as it is.
    const QString suffix = u"/ambrel-runtime-"_s + QSysInfo::machineHostName();
    const qsizetype padding = 80 - (Home().size() + 7 + suffix.size());
    ASSERT_GT(padding, 0);
    const QString deepCache = Home() + u"/cache/"_s + QString(padding, u'c');
    for (const QString& cache : {Home() + u"/cache"_s, deepCache}) {
        qputenv("XDG_CACHE_HOME", QFile::encodeName(cache));
        const QString folder = Platform::RuntimeFolder();
        EXPECT_EQ(folder, cache + suffix);
        EXPECT_EQ(QFileInfo(folder).permissions() & QFile::Permissions(0x7077), kPrivate);
        SharedMemory channel;
        EXPECT_TRUE(channel.Listen(u"AmbrelNavigator-1.0.0.521-:0-someone"_s))
            << folder.toStdString();
        EXPECT_LT(QFile::encodeName(channel.ServerPath()).size(), 107);
    }
}

TEST_F(RuntimeFolderTest, WithoutAnyPrivateFolderNeitherLockNorSocketIsMade) {
    QFile::setPermissions(RuntimeHome(), kOpen);
    for (const QString& folder : {Fallback(), CacheFallback()}) {
        ASSERT_TRUE(QDir().mkpath(folder));
        QFile::setPermissions(folder, kOpen);
    }

    EXPECT_TRUE(Platform::RuntimeFolder().isEmpty());
    StartupMutex mutex;
    EXPECT_FALSE(mutex.Create(u"AmbrelNavigator-test"_s));
    EXPECT_FALSE(mutex.Wait(std::chrono::milliseconds(0)));
    SharedMemory channel;
    EXPECT_FALSE(channel.Listen(u"AmbrelNavigator-test"_s));
    for (const QString& folder : {RuntimeHome(), Fallback(), CacheFallback()})
        EXPECT_TRUE(QDir(folder).isEmpty()) << folder.toStdString();
}

} // namespace
