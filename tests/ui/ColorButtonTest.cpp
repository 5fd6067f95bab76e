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

TEST_F(ColorButtonTest, DialogOkSetsTheChosenColourAndCancelKeepsIt) {
    CColorButton button(QStringLiteral("Background color"));
    button.resize(60, 24);
    button.show();
    button.SetColor(0x00FF00);

    WhenDialogRuns([](QColorDialog* dialog) {
        dialog->setCurrentColor(QColor(10, 20, 30));
        dialog->reject();
    });
    QTest::mouseClick(&button, Qt::LeftButton);
    EXPECT_EQ(button.GetColor(), 0x00FF00u);
    EXPECT_EQ(button.grab().toImage().pixelColor(button.SwatchRect().center()), QColor(0, 255, 0));

    WhenDialogRuns([](QColorDialog* dialog) {
        EXPECT_EQ(dialog->currentColor(), QColor(0, 255, 0));
        dialog->setCurrentColor(QColor(10, 20, 30));
        dialog->accept();
    });
    QTest::mouseClick(&button, Qt::LeftButton);
    EXPECT_EQ(button.GetColor(), 0x1E140Au);
}

} // namespace
