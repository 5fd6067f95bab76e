#include "support/AmbrelTest.h"

#include "InstanceTestSupport.h"
#include "platform/SharedMemory.h"
#include "platform/SharedMemoryClient.h"

#include <QDir>
#include <QFile>

#include <sys/wait.h>

namespace {

const QString kName = QStringLiteral("AmbrelNavigator-test");

class SharedMemoryTest : public AmbrelTest {
protected:
    QString Path() const { return RuntimeHome() + QStringLiteral("/AmbrelNavigator-test"); }

    void ListenAndPublish() {
        ASSERT_TRUE(m_channel.Listen(kName));
        ASSERT_EQ(m_channel.ServerPath(), Path());
        m_channel.Publish([this](const QStringList& arguments) { m_handled.append(arguments); });
    }

    SharedMemory m_channel;
    QList<QStringList> m_handled;
};

TEST_F(SharedMemoryTest, AnArgumentListIsTakenInAndAnsweredAndEverythingElseRefused) {
    ListenAndPublish();
    const QStringList arguments{QStringLiteral("prog"), QStringLiteral("/ViewDocument"),
                                QStringLiteral("/home/me/\"\u00fc\" \\ b\n.pdf"), QString()};
    const QByteArray largest =
        "[\"" + QByteArray(SharedMemory::kMaximumMessageBytes - 4, 'a') + "\"]";
    const struct {
        QByteArray bytes;
        const char* answer;
    } cases[] = {
        {Frame(SharedMemory::EncodeArguments(arguments)), "A"},
        {Frame("[]"), "A"},
        {Frame(largest), "A"},
        {QByteArray("\x00\x01\x00\x01", 4), "R"}, // over 64 KiB announced
        {QByteArray("\xff\xff\xff\xff", 4), "R"},
        {Frame(QByteArray()), "R"},
        {Frame("prog /NewNote"), "R"},
        {Frame("{\"prog\": \"/NewNote\"}"), "R"},
        {Frame("[\"prog\", 1]"), "R"},
        {Frame("[\"prog\", \"/ViewDocument \xff\xfe\"]"), "R"}, // not UTF-8
        {Frame("[\"prog\\u0000\", \"/NewNote\"]"), "R"},
        {Frame("[\"prog\"]") + "x", "R"}, // bytes after the message
    };
    for (const auto& c : cases)
        EXPECT_EQ(SendRaw(Path(), c.bytes), QByteArray(c.answer))
            << c.bytes.left(20).toHex().constData();
    EXPECT_EQ(m_handled,
              (QList<QStringList>{
                  arguments, {}, {QString(SharedMemory::kMaximumMessageBytes - 4, u'a')}}));
}

TEST_F(SharedMemoryTest, AStalledSenderDoesNotHoldUpTheNext) {
    ListenAndPublish();
    QLocalSocket stalled;
    stalled.connectToServer(Path());
    ASSERT_TRUE(stalled.waitForConnected(5000));
    stalled.write(QByteArray("\x00\x00\x00\x40[\"prog", 10));
    ASSERT_TRUE(stalled.waitForBytesWritten(5000));

    EXPECT_EQ(SendRaw(Path(), Frame("[\"prog\",\"/OpenDocument\"]")), QByteArray("A"));
    EXPECT_EQ(m_handled,
              (QList<QStringList>{{QStringLiteral("prog"), QStringLiteral("/OpenDocument")}}));
    EXPECT_EQ(stalled.state(), QLocalSocket::ConnectedState);
}

TEST_F(SharedMemoryTest, ADeadNavigatorsSocketIsReplacedAndClosingRemovesOurs) {
    ASSERT_TRUE(MakeDeadSocket(Path()));
    SharedMemoryClient client;
    EXPECT_EQ(client.Connect(kName, QDeadlineTimer(5000)),
              SharedMemoryClient::Connection::NoListener);
    ListenAndPublish();
    EXPECT_EQ(SendRaw(Path(), Frame("[\"prog\"]")), QByteArray("A"));
    m_channel.Close();
    EXPECT_FALSE(QFile::exists(Path()));
}

TEST_F(SharedMemoryTest, ANameTooLongForASocketPathIsShortenedAndATooDeepFolderRefused) {
    // sockaddr_un takes 107 bytes and the terminating NUL; the longest path used is 106.
    const QString base = Home() + QStringLiteral("/r");
    const auto useFolder = [&](qsizetype size) {
        const QString folder = base + QString(size - base.size(), u'x');
        QDir().mkpath(folder);
        QFile::setPermissions(folder, QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
        qputenv("XDG_RUNTIME_DIR", QFile::encodeName(folder));
        return folder;
    };
    const QString name = QStringLiteral("AmbrelNavigator-1.0.0.521-:0-me");
    const QString folder = useFolder(106 - 1 - name.size());
    EXPECT_EQ(SharedMemory::SocketPath(name), folder + u'/' + name);

    // One byte more and the name goes into the path as a short digest, one per name.
    const QString longer = name + u'x';
    const QString shortened = SharedMemory::SocketPath(longer);
    EXPECT_TRUE(shortened.startsWith(folder + u'/')) << shortened.toStdString();
    EXPECT_LE(shortened.size(), 106);
    EXPECT_NE(shortened, SharedMemory::SocketPath(name + u'y'));
    ASSERT_TRUE(m_channel.Listen(longer));
    SharedMemoryClient client;
    EXPECT_EQ(client.Connect(longer, QDeadlineTimer(5000)),
              SharedMemoryClient::Connection::Connected);
    m_channel.Close();

    useFolder(100);
    EXPECT_TRUE(SharedMemory::SocketPath(name).isEmpty());
    EXPECT_FALSE(m_channel.Listen(name));
}

// Only root can become another user; the runtime folder is opened to others for the occasion
// so that the connection reaches the navigator's own check.
TEST_F(SharedMemoryTest, ConnectionsOfAnotherUserAreRefused) {
    if (::geteuid() != 0)
        GTEST_SKIP() << "needs root to connect as another user";
    ListenAndPublish();
    for (const QString& folder : {Home(), RuntimeHome()})
        QFile::setPermissions(folder, QFile::Permissions(0x7011)); // rwx--x--x
    QFile::setPermissions(Path(), QFile::Permissions(0x6066));     // rw-rw-rw-

    const QByteArray path = QFile::encodeName(Path());
    const QByteArray message = Frame("[\"prog\",\"/NewNote\"]");
    const pid_t child = ::fork();
    if (child == 0) {
        // Only plain system calls between fork and _exit.
        if (::setgid(65534) != 0 || ::setuid(65534) != 0)
            ::_exit(10);
        const int fd = ::socket(AF_UNIX, SOCK_STREAM, 0);
        sockaddr_un address{};
        address.sun_family = AF_UNIX;
        std::memcpy(address.sun_path, path.constData(), size_t(path.size()));
        if (::connect(fd, reinterpret_cast<sockaddr*>(&address), sizeof address) != 0)
            ::_exit(11);
        // Cut off before or after writing: either way no answer may come back. A cut-off
        // write must not end the child with SIGPIPE.
        [[maybe_unused]] const auto written =
            ::send(fd, message.constData(), size_t(message.size()), MSG_NOSIGNAL);
        char answer = 0;
        ::_exit(::read(fd, &answer, 1) <= 0 ? 0 : 13);
    }
    ASSERT_GT(child, 0);
    int status = 0;
    bool ended = false;
    ASSERT_TRUE(
        SpinUntil([&] { return ended || (ended = ::waitpid(child, &status, WNOHANG) == child); }));
    ASSERT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 0) << "10: no uid change, 11: no connection, 13: answered";
    EXPECT_TRUE(m_handled.isEmpty());
}

} // namespace
