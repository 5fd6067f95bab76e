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

QColor Mix(const QColor& background, const QColor& picture, int backgroundShare) {
    const auto mix = [&](int b, int p) {
        return (b * backgroundShare + p * (255 - backgroundShare)) / 255;
    };
    return QColor(mix(background.red(), picture.red()), mix(background.green(), picture.green()),
                  mix(background.blue(), picture.blue()));
}

void ExpectNear(const QColor& actual, const QColor& expected, const char* where) {
    EXPECT_LE(qAbs(actual.red() - expected.red()), 2) << where;
    EXPECT_LE(qAbs(actual.green() - expected.green()), 2) << where;
    EXPECT_LE(qAbs(actual.blue() - expected.blue()), 2) << where;
}

class TransparentBitmapTest : public AmbrelTest {};

TEST_F(TransparentBitmapTest, KeyShowsBackgroundDisabledFadesBlackFaceInverts) {
    const QColor inverted(255 - kPicture.red(), 255 - kPicture.green(), 255 - kPicture.blue());
    const struct {
        const char* name;
        bool enabled;
        QColor face;
        QColor picturePixel;
    } cases[] = {
        {"enabled", true, QColor(240, 240, 240), kPicture},
        {"disabled", false, QColor(240, 240, 240), Mix(kBackground, kPicture, 186)},
        {"enabled on black", true, Qt::black, inverted},
        {"disabled on black", false, Qt::black, Mix(kBackground, inverted, 127)},
    };
    const QImage picture = HalfKeyedPicture();
    const QImage original = picture.copy();
    for (const auto& c : cases) {
        QImage target(12, 12, QImage::Format_RGB32);
        target.fill(kBackground);
        {
            QPainter painter(&target);
            // Stretched to twice its size, off the origin.
            TransparentBitmap(painter, QRect(2, 2, 8, 8), picture, c.enabled, c.face);
        }
        for (const QPoint key : {QPoint(2, 2), QPoint(5, 9)})
            EXPECT_EQ(target.pixelColor(key), kBackground) << c.name << " key";
        for (const QPoint inside : {QPoint(6, 2), QPoint(9, 9)})
            ExpectNear(target.pixelColor(inside), c.picturePixel, c.name);
        for (const QPoint outside : {QPoint(1, 5), QPoint(10, 5), QPoint(6, 10)})
            EXPECT_EQ(target.pixelColor(outside), kBackground) << c.name << " outside";
    }
    EXPECT_EQ(picture, original);
}

TEST_F(TransparentBitmapTest, ControlsDrawTheirPictureOverTheirBackground) {
    QImage solid(20, 20, QImage::Format_RGB32);
    solid.fill(kPicture);
    CBmpButton button(QStringLiteral("Add"));
    button.resize(28, 28);
    button.SetBitmap(solid);
    const QPoint centre(14, 14);
    EXPECT_EQ(button.grab().toImage().pixelColor(centre), kPicture);
    button.setEnabled(false);
    // Beside the picture, on the same row, the disabled face shows as it is.
    const QImage disabled = button.grab().toImage();
    ExpectNear(disabled.pixelColor(centre), Mix(disabled.pixelColor(3, 14), kPicture, 186),
               "disabled");

    QWidget dialog;
    dialog.resize(40, 40);
    QPalette palette = dialog.palette();
    palette.setColor(QPalette::Window, kBackground);
    dialog.setPalette(palette);
    dialog.setAutoFillBackground(true);
    CXparentStatic label(QStringLiteral("Logo"), &dialog);
    label.setGeometry(10, 10, 20, 20);
    label.setPixmap(QPixmap::fromImage(HalfKeyedPicture()));
    const QImage shown = dialog.grab().toImage();
    EXPECT_EQ(shown.pixelColor(12, 20), kBackground);
    EXPECT_EQ(shown.pixelColor(27, 20), kPicture);
}

} // namespace
