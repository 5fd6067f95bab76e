#include "app/CNavigatorApp.h"
#include "libs/toolwell/CHarborUtils.h"
#include "support/AmbrelTest.h"

#include <QApplication>

namespace {

// A utility engine whose readiness the test chooses.
class FakeHarborUtils final : public IHarborUtils {
public:
    bool IsReady() override { return ready; }
    bool IsEnabled() override { return enabled; }
    void* GetMessageCenter() override { return nullptr; }
    int IsFeatureAvailable(int) override { return 0; }
    void ShowMessageArchive() override {}
    void CheckForUpdates() override {}
    void SetStartupBubbleEnabled(bool) override {}
    int IsStartupBubbleEnabled() override { return 0; }
    void SetNavigatorRect(const QRect&) override {}
    void OnNavigatorClosing() override {}
    void GetMessageCenterSize(int*, int*) override {}
    void SetShuttingDown(bool flag) override { shuttingDownCalls.append(flag); }
    void RunQmoStartAction() override {}

    bool ready = true;
    bool enabled = true;
    QList<bool> shuttingDownCalls;
};

class NavigatorAppTest : public AmbrelTest {};

TEST_F(NavigatorAppTest, StartUpStopsCleanlyWhenTheUtilityEngineIsNotReady) {
    for (const bool ready : {false, true}) {
        FakeHarborUtils utils;
        utils.ready = ready;
        utils.enabled = false; // also covers IsEnabled when ready
        SetHarborUtilsForTesting(&utils);

        CNavigatorApp app;
        EXPECT_EQ(app.Run(), 0);
        EXPECT_EQ(app.MainWindow(), nullptr) << "no window may be left behind";
        EXPECT_TRUE(QApplication::topLevelWidgets().isEmpty());
        EXPECT_TRUE(utils.shuttingDownCalls.isEmpty());
        EXPECT_NE(GetHarborUtilsInterface(), &utils) << "the utility engine was not released";
        ReleaseHarborUtilsInterface();
    }
}

TEST_F(NavigatorAppTest, StartUpShowsTheWindowAtItsDefaultPlace) {
    FakeHarborUtils utils;
    SetHarborUtilsForTesting(&utils);
    CNavigatorApp app;
    ASSERT_TRUE(app.InitInstance());
    ASSERT_NE(app.MainWindow(), nullptr);
    EXPECT_TRUE(app.MainWindow()->isVisible());
    EXPECT_EQ(app.MainWindow()->frameGeometry().topLeft(), QPoint(0, 0));
    EXPECT_EQ(app.MainWindow()->size(), QSize(280, 650));
    EXPECT_EQ(utils.shuttingDownCalls, QList<bool>{false});

    // With the window gone the next idle pass ends the program.
    delete app.MainWindow();
    EXPECT_FALSE(app.OnIdle(0));
    EXPECT_EQ(app.ExitInstance(), 0);
    EXPECT_NE(GetHarborUtilsInterface(), &utils);
}

} // namespace
