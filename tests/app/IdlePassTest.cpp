#include "app/IdlePass.h"
#include "support/AmbrelTest.h"

#include <QAbstractEventDispatcher>
#include <QEventLoop>
#include <QTimer>

namespace {

// Runs a real event loop (the idle pass only runs when a loop is about to wait) for a while.
void RunLoopFor(int milliseconds) {
    QEventLoop loop;
    QTimer::singleShot(milliseconds, &loop, &QEventLoop::quit);
    loop.exec();
}

TEST(IdlePassTest, RunsAfterABurstOfEventsAndCountsUpWhileAskedForMore) {
    QObject receiver;
    int received = 0;
    QList<int> receivedAtPass;
    QList<int> counts;
    IdlePass idle([&](int count) {
        receivedAtPass.append(received);
        counts.append(count);
        return count < 2;
    });
    idle.Start();
    for (int i = 0; i < 500; ++i)
        QMetaObject::invokeMethod(
            &receiver, [&] { ++received; }, Qt::QueuedConnection);
    RunLoopFor(150);
    ASSERT_EQ(counts, (QList<int>{0, 1, 2}));
    EXPECT_EQ(receivedAtPass.first(), 500) << "the pass ran before the queue was empty";
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

} // namespace
