#include "app/CCommandRouter.h"
#include "app/CNavigatorApp.h"
#include "common/StringTable.h"
#include "libs/sheen/ThemedToolbar.h"
#include "libs/toolwell/CHarborUtils.h"
#include "navigator/WNavDS.h"
#include "navigator/WNavigatorTree.h"
#include "settings/NavigatorSettings.h"
#include "support/AmbrelTest.h"
#include "support/FakeHarborUtils.h"
#include "ui/CMsgCenterDlgBar.h"
#include "ui/CNavigatorCustomToolbar.h"
#include "ui/WMainFrame.h"

#include <QAction>
#include <QApplication>
#include <QImage>
#include <QMenu>
#include <QSet>
#include <QTest>
#include <QTimer>
#include <QToolButton>

#include <memory>

namespace {

using namespace Qt::StringLiterals;

class MainFrameTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        SetHarborUtilsForTesting(&utils);
    }
    void TearDown() override {
        frame.reset();
        ReleaseHarborUtilsInterface();
        AmbrelTest::TearDown();
    }

    WMainFrame* Show(int width = 280, int height = 650) {
        frame = std::make_unique<WMainFrame>();
        frame->resize(width, height);
        frame->show();
        NavigatorSettings::Instance()->SetFrame(frame.get());
        QApplication::processEvents();
        return frame.get();
    }

    // The button of a command in a toolbar, in frame coordinates.
    QRect Button(QToolBar* toolbar, int commandId) const {
        QWidget* button = toolbar->widgetForAction(frame->CommandRouter()->Action(commandId));
        if (button == nullptr) {
            for (auto* child : toolbar->findChildren<QToolButton*>()) {
                if (child->defaultAction() && child->defaultAction()->data() == commandId)
                    button = child;
            }
        }
        if (button == nullptr || !button->isVisible())
            return {};
        return QRect(button->mapTo(frame.get(), QPoint()), button->size());
    }

    // Opens the drop-down's menu as a click on its arrow would, and answers the command ids of
    // its entries.
    QList<int> MenuEntries(int commandId) {
        QList<int> ids;
        QMenu* menu = frame->DropDownMenu(commandId);
        QTimer::singleShot(0, [&] {
            for (QAction* action : menu->actions()) {
                if (!action->isSeparator())
                    ids.append(action->data().toInt());
            }
            menu->close();
        });
        menu->exec(frame->mapToGlobal(QPoint(10, 10)));
        return ids;
    }

    FakeHarborUtils utils;
    std::unique_ptr<WMainFrame> frame;
};

TEST_F(MainFrameTest, BarsStackInOrderWithTheRightHandGroupsAtTheRightEdgeAtAnyWidth) {
    Show();
    // Neither the user nor the layout makes the client area smaller than its minimum.
    frame->resize(100, 100);
    QApplication::processEvents();
    EXPECT_EQ(frame->size(), QSize(268, 292));

    for (const int width : {280, 900}) {
        SCOPED_TRACE(width);
        frame->resize(width, 650);
        QApplication::processEvents();
        const int mainY = frame->MainToolbar()->y();
        EXPECT_LT(mainY, frame->CustomToolbar()->y());
        EXPECT_LT(frame->CustomToolbar()->y(), frame->Tree()->y());
        EXPECT_LT(frame->Tree()->y(), frame->DocumentToolbar()->y());
        EXPECT_EQ(frame->DocumentToolbar()->geometry().bottom(), frame->rect().bottom())
            << "something lies below the document toolbar";
        EXPECT_EQ(frame->MessageCentreBar(), nullptr);

        const std::pair<QToolBar*, QList<int>> bars[] = {
            {frame->MainToolbar(), {32769, 32774, 32771, 32775, 57670, 32783}},
            {frame->DocumentToolbar(), {32825, 32826, 32834, 32829, 32830, 32831}},
        };
        for (const auto& [toolbar, commands] : bars) {
            int right = -1;
            for (int command : commands) {
                const QRect button = Button(toolbar, command);
                // A button pushed into the overflow menu is hidden.
                ASSERT_FALSE(button.isEmpty()) << command << " is not shown";
                EXPECT_GT(button.left(), right) << command << " is out of order";
                right = button.right();
            }
            EXPECT_GE(right, width - 12) << "the last button is not at the right edge";
        }
    }
    // Where the texts fit they stand beside the pictures; the main toolbar shows pictures alone
    // in the narrow window, still named for screen readers.
    EXPECT_EQ(frame->MainToolbar()->toolButtonStyle(), Qt::ToolButtonTextBesideIcon);
    frame->resize(280, 650);
    QApplication::processEvents();
    EXPECT_EQ(frame->MainToolbar()->toolButtonStyle(), Qt::ToolButtonIconOnly);
    EXPECT_EQ(frame->CustomToolbar()->toolButtonStyle(), Qt::ToolButtonTextBesideIcon);
    for (auto* button : frame->findChildren<QToolButton*>()) {
        if (button->isVisible() && button->defaultAction()) {
            EXPECT_FALSE(button->accessibleName().isEmpty());
        }
    }
}

