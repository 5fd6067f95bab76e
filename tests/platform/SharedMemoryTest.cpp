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
        m_channel.Publish([this](const QString& text) { m_handled.append(text); });
    }

    SharedMemory m_channel;
    QStringList m_handled;
};

TEST_F(SharedMemoryTest, HandsTheTextToTheHandlerAndThenAnswers) {
    ListenAndPublish();
    const QByteArray message("\x00\x00\x00\x10prog /NewNote \xc3\xbc", 20);
    EXPECT_EQ(SendRaw(Path(), message), QByteArray("A"));
    EXPECT_EQ(m_handled, QStringList{QStringLiteral("prog /NewNote \u00fc")});

    EXPECT_EQ(SendRaw(Path(), Frame(QByteArray())), QByteArray("A"));
    ASSERT_EQ(m_handled.size(), 2);
    EXPECT_TRUE(m_handled[1].isEmpty());
}

TEST_F(SharedMemoryTest, MalformedMessagesAreRefusedAndNeverHandled) {
    ListenAndPublish();
    const struct {
        const char* what;
        QByteArray bytes;
    } cases[] = {
        {"over 64 KiB announced", QByteArray("\x00\x01\x00\x01", 4)},
        {"huge length", QByteArray("\xff\xff\xff\xff", 4)},
        {"not UTF-8", Frame("prog /ViewDocument \xff\xfe")},
        {"NUL inside", Frame(QByteArray("prog\0/NewNote", 13))},
        {"bytes after the message", Frame("prog /NewNote") + "x"},
    };
    for (const auto& c : cases)
        EXPECT_EQ(SendRaw(Path(), c.bytes), QByteArray("R")) << c.what;
    EXPECT_TRUE(m_handled.isEmpty());

    const QByteArray largest(SharedMemory::kMaximumMessageBytes, 'a');
    EXPECT_EQ(SendRaw(Path(), Frame(largest)), QByteArray("A"));
    ASSERT_EQ(m_handled.size(), 1);
    EXPECT_EQ(m_handled[0].size(), SharedMemory::kMaximumMessageBytes);
}

TEST_F(SharedMemoryTest, AStalledSenderDoesNotHoldUpTheNext) {
    ListenAndPublish();
    QLocalSocket stalled;
    stalled.connectToServer(Path());
    ASSERT_TRUE(stalled.waitForConnected(5000));
    stalled.write(QByteArray("\x00\x00\x00\x40prog", 8));
    ASSERT_TRUE(stalled.waitForBytesWritten(5000));

    EXPECT_EQ(SendRaw(Path(), Frame("prog /OpenDocument")), QByteArray("A"));
    EXPECT_EQ(m_handled, QStringList{QStringLiteral("prog /OpenDocument")});
    EXPECT_EQ(stalled.state(), QLocalSocket::ConnectedState);
}

TEST_F(SharedMemoryTest, MessagesWaitUntilPublishedAndThoseWhoseSenderLeftAreSkipped) {
    ASSERT_TRUE(m_channel.Listen(kName));
    QLocalSocket gaveUp;
    gaveUp.connectToServer(Path());
    ASSERT_TRUE(gaveUp.waitForConnected(5000));
    gaveUp.write(Frame("prog /NewNote"));
    ASSERT_TRUE(gaveUp.waitForBytesWritten(5000));

    QLocalSocket waiting;
    waiting.connectToServer(Path());
    ASSERT_TRUE(waiting.waitForConnected(5000));
    waiting.write(Frame("prog /OpenDocument"));
    ASSERT_TRUE(waiting.waitForBytesWritten(5000));
    SpinFor(100);
    EXPECT_EQ(waiting.bytesAvailable(), 0);
    gaveUp.abort();

    m_channel.Publish([this](const QString& text) { m_handled.append(text); });
    ASSERT_TRUE(SpinUntil([&] { return waiting.bytesAvailable() > 0; }));
    EXPECT_EQ(waiting.readAll(), QByteArray("A"));
    EXPECT_EQ(m_handled, QStringList{QStringLiteral("prog /OpenDocument")});
}

TEST_F(SharedMemoryTest, ADeadNavigatorsSocketIsReplacedAndClosingRemovesOurs) {
    ASSERT_TRUE(MakeDeadSocket(Path()));
    SharedMemoryClient client;
    EXPECT_EQ(client.Connect(kName, QDeadlineTimer(5000)),
              SharedMemoryClient::Connection::NoListener);

    ListenAndPublish();
    EXPECT_EQ(SendRaw(Path(), Frame("prog")), QByteArray("A"));

    m_channel.Close();
    EXPECT_FALSE(m_channel.IsListening());
    EXPECT_FALSE(QFile::exists(Path()));
    EXPECT_EQ(client.Connect(kName, QDeadlineTimer(5000)),
              SharedMemoryClient::Connection::NoListener);
}

TEST_F(SharedMemoryTest, SocketPathsTooLongForTheSystemAreRefused) {
    // sockaddr_un takes 107 bytes and the terminating NUL; the longest path used is 106.
    const QString base = Home() + QStringLiteral("/r");
    const qsizetype room = 106 - (base.size() + 1 + kName.size());
    ASSERT_GT(room, 0);
    const QString folder = base + QString(room, u'x');
    ASSERT_TRUE(QDir().mkpath(folder));
    QFile::setPermissions(folder, QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
    qputenv("XDG_RUNTIME_DIR", QFile::encodeName(folder));
    EXPECT_EQ(SharedMemory::SocketPath(kName).size(), 106);
    EXPECT_TRUE(m_channel.Listen(kName));
    m_channel.Close();

    const QString longer = kName + u'x';
    EXPECT_TRUE(SharedMemory::SocketPath(longer).isEmpty());
    EXPECT_FALSE(m_channel.Listen(longer));
}

// Only root can become another user; the runtime folder is opened to others for the occasion
// so that the connection reaches the navigator's own check.
TEST_F(SharedMemoryTest, ConnectionsOfAnotherUserAreRefused) {
    if (::geteuid() != 0)
        GTEST_SKIP() << "needs root to connect as another user";
    ListenAndPublish();
    for (const QString& folder : {Home(), RuntimeHome()})
        QFile::setPermissions(folder, QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner |
                                          QFile::ExeGroup | QFile::ExeOther);
    QFile::setPermissions(Path(), QFile::ReadOwner | QFile::WriteOwner | QFile::ReadGroup |
                                      QFile::WriteGroup | QFile::ReadOther | QFile::WriteOther);

    const QByteArray path = QFile::encodeName(Path());
    const QByteArray message = Frame("prog /NewNote");
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
