#include "ui/TransparentBitmap.h"
#include "support/AmbrelTest.h"
#include "ui/CBmpButton.h"
#include "ui/CXparentStatic.h"

#include <QImage>
#include <QPainter>
#include <QPixmap>

namespace {

const QColor kBackground(10, 120, 240);
const QColor kPicture(200, 40, 20);
const QColor kMagenta(255, 0, 255);

// A 4 by 4 picture: magenta on the left half, the picture colour on the right half.
QImage HalfKeyedPicture() {
    QImage picture(4, 4, QImage::Format_RGB32);
    picture.fill(kPicture);
    for (int y = 0; y < 4; ++y) {
        picture.setPixelColor(0, y, kMagenta);
        picture.setPixelColor(1, y, kMagenta);
    }
    return picture;
}

class TransparentBitmapTest : public AmbrelTest {};

// Magenta is the transparent key: where the picture has it, the background shows through.
TEST_F(TransparentBitmapTest, TheKeyShowsTheBackgroundAndControlsDrawTheirPicture) {
    const QImage picture = HalfKeyedPicture();
    const QImage original = picture.copy();
    QImage target(12, 12, QImage::Format_RGB32);
    target.fill(kBackground);
    {
        QPainter painter(&target);
        // Stretched to twice its size, off the origin.
        TransparentBitmap(painter, QRect(2, 2, 8, 8), picture, true, QColor(240, 240, 240));
    }
    for (const QPoint key : {QPoint(2, 2), QPoint(5, 9)})
        EXPECT_EQ(target.pixelColor(key), kBackground) << "key";
    for (const QPoint inside : {QPoint(6, 2), QPoint(9, 9)})
        EXPECT_EQ(target.pixelColor(inside), kPicture) << "inside";
    for (const QPoint outside : {QPoint(1, 5), QPoint(10, 5), QPoint(6, 10)})
        EXPECT_EQ(target.pixelColor(outside), kBackground) << "outside";
    EXPECT_EQ(picture, original);

    // A button and a keyed label draw their pictures over their background.
    QImage solid(20, 20, QImage::Format_RGB32);
    solid.fill(kPicture);
    CBmpButton button(QStringLiteral("Add"));
    button.resize(28, 28);
    button.SetBitmap(solid);
    EXPECT_EQ(button.grab().toImage().pixelColor(14, 14), kPicture);

    QWidget dialog;
    dialog.resize(40, 40);
    QPalette palette = dialog.palette();
    palette.setColor(QPalette::Window, kBackground);
    dialog.setPalette(palette);
    dialog.setAutoFillBackground(true);
    CXparentStatic label(QStringLiteral("Logo"), &dialog);
    label.setGeometry(10, 10, 20, 20);
    label.setPixmap(QPixmap::fromImage(picture));
    const QImage shown = dialog.grab().toImage();
    EXPECT_EQ(shown.pixelColor(12, 20), kBackground);
    EXPECT_EQ(shown.pixelColor(27, 20), kPicture);
}

} // namespace
