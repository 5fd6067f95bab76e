#include "NavigatorProcess.h"
#include "support/AmbrelTest.h"

namespace {

class StartupTest : public AmbrelTest {};

TEST_F(StartupTest, TerminationSignalShutsTheProgramDownCleanly) {
    NavigatorProcess navigator(Home());
    navigator.Start();
    ASSERT_TRUE(navigator.WaitUntilRunning());
    ASSERT_TRUE(navigator.Terminate());
    EXPECT_EQ(navigator.Process().exitStatus(), QProcess::NormalExit);
    EXPECT_EQ(navigator.Process().exitCode(), 0);
}

} // namespace
