#include "support/AmbrelTest.h"

#include "../platform/InstanceTestSupport.h"
#include "RecordingStartActions.h"
#include "app/ForwardedCommandLine.h"
#include "app/SingleInstance.h"

#include <QFile>
#include <QThread>

#include <atomic>
#include <future>

namespace {

using namespace std::chrono_literals;
using Outcome = SingleInstance::Outcome;

const QString kName = QStringLiteral("AmbrelNavigator-1.0.0.521-:0-me");

// Runs a start in a thread of its own, as it would run in a process of its own.
template <class Start> auto InOwnThread(Start start) {
    auto promise = std::make_shared<std::promise<decltype(start())>>();
    auto future = promise->get_future();
    QThread* thread = QThread::create([promise, start] { promise->set_value(start()); });
    QObject::connect(thread, &QThread::finished, thread, &QObject::deleteLater);
    thread->start();
    return future;
}

class SingleInstanceTest : public AmbrelTest {
protected:
    QString SocketPath() const { return RuntimeHome() + u'/' + kName; }
    QString LockPath() const { return SocketPath() + QStringLiteral("-StartupMutex"); }

    // A later start while this thread runs the event loop of the navigator under test.
    struct LaterStart {
        Outcome outcome;
        bool handledBeforeItEnded;
    };
    LaterStart StartAnother(const QStringList& arguments, std::chrono::milliseconds patience) {
        auto later = InOwnThread([=, this] {
            SingleInstance instance(kName);
            const Outcome outcome = instance.Start(arguments, patience);
            return LaterStart{outcome, m_handlerReturned.load()};
        });
        EXPECT_TRUE(SpinUntil([&] { return later.wait_for(0s) == std::future_status::ready; }));
        return later.get();
    }

    // The running navigator's side: the text runs its start actions.
    void PublishTo(SingleInstance& instance) {
        instance.Publish([this](const QString& text) {
            RunForwardedCommandLine(text, m_actions);
            m_handlerReturned = true;
        });
    }