TEST_F(MainFrameTest, ButtonsAndMenuEntriesRunTheirCommandOnce) {
    Show();
    CCommandRouter* router = frame->CommandRouter();
    QList<int> runs;
    for (const int id : {32824, 32794})
        router->Register({id}, {[&runs, id] { runs.append(id); }, nullptr, nullptr});
    CNavigatorCustomToolbar* custom = frame->CustomToolbar();
    QTest::mouseClick(custom->widgetForAction(custom->ButtonAction(32824)), Qt::LeftButton);
    // The first entry of the "Show" drop-down, picked with the keyboard in its open menu.
    QTimer::singleShot(0, [] {
        QWidget* popup = QApplication::activePopupWidget();
        ASSERT_NE(popup, nullptr);
        QTest::keyClick(popup, Qt::Key_Down);
        QTest::keyClick(popup, Qt::Key_Return);
    });
    QTest::mousePress(custom->widgetForAction(custom->ButtonAction(32833)), Qt::LeftButton);
    EXPECT_EQ(runs, (QList<int>{32824, 32794}));

    // Keep on Top follows the setting whichever way it changes.
    auto* keepOnTop =
        qobject_cast<QToolButton*>(frame->MainToolbar()->widgetForAction(router->Action(32783)));
    QTest::mouseClick(keepOnTop, Qt::LeftButton);
    EXPECT_TRUE(NavigatorSettings::Instance()->GetKeepOnTop());
    EXPECT_TRUE(frame->windowFlags().testFlag(Qt::WindowStaysOnTopHint));
    NavigatorSettings::Instance()->SetKeepOnTop(false);
    frame->OnIdleWork();
    EXPECT_FALSE(keepOnTop->isChecked());
}

TEST_F(MainFrameTest, TheHelpMenuOffersTheMessageCentreEntriesOnlyWithTheMessageCentre) {
    for (const bool available : {false, true}) {
        SCOPED_TRACE(available);
        utils.messageCentre = available;
        utils.messageCentreSize = QSize(100, 30);
        Show();
        const QList<int> entries = MenuEntries(57670);
        EXPECT_TRUE(entries.contains(32776));
        // No user guide lies beside the test program.
        EXPECT_FALSE(entries.contains(32862));
        for (const int id : {32851, 32924, 32800})
            EXPECT_EQ(entries.contains(id), available) << id;
        EXPECT_EQ(MenuEntries(32833), (QList<int>{32794, 32795, 32796, 32797, 32798, 32799}));
        EXPECT_EQ(MenuEntries(32834), (QList<int>{32827, 32828, 32923}));
    }
}

