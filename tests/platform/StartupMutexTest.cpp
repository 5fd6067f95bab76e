#include "support/AmbrelTest.h"

#include "InstanceTestSupport.h"
#include "platform/StartupMutex.h"

#include <QFile>

namespace {

using std::chrono::milliseconds;

class StartupMutexTest : public AmbrelTest {};

TEST_F(StartupMutexTest, OneHolderAtATimeUntilReleasedOrDestroyed) {
    StartupMutex first;
    ASSERT_TRUE(first.Create(QStringLiteral("AmbrelNavigator-test")));
    EXPECT_EQ(first.FilePath(),
              RuntimeHome() + QStringLiteral("/AmbrelNavigator-test-StartupMutex"));
    ASSERT_TRUE(first.Wait());
    {
        StartupMutex second;
        ASSERT_TRUE(second.Create(QStringLiteral("AmbrelNavigator-test")));
        EXPECT_FALSE(second.Wait(milliseconds(30)));
        EXPECT_FALSE(second.IsOwned());

        EXPECT_TRUE(first.Release());
        EXPECT_TRUE(second.Wait(milliseconds(0)));
        EXPECT_FALSE(first.Wait(milliseconds(0)));
    }
    // The destroyed holder gave the lock up.
    EXPECT_TRUE(first.Wait(milliseconds(0)));
    EXPECT_TRUE(first.Release());
    EXPECT_FALSE(QFile::exists(first.FilePath()));

    // So does a start that was killed while it held the lock.
    ASSERT_TRUE(MakeDeadLock(first.FilePath()));
    EXPECT_TRUE(first.Wait(milliseconds(0)));
}

} // namespace
