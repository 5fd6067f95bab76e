#include "support/AmbrelTest.h"
#include "support/RecordingForeignWindows.h"
#include "ui/CNavigatorWindows.h"

#include <QWidget>

#include <memory>

namespace {

using Platform::ShowCommand::Maximize;
using Platform::ShowCommand::Minimize;
using Platform::ShowCommand::Restore;

TEST(NavigatorWindowsTest, TheOwnWindowIsActedOnHereAndEveryOtherGoesToItsProgram) {
    RecordingForeignWindows others;
    others.alive = {1, 7};
    auto own = std::make_unique<QWidget>();
    own->show();
    const Platform::WindowHandle handle = CNavigatorWindows::HandleOf(own.get());
    CNavigatorWindows windows(own.get(), &others);

    EXPECT_TRUE(windows.IsWindow(handle));
    EXPECT_TRUE(windows.Show(handle, Minimize));
    EXPECT_TRUE(own->isMinimized());
    EXPECT_TRUE(windows.Show(handle, Maximize));
    EXPECT_TRUE(own->isMaximized());
    EXPECT_TRUE(windows.Show(handle, Restore));
    EXPECT_FALSE(own->isMaximized() || own->isMinimized());
    EXPECT_TRUE(others.requests.isEmpty()) << "the own window never goes to the bus";

    // The other programs' windows are numbered from 1 up: none of them is the own window,
    // whatever number the window system gives it.
    EXPECT_TRUE(windows.Close(1));
    EXPECT_TRUE(own->isVisible());
    EXPECT_TRUE(windows.Show(7, Minimize));
    EXPECT_FALSE(windows.IsWindow(8));
    ASSERT_EQ(others.requests.size(), 2);
    EXPECT_EQ(others.requests[0].operation, QStringLiteral("Close"));
    EXPECT_EQ(others.requests[1].showCommand, Minimize);

    // Once the window has gone its number means nothing here any more.
    own.reset();
    EXPECT_FALSE(windows.IsWindow(handle));
    EXPECT_FALSE(windows.Close(handle));
    EXPECT_EQ(others.requests.last().operation, QStringLiteral("Close"));
}

} // namespace