TEST_F(MainFrameTest, TheMessageCentreSitsBelowTheDocumentToolbarCentredWhenNarrower) {
    utils.messageCentre = true;
    const struct {
        QSize centre;
        int frameWidth;
        int x;
    } cases[] = {{{200, 40}, 400, 100}, {{500, 40}, 400, 0}, {{101, 30}, 301, 100}};
    for (const auto& [centre, frameWidth, x] : cases) {
        SCOPED_TRACE(frameWidth);
        utils.messageCentreSize = centre;
        Show(frameWidth, 500);
        CMsgCenterDlgBar* bar = frame->MessageCentreBar();
        ASSERT_NE(bar, nullptr);
        ASSERT_EQ(frame->DocumentToolbar()->width(), frameWidth);
        EXPECT_GT(bar->y(), frame->DocumentToolbar()->y());
        EXPECT_EQ(bar->geometry().bottom(), frame->rect().bottom());
        EXPECT_EQ(bar->height(), centre.height());
        EXPECT_EQ(bar->MessageCentreWindow()->geometry(), QRect(QPoint(x, 0), centre));

        NavigatorSettings::Instance()->SetShowMessageCentre(false);
        EXPECT_FALSE(bar->isVisible());
        NavigatorSettings::Instance()->SetShowMessageCentre(true);
        EXPECT_TRUE(bar->isVisible());
    }
}

TEST_F(MainFrameTest, TheStartupBubbleWaitsForTheWindowToBeActivated) {
    Show();
    NavigatorSettings::Instance()->SetApplicationPosition({10, 20, 290, 670});
    QWidget other;
    other.show();
    other.activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(&other));

    frame->StartBubbleTimer(1);
    ASSERT_TRUE(QTest::qWaitFor([&] { return frame->IsBubblePending(); }));
    EXPECT_TRUE(utils.bubbleRects.isEmpty()) << "shown while another window was active";

    frame->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(frame.get()));
    EXPECT_EQ(utils.bubbleRects, (QList<QRect>{QRect(10, 20, 280, 650)}));
    EXPECT_FALSE(frame->IsBubblePending());

    // Once only.
    other.activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(&other));
    frame->activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(frame.get()));
    EXPECT_EQ(utils.bubbleRects.size(), 1);
}

TEST_F(MainFrameTest, TheStartedWindowShowsTheNotebook) {
    const QString folder = u"0F8FAD5B-D9CB-469F-A165-70867728950E"_s;
    const QString note = u"7C9E6679-7425-40DE-944B-E07FC1F90AE7"_s;
    WriteFile(
        u"data/Brindle/Quillmark Ambrel/Catalog/catalog.xml"_s,
        QStringLiteral("<?xml version=\"1.0\" encoding=\"UTF-8\"?><archive><organization><root>"
                       "<child uuidref=\"%1\"><child uuidref=\"%2\"/></child></root></organization>"
                       "<items><folder uuid=\"%1\"><properties><type>folder</type><title>Recipes"
                       "</title><expanded>true</expanded></properties></folder><note uuid=\"%2\">"
                       "<properties><type>note</type><open>false</open><title>Lentil soup</title>"
                       "</properties></note></items></archive>")
            .arg(folder, note)
            .toUtf8());
    CNavigatorApp app({u"ambrel-navigator"_s});
    ASSERT_TRUE(app.InitInstance());
    app.OnIdle(0);
    WNavigatorTree* tree = app.MainWindow()->Tree();
    QApplication::processEvents();
    const QImage shot = app.MainWindow()->grab().toImage();

    for (const QString& id : {folder, note}) {
        QTreeWidgetItem* item = tree->ItemOf(id);
        ASSERT_NE(item, nullptr) << id.toStdString();
        const QRect row = tree->visualItemRect(item);
        ASSERT_FALSE(row.isEmpty());
        EXPECT_LE(row.bottom(), tree->viewport()->height()) << "the row is out of sight";
        // A blank row is one colour; a shown one has its picture and text on it.
        const QRect inFrame(tree->viewport()->mapTo(app.MainWindow(), row.topLeft()), row.size());
        QSet<QRgb> colours;
        for (int y = inFrame.top(); y <= inFrame.bottom(); ++y) {
            for (int x = inFrame.left(); x <= inFrame.right(); ++x)
                colours.insert(shot.pixel(x, y));
        }
        EXPECT_GT(colours.size(), 8) << id.toStdString() << " is drawn blank";
    }
    EXPECT_EQ(tree->ItemOf(note)->text(0), u"Lentil soup"_s);
    delete app.MainWindow();
    app.ExitInstance();
}

} // namespace
