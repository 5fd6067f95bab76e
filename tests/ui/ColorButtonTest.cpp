#include "support/AmbrelTest.h"
#include "ui/CColorButton.h"

#include <QApplication>
#include <QColorDialog>
#include <QImage>
#include <QTest>
#include <QTimer>

#include <functional>

namespace {

class ColorButtonTest : public AmbrelTest {
protected:
    // Acts on the colour dialog once it runs; the click that opens it returns after that.
    static void WhenDialogRuns(std::function<void(QColorDialog*)> act) {
        QTimer::singleShot(0, [act = std::move(act)]() mutable {
            auto* dialog = qobject_cast<QColorDialog*>(QApplication::activeModalWidget());
            if (dialog) {
                act(dialog);
                return;
            }
            ADD_FAILURE() << "no colour dialog";
            for (QWidget* widget : QApplication::topLevelWidgets()) {
                if (auto* other = qobject_cast<QDialog*>(widget))
                    other->reject();
            }
        });
    }
};

TEST_F(ColorButtonTest, SwatchAndArrowFollowColourAndState) {
    const QColor red(255, 0, 0);
    CColorButton button(QStringLiteral("Background color"));
    button.resize(60, 24);
    const QColor defaultColor(button.DefaultColor() & 0xFF, (button.DefaultColor() >> 8) & 0xFF,
                              (button.DefaultColor() >> 16) & 0xFF);
    const QColor grey = button.palette().color(QPalette::Disabled, QPalette::Text);
    const struct {
        const char* name;
        std::uint32_t color;
        bool enabled;
        QColor swatch; // invalid: the swatch is not drawn in this colour
        QColor arrow;
    } cases[] = {
        {"no colour", CColorButton::kNoColor, true, defaultColor, Qt::black},
        {"red", 0x0000FF, true, red, Qt::black},
        {"disabled", 0x0000FF, false, QColor(), grey},
    };
    for (const auto& c : cases) {
        button.SetColor(c.color);
        button.setEnabled(c.enabled);
        const QImage image = button.grab().toImage();
        const QColor swatch = image.pixelColor(button.SwatchRect().center());
        if (c.swatch.isValid())
            EXPECT_EQ(swatch, c.swatch) << c.name;
        else
            EXPECT_NE(swatch, red) << c.name;
        EXPECT_EQ(image.pixelColor(button.ArrowRect().topLeft() + QPoint(1, 0)), c.arrow) << c.name;
    }
}

TEST_F(ColorButtonTest, DialogOkSetsTheChosenColourAndCancelKeepsIt) {
    CColorButton button(QStringLiteral("Background color"));
    button.resize(60, 24);
    button.show();
    button.SetColor(0x00FF00);
    // Pressed, the swatch's black frame moves one pixel right and down.
    const QRect raised = button.SwatchRect();
    const auto framedAt = [&button](const QPoint& corner) {
        return button.grab().toImage().pixelColor(corner) == QColor(Qt::black);
    };
    ASSERT_TRUE(framedAt(raised.topLeft()));

    bool pressedWhileOpen = false;
    WhenDialogRuns([&](QColorDialog* dialog) {
        pressedWhileOpen = framedAt(raised.topLeft() + QPoint(1, 1)) && !framedAt(raised.topLeft());
        dialog->setCurrentColor(QColor(10, 20, 30));
        dialog->reject();
    });
    QTest::mouseClick(&button, Qt::LeftButton);
    EXPECT_TRUE(pressedWhileOpen);
    EXPECT_EQ(button.GetColor(), 0x00FF00u);
    EXPECT_TRUE(framedAt(raised.topLeft()));
    EXPECT_EQ(button.grab().toImage().pixelColor(raised.center()), QColor(0, 255, 0));

    WhenDialogRuns([](QColorDialog* dialog) {
        EXPECT_EQ(dialog->currentColor(), QColor(0, 255, 0));
        dialog->setCurrentColor(QColor(10, 20, 30));
        dialog->accept();
    });
    QTest::mouseClick(&button, Qt::LeftButton);
    EXPECT_EQ(button.GetColor(), 0x1E140Au);
}

} // namespace
