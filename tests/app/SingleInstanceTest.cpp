#include "support/AmbrelTest.h"

#include "../platform/InstanceTestSupport.h"
#include "RecordingStartActions.h"
#include "app/SingleInstance.h"

#include <QFile>

#include <future>

#include <poll.h>
#include <sys/wait.h>

namespace {

using namespace std::chrono_literals;
using namespace Qt::StringLiterals;
using Outcome = SingleInstance::Outcome;

const QString kName = u"AmbrelNavigator-1.0.0.521-:0-me"_s;

class SingleInstanceTest : public AmbrelTest {
protected:
    QString SocketPath() const { return RuntimeHome() + u'/' + kName; }

    // A later start while this thread runs the event loop of the navigator under test.
    static Outcome StartAnother(const QStringList& arguments,
                                std::chrono::milliseconds patience = 10s) {
        // In a thread of its own, as it would run in a process of its own.
        auto later = std::async(std::launch::async, [=] {
            SingleInstance instance(kName);
            return instance.Start(arguments, patience);
        });
        EXPECT_TRUE(SpinUntil([&] { return later.wait_for(0s) == std::future_status::ready; }));
        return later.get();
    }

    RecordingStartActions m_actions;
};

TEST(InstanceNameTest, NamesVersionDesktopAndUserAsOneFileName) {
    EXPECT_EQ(SingleInstance::InstanceName(u":0"_s, u"me"_s), kName);
    // A display given as a path must not turn the name into a path.
    EXPECT_EQ(SingleInstance::InstanceName(u"/run/user/1000/wayland-0"_s, u"a%2Fb"_s),
              u"AmbrelNavigator-1.0.0.521-%2Frun%2Fuser%2F1000%2Fwayland-0-a%252Fb"_s);
}

TEST_F(SingleInstanceTest, AStartIsAnsweredOnceQueuedAndTheActionsRunLaterInTheOrderTheyCame) {
    SingleInstance running(kName);
    ASSERT_EQ(running.Start({u"ambrel-navigator"_s}), Outcome::Running);
    EXPECT_TRUE(running.HoldsLock());
    EXPECT_EQ(StartAnother({u"prog"_s, u"/NewNote"_s}, 300ms), Outcome::NoAnswer);

    // The lock is still held by the running navigator's start-up: the later start gets through
    // on the socket all the same.
    int arrived = 0;
    running.Publish([&] { ++arrived; });
    EXPECT_EQ(StartAnother({u"/usr/bin/ambrel-navigator"_s, u"/ViewDocument"_s,
                            u"/home/me/My Notes/a b.pdf"_s}),
              Outcome::HandedOver);
    running.EndStartup();
    EXPECT_FALSE(running.HoldsLock());
    EXPECT_EQ(StartAnother({u"prog"_s, u"-OpenDocument"_s}), Outcome::HandedOver);
    EXPECT_EQ(arrived, 2);
    EXPECT_TRUE(m_actions.calls.isEmpty()) << "ran before the idle pass";

    running.RunHandedOver(m_actions);
    running.RunHandedOver(m_actions);
    // The start that gave up said so; its note must not appear behind its back.
    EXPECT_EQ(m_actions.calls,
              (QStringList{u"ViewDocument(/home/me/My Notes/a b.pdf)"_s, u"OpenDocument"_s}));
}

TEST_F(SingleInstanceTest, AStartWaitingOnANavigatorThatShutsDownBecomesTheNavigatorAfterIt) {
    auto running = std::make_unique<SingleInstance>(kName);
    ASSERT_EQ(running->Start({u"prog"_s}), Outcome::Running);
    // Not answering yet, so the later start is still waiting when the shut-down begins.
    running->EndStartup();
    auto later = std::async(std::launch::async, [] {
        SingleInstance instance(kName);
        return instance.Start({u"prog"_s, u"/NewNote"_s});
    });
    SpinFor(300);

    // Withdrawn, the navigator holds the lock again until it is gone: no second one may start.
    running->Withdraw();
    EXPECT_TRUE(running->HoldsLock());
    EXPECT_FALSE(QFile::exists(SocketPath()));
    SpinFor(300);
    EXPECT_EQ(later.wait_for(0s), std::future_status::timeout);

    running.reset();
    ASSERT_TRUE(SpinUntil([&] { return later.wait_for(0s) == std::future_status::ready; }));
    EXPECT_EQ(later.get(), Outcome::Running);
}

TEST_F(SingleInstanceTest, EveryArgumentTravelsAsItIsAndOnlyAnOversizedCommandLineIsRefused) {
    SingleInstance running(kName);
    ASSERT_EQ(running.Start({u"prog"_s}), Outcome::Running);
    running.Publish({});

    const QString file = u"/home/me/\"quoted\" \\ and  blank\nline.pdf"_s;
    EXPECT_EQ(StartAnother({u"prog"_s, u"/ViewDocument"_s, file}), Outcome::HandedOver);
    const QString huge(SharedMemory::kMaximumMessageBytes, u'x');
    EXPECT_EQ(StartAnother({u"prog"_s, u"/ViewDocument"_s, huge}), Outcome::NotCarried);
    running.RunHandedOver(m_actions);
    EXPECT_EQ(m_actions.calls, QStringList{u"ViewDocument("_s + file + u')'});

    // With no navigator running such a command line is simply this start's own.
    SingleInstance alone(u"AmbrelNavigator-other"_s);
    EXPECT_EQ(alone.Start({u"prog"_s, huge}), Outcome::Running);
}

// Only root can listen as another user: the socket is bound as root, then the listener drops
// to another user, whose id the kernel records at listen().
TEST_F(SingleInstanceTest, ASocketOfAnotherUserNeverGetsTheCommandLine) {
    if (::geteuid() != 0)
        GTEST_SKIP() << "needs root to listen as another user";
    const QByteArray path = QFile::encodeName(SocketPath());
    int ready[2];
    ASSERT_EQ(::pipe(ready), 0);
    const pid_t child = ::fork();
    if (child == 0) {
        // Only plain system calls between fork and _exit.
        const int fd = ::socket(AF_UNIX, SOCK_STREAM, 0);
        sockaddr_un address{};
        address.sun_family = AF_UNIX;
        std::memcpy(address.sun_path, path.constData(), size_t(path.size()));
        if (::bind(fd, reinterpret_cast<sockaddr*>(&address), sizeof address) != 0 ||
            ::setresgid(65534, 65534, 65534) != 0 || ::setresuid(65534, 65534, 65534) != 0 ||
            ::listen(fd, 4) != 0)
            ::_exit(10);
        [[maybe_unused]] const auto told = ::write(ready[1], "r", 1);
        pollfd waiting{fd, POLLIN, 0};
        if (::poll(&waiting, 1, 5000) != 1)
            ::_exit(11);
        pollfd peer{::accept(fd, nullptr, nullptr), POLLIN, 0};
        char byte = 0;
        ::_exit(::poll(&peer, 1, 3000) == 1 && ::read(peer.fd, &byte, 1) == 1 ? 13 : 0);
    }
    ASSERT_GT(child, 0);
    ::close(ready[1]);
    char byte = 0;
    ASSERT_EQ(::read(ready[0], &byte, 1), 1) << "the other user's listener did not start";
    ::close(ready[0]);

    SingleInstance instance(kName);
    EXPECT_EQ(instance.Start({u"prog"_s, u"/NewNote"_s}, 3s), Outcome::Unavailable);
    int status = 0;
    ASSERT_EQ(::waitpid(child, &status, 0), child);
    ASSERT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), 0) << "10: no listener, 11: no connection, 13: received";
}

} // namespace
