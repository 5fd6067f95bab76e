#include "libs/sheen/ThemedToolbar.h"
#include "libs/sheen/ThemeUtilities.h"
#include "support/AmbrelTest.h"

#include <QApplication>
#include <QImage>

namespace {

class ThemedToolbarTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        m_palette = QApplication::palette();
    }
    void TearDown() override {
        QApplication::setPalette(m_palette);
        AmbrelTest::TearDown();
    }

    static void SetWindowColor(const QColor& color) {
        QPalette palette = QApplication::palette();
        palette.setColor(QPalette::Window, color);
        QApplication::setPalette(palette);
    }

    // The toolbar's colour in the middle of its empty right part.
    static QColor Background(BrindleTheming::ThemedToolbar& toolbar) {
        const QImage image = toolbar.grab().toImage();
        return image.pixelColor(image.width() - 10, image.height() / 2);
    }

    static bool Near(const QColor& a, const QColor& b) {
        return qAbs(a.red() - b.red()) <= 16 && qAbs(a.green() - b.green()) <= 16 &&
               qAbs(a.blue() - b.blue()) <= 16;
    }

private:
    QPalette m_palette;
};

TEST_F(ThemedToolbarTest, LookIsTakenAtInitialiseAndRenewedOnlyByUpdate) {
    BrindleTheming::ThemedToolbar toolbar;
    toolbar.resize(200, 30);
    const QColor green(40, 160, 60);
    const QColor purple(150, 40, 170);
    SetWindowColor(green);
    EXPECT_EQ(BrindleTheming::CurrentToolbarLook(), nullptr);

    InitializeThemeUtilities();
    EXPECT_TRUE(Near(Background(toolbar), green));

    SetWindowColor(purple);
    EXPECT_TRUE(Near(Background(toolbar), green));
    toolbar.setIconSize(QSize(32, 32));
    toolbar.setToolButtonStyle(Qt::ToolButtonIconOnly);
    UpdateThemeUtilities();
    EXPECT_TRUE(Near(Background(toolbar), purple));
    EXPECT_EQ(toolbar.iconSize(), QSize(20, 20));
    EXPECT_EQ(toolbar.toolButtonStyle(), Qt::ToolButtonTextBesideIcon);

    ShutdownThemeUtilities();
    EXPECT_EQ(BrindleTheming::CurrentToolbarLook(), nullptr);
    UpdateThemeUtilities();
    EXPECT_EQ(BrindleTheming::CurrentToolbarLook(), nullptr);
}

} // namespace
