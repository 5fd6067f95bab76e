#include "support/AmbrelTest.h"
#include "ui/CNavigatorCustomToolbar.h"

#include <QAction>
#include <QHelpEvent>
#include <QMenu>
#include <QTest>
#include <QTimer>
#include <QToolButton>
#include <QToolTip>

namespace {

using Description = CNavigatorCustomToolbar::ButtonDescription;

// The frame's buttons, a split drop-down, and a button with only a tooltip string.
constexpr Description kButtons[] = {
    {32833, 32833,
     CNavigatorCustomToolbar::StyleDropDown | CNavigatorCustomToolbar::StyleWholeDropDown, 0},
    {32824, 32824, CNavigatorCustomToolbar::StyleButton, 0},
    {32834, 32834, CNavigatorCustomToolbar::StyleDropDown, 0},
    {32784, 0, CNavigatorCustomToolbar::StyleButton, 213},
};

class CustomToolbarTest : public AmbrelTest {
protected:
    CustomToolbarTest() : toolbar(20, 20) {}
    void SetUp() override {
        AmbrelTest::SetUp();
        toolbar.AddButtons(kButtons);
        toolbar.show();
    }

    QToolButton* Button(int commandId) {
        return qobject_cast<QToolButton*>(toolbar.widgetForAction(toolbar.ButtonAction(commandId)));
    }

    // The tooltip the button shows on a real help event; empty when it shows none.
    QString ShownToolTip(int commandId) {
        QToolTip::hideText();
        QToolButton* button = Button(commandId);
        QHelpEvent help(QEvent::ToolTip, QPoint(2, 2), button->mapToGlobal(QPoint(2, 2)));
        QCoreApplication::sendEvent(button, &help);
        return QToolTip::isVisible() ? QToolTip::text() : QString();
    }

    CNavigatorCustomToolbar toolbar;
};

TEST_F(CustomToolbarTest, ButtonsCarryTheirCommandNameAndTooltip) {
    const struct {
        int command;
        QString text;
        QString accessibleName;
    } expected[] = {
        {32833, QStringLiteral("Show"), QStringLiteral("Show")},
        {32824, QStringLiteral("New Folder"), QStringLiteral("New Folder")},
        {32834, QStringLiteral("Send To"), QStringLiteral("Send To")},
        {32784, QString(), QStringLiteral("Set as default blog account")},
    };
    for (const auto& e : expected) {
        QAction* action = toolbar.ButtonAction(e.command);
        ASSERT_NE(action, nullptr) << e.command;
        EXPECT_EQ(action->data().toInt(), e.command);
        EXPECT_EQ(action->text(), e.text) << e.command;
        EXPECT_EQ(Button(e.command)->accessibleName(), e.accessibleName) << e.command;
    }
    // Only a button with a tooltip string shows a tooltip.
    EXPECT_EQ(ShownToolTip(32833), QString());
    EXPECT_EQ(ShownToolTip(32824), QString());
    EXPECT_EQ(ShownToolTip(32784), QStringLiteral("Set as default blog account"));
    QToolTip::hideText();

    // No more than twenty buttons.
    std::vector<Description> many(30, Description{32824, 32824, 0, 0});
    toolbar.AddButtons(many);
    EXPECT_EQ(toolbar.actions().size(), CNavigatorCustomToolbar::kMaxButtons);
}

TEST_F(CustomToolbarTest, DropDownButtonsCarryTheirMenu) {
    EXPECT_EQ(toolbar.ButtonAction(32824)->menu(), nullptr);
    EXPECT_EQ(Button(32834)->popupMode(), QToolButton::MenuButtonPopup);
    ASSERT_NE(toolbar.ButtonAction(32834)->menu(), nullptr);

    QMenu* show = toolbar.ButtonAction(32833)->menu();
    ASSERT_NE(show, nullptr);
    EXPECT_EQ(Button(32833)->popupMode(), QToolButton::InstantPopup);
    show->addAction(QStringLiteral("Notes"));
    bool shown = false;
    QTimer::singleShot(0, [&] {
        shown = show->isVisible();
        show->close();
    });
    // A click anywhere on the button opens the menu, in a nested loop the timer ends.
    QTest::mouseClick(Button(32833), Qt::LeftButton);
    EXPECT_TRUE(shown);
}

} // namespace
