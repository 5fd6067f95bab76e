#include "app/IdlePass.h"
#include "support/AmbrelTest.h"

#include <QAbstractEventDispatcher>
#include <QCoreApplication>
#include <QEventLoop>
#include <QTimer>

namespace {

// Counts the events it receives.
class Receiver final : public QObject {
public:
    bool event(QEvent* event) override {
        if (event->type() == QEvent::User) {
            ++received;
            return true;
        }
        return QObject::event(event);
    }
    int received = 0;
};

// Runs a real event loop (the idle pass only runs when a loop is about to wait) for a while.
void RunLoopFor(int milliseconds) {
    QEventLoop loop;
    QTimer::singleShot(milliseconds, &loop, &QEventLoop::quit);
    loop.exec();
}

TEST(IdlePassTest, RunsOnceAfterABurstOfPostedEventsHasBeenHandled) {
    Receiver receiver;
    QList<int> receivedAtPass;
    QList<int> counts;
    IdlePass idle([&](int count) {
        receivedAtPass.append(receiver.received);
        counts.append(count);
        return false;
    });
    idle.Start();
    for (int i = 0; i < 500; ++i)
        QCoreApplication::postEvent(&receiver, new QEvent(QEvent::User));

    RunLoopFor(200);

    ASSERT_FALSE(receivedAtPass.isEmpty());
    EXPECT_EQ(receivedAtPass.first(), 500) << "the pass ran before the queue was empty";
    EXPECT_EQ(counts.first(), 0);
}

TEST(IdlePassTest, AskingForMoreRunsAgainWithTheNextCountThenStops) {
    QList<int> counts;
    IdlePass idle([&](int count) {
        counts.append(count);
        return count < 2;
    });
    idle.Start();
    RunLoopFor(150);
    EXPECT_EQ(counts, (QList<int>{0, 1, 2}));
}

TEST(IdlePassTest, AnIdleProgramDoesNotSpin) {
    int passes = 0;
    IdlePass idle([&](int) {
        ++passes;
        return false;
    });
    idle.Start();
    RunLoopFor(100);
    ASSERT_GE(passes, 1);

    int wakeUps = 0;
    QObject::connect(QAbstractEventDispatcher::instance(), &QAbstractEventDispatcher::aboutToBlock,
                     &idle, [&] { ++wakeUps; });
    const int passesBefore = passes;
    RunLoopFor(300);
    // Only the timer that ends the wait may wake the loop; a spinning loop wakes thousands of
    // times, and a new event is needed for another pass.
    EXPECT_LT(wakeUps, 10);
    EXPECT_LE(passes - passesBefore, 1);
}

TEST(IdlePassTest, ANewEventStartsTheCountAgain) {
    QList<int> counts;
    Receiver receiver;
    IdlePass idle([&](int count) {
        counts.append(count);
        return count < 1;
    });
    idle.Start();
    RunLoopFor(100);
    ASSERT_EQ(counts, (QList<int>{0, 1}));

    counts.clear();
    QTimer::singleShot(0, &receiver,
                       [&] { QCoreApplication::postEvent(&receiver, new QEvent(QEvent::User)); });
    RunLoopFor(100);
    ASSERT_GE(counts.size(), 2);
    EXPECT_EQ(counts.mid(0, 2), (QList<int>{0, 1}));
    EXPECT_EQ(receiver.received, 1);
}

} // namespace
