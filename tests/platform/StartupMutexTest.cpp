#include "support/AmbrelTest.h"

#include "InstanceTestSupport.h"
#include "platform/StartupMutex.h"

#include <QFile>

namespace {

using std::chrono::milliseconds;

const QString kName = QStringLiteral("AmbrelNavigator-test");

class StartupMutexTest : public AmbrelTest {};

TEST_F(StartupMutexTest, OneHolderAtATimeUntilReleasedOrDestroyed) {
    StartupMutex first;
    ASSERT_TRUE(first.Create(kName));
    EXPECT_EQ(first.FilePath(),
              RuntimeHome() + QStringLiteral("/AmbrelNavigator-test-StartupMutex"));
    ASSERT_TRUE(first.Wait());

    {
        StartupMutex second;
        ASSERT_TRUE(second.Create(kName));
        EXPECT_FALSE(second.Wait(milliseconds(0)));
        EXPECT_FALSE(second.Wait(milliseconds(30)));
        EXPECT_FALSE(second.IsOwned());

        EXPECT_TRUE(first.Release());
        EXPECT_FALSE(first.IsOwned());
        EXPECT_TRUE(second.Wait(milliseconds(0)));
        EXPECT_FALSE(first.Wait(milliseconds(0)));
    }
    // The destroyed holder gave the lock up.
    EXPECT_TRUE(first.Wait(milliseconds(0)));
    EXPECT_TRUE(first.Release());
    EXPECT_FALSE(QFile::exists(first.FilePath()));
}

TEST_F(StartupMutexTest, ALockLeftByADeadStartIsTakenOver) {
    StartupMutex mutex;
    ASSERT_TRUE(mutex.Create(kName));
    ASSERT_TRUE(MakeDeadLock(mutex.FilePath()));
    EXPECT_TRUE(mutex.Wait(milliseconds(0)));
}

} // namespace