    RecordingStartActions m_actions;
    std::atomic<bool> m_handlerReturned{false};
};

TEST(InstanceNameTest, NamesVersionDesktopAndUserWhereKnown) {
    EXPECT_EQ(SingleInstance::InstanceName(QStringLiteral(":0"), QStringLiteral("me")),
              QStringLiteral("AmbrelNavigator-1.0.0.521-:0-me"));
    EXPECT_EQ(SingleInstance::InstanceName(QString(), QStringLiteral("me")),
              QStringLiteral("AmbrelNavigator-1.0.0.521-me"));
    EXPECT_EQ(SingleInstance::InstanceName(QString(), QString()),
              QStringLiteral("AmbrelNavigator-1.0.0.521"));
    // A display given as a path must not turn the name into a path.
    EXPECT_EQ(SingleInstance::InstanceName(QStringLiteral("/run/user/1000/wayland-0"),
                                           QStringLiteral("a%2Fb")),
              QStringLiteral("AmbrelNavigator-1.0.0.521-%2Frun%2Fuser%2F1000%2Fwayland-0-a%252Fb"));
}

TEST_F(SingleInstanceTest, ASecondStartHandsOverAndEndsAfterTheActionsRan) {
    SingleInstance running(kName);
    ASSERT_EQ(running.Start({QStringLiteral("ambrel-navigator")}), Outcome::Running);
    EXPECT_TRUE(running.HoldsLock());
    EXPECT_TRUE(QFile::exists(SocketPath()));
    PublishTo(running);

    // The lock is still held by the running navigator's start-up: the later start gets through
    // on the socket all the same.
    const LaterStart later =
        StartAnother({QStringLiteral("/usr/bin/ambrel-navigator"), QStringLiteral("/ViewDocument"),
                      QStringLiteral("/home/me/My Notes/a b.pdf")},
                     SingleInstance::kPatience);
    EXPECT_EQ(later.outcome, Outcome::HandedOver);
    EXPECT_TRUE(later.handledBeforeItEnded);
    EXPECT_EQ(m_actions.calls,
              QStringList{QStringLiteral("ViewDocument(/home/me/My Notes/a b.pdf)")});

    running.EndStartup();
    EXPECT_FALSE(running.HoldsLock());
    m_handlerReturned = false;
    EXPECT_EQ(StartAnother({QStringLiteral("prog"), QStringLiteral("-NewNote")}, 10s).outcome,
              Outcome::HandedOver);
    EXPECT_EQ(m_actions.calls.size(), 2);
}

TEST_F(SingleInstanceTest, NoAnswerBeforeTheNavigatorIsPublishedAndNothingRunsLater) {
    SingleInstance running(kName);
    ASSERT_EQ(running.Start({QStringLiteral("prog")}), Outcome::Running);

    EXPECT_EQ(StartAnother({QStringLiteral("prog"), QStringLiteral("/NewNote")}, 300ms).outcome,
              Outcome::NoAnswer);
    PublishTo(running);
    EXPECT_EQ(StartAnother({QStringLiteral("prog"), QStringLiteral("/OpenDocument")}, 10s).outcome,
              Outcome::HandedOver);
    // The start that gave up said so; its note must not appear behind its back.
    EXPECT_EQ(m_actions.calls, QStringList{QStringLiteral("OpenDocument")});
}

TEST_F(SingleInstanceTest, ANavigatorThatWasKilledIsReplaced) {
    ASSERT_TRUE(MakeDeadLock(LockPath()));
    ASSERT_TRUE(MakeDeadSocket(SocketPath()));

    SingleInstance next(kName);
    EXPECT_EQ(next.Start({QStringLiteral("prog")}, 1s), Outcome::Running);
    EXPECT_TRUE(next.HoldsLock());
    PublishTo(next);
    EXPECT_EQ(StartAnother({QStringLiteral("prog"), QStringLiteral("/NewNote")}, 10s).outcome,
              Outcome::HandedOver);
}

TEST_F(SingleInstanceTest, AWithdrawnNavigatorMakesLaterStartsWaitUntilItIsGone) {
    auto running = std::make_unique<SingleInstance>(kName);
    ASSERT_EQ(running->Start({QStringLiteral("prog")}), Outcome::Running);
    PublishTo(*running);
    running->EndStartup();

    running->Withdraw();
    EXPECT_TRUE(running->HoldsLock());
    EXPECT_FALSE(QFile::exists(SocketPath()));
    SingleInstance later(kName);
    EXPECT_EQ(later.Start({QStringLiteral("prog"), QStringLiteral("/NewNote")}, 200ms),
              Outcome::NoAnswer);

    running.reset();
    EXPECT_EQ(later.Start({QStringLiteral("prog"), QStringLiteral("/NewNote")}, 200ms),
              Outcome::Running);
    EXPECT_TRUE(m_actions.calls.isEmpty());
}

TEST_F(SingleInstanceTest, AStartWaitingOnANavigatorThatShutsDownBecomesTheNavigatorAfterIt) {
    auto running = std::make_unique<SingleInstance>(kName);
    ASSERT_EQ(running->Start({QStringLiteral("prog")}), Outcome::Running);
    // Not answering yet, so the later start is still waiting when the shut-down begins.
    running->EndStartup();
    auto later = InOwnThread([] {
        SingleInstance instance(kName);
        return instance.Start({QStringLiteral("prog"), QStringLiteral("/NewNote")});
    });
    SpinFor(300);

    running->Withdraw();
    EXPECT_TRUE(running->HoldsLock());
    SpinFor(300);
    EXPECT_EQ(later.wait_for(0s), std::future_status::timeout);

    running.reset();
    ASSERT_TRUE(SpinUntil([&] { return later.wait_for(0s) == std::future_status::ready; }));
    EXPECT_EQ(later.get(), Outcome::Running);
}

TEST_F(SingleInstanceTest, ACommandLineThatCannotTravelIsNotHandedOver) {
    SingleInstance running(kName);
    ASSERT_EQ(running.Start({QStringLiteral("prog")}), Outcome::Running);
    PublishTo(running);

    EXPECT_EQ(StartAnother({QStringLiteral("prog"), QStringLiteral("/ViewDocument"),
                            QStringLiteral("/home/me/\"quoted\".pdf")},
                           10s)
                  .outcome,
              Outcome::NotCarried);
    const QString huge(SharedMemory::kMaximumMessageBytes, u'x');
    EXPECT_EQ(
        StartAnother({QStringLiteral("prog"), QStringLiteral("/ViewDocument"), huge}, 10s).outcome,
        Outcome::NotCarried);
    EXPECT_TRUE(m_actions.calls.isEmpty());

    // With no navigator running such a command line is simply this start's own.
    SingleInstance alone(QStringLiteral("AmbrelNavigator-other"));
    EXPECT_EQ(alone.Start({QStringLiteral("prog"), huge}), Outcome::Running);
}

} // namespace
