#include "ServicesTestSupport.h"

#include "libs/toolwell/CSnapshotService.h"

#include <QClipboard>
#include <QFileInfo>
#include <QGuiApplication>
#include <QImage>
#include <QRegularExpression>
#include <QScreen>

namespace {

class SnapshotServiceTest : public ServicesTest {
protected:
    static QSize ScreenPixels() {
        const QScreen* screen = QGuiApplication::primaryScreen();
        return screen->geometry().size() * screen->devicePixelRatio();
    }
};

TEST_F(SnapshotServiceTest, ScreenIsGrabbedWhole) {
    ASSERT_NE(QGuiApplication::primaryScreen(), nullptr);
    const QImage picture = CSnapshotService::GrabScreens();
    ASSERT_FALSE(picture.isNull());
    EXPECT_EQ(picture.size(), ScreenPixels());

    QGuiApplication::clipboard()->clear();
    ASSERT_EQ(GetSnapshotService()->SnapshotToClipboard(), S_OK);
    EXPECT_EQ(QGuiApplication::clipboard()->image().size(), ScreenPixels());
}

QImage Filled(int width, int height, Qt::GlobalColor color) {
    QImage image(width, height, QImage::Format_RGB32);
    image.fill(color);
    return image;
}

TEST_F(SnapshotServiceTest, ScreensAreLaidOutAsTheyStand) {
    // A screen left of and below the primary one, a screen of twice the density to its right,
    // and one whose grab failed.
    const QImage picture = CSnapshotService::ComposeScreens({
        {QRect(0, 0, 4, 2), Filled(4, 2, Qt::red)},
        {QRect(-3, 1, 3, 3), Filled(3, 3, Qt::blue)},
        {QRect(4, 0, 1, 1), Filled(2, 2, Qt::green)},
        {QRect(5, 0, 2, 2), QImage()},
    });
    ASSERT_EQ(picture.size(), QSize(16, 8));
    const auto at = [&](int x, int y) { return picture.pixelColor(x, y); };
    EXPECT_EQ(at(0, 0), QColor(Qt::black));
    EXPECT_EQ(at(0, 2), QColor(Qt::blue));
    EXPECT_EQ(at(5, 7), QColor(Qt::blue));
    EXPECT_EQ(at(6, 0), QColor(Qt::red));
    EXPECT_EQ(at(13, 3), QColor(Qt::red));
    EXPECT_EQ(at(6, 4), QColor(Qt::black));
    EXPECT_EQ(at(14, 0), QColor(Qt::green));
    EXPECT_EQ(at(15, 1), QColor(Qt::green));
    EXPECT_EQ(at(14, 2), QColor(Qt::black));

    EXPECT_TRUE(CSnapshotService::ComposeScreens({{QRect(0, 0, 2, 2), QImage()}}).isNull());
}

TEST_F(SnapshotServiceTest, NewNoteIsMadeFromAPngThatIsGoneAfterwards) {
    QString handed;
    QSize size;
    SetSnapshotNoteHandler([&](const QString& path) {
        handed = path;
        size = QImage(path, "PNG").size();
        return S_OK;
    });
    ASSERT_EQ(GetSnapshotService()->SnapshotToNewNote(), S_OK);
    EXPECT_TRUE(handed.startsWith(TempFolder() + u'/'));
    // The file's name is the note's title.
    EXPECT_TRUE(
        QRegularExpression(
            QStringLiteral("^Snapshot \\d{4}-\\d\\d-\\d\\d \\d\\d\\.\\d\\d\\.\\d\\d\\.png$"))
            .match(QFileInfo(handed).fileName())
            .hasMatch())
        << handed.toStdString();
    EXPECT_EQ(size, ScreenPixels());
    // A handler that keeps the file (as a failing one does) leaves nothing behind either.
    EXPECT_TRUE(TempEntries().isEmpty());

    SetSnapshotNoteHandler([](const QString&) { return E_INVALIDARG; });
    EXPECT_EQ(GetSnapshotService()->SnapshotToNewNote(), E_INVALIDARG);
    EXPECT_TRUE(TempEntries().isEmpty());

    SetSnapshotNoteHandler({});
    EXPECT_EQ(GetSnapshotService()->SnapshotToNewNote(), E_FAIL);
    EXPECT_TRUE(TempEntries().isEmpty());
}

TEST_F(SnapshotServiceTest, SnapshotOpensInTheWordProcessor) {
    EXPECT_EQ(GetSnapshotService()->SnapshotToQm(), E_FAIL);
    EXPECT_TRUE(TempEntries().isEmpty());

    const QString writer = WriteScript(QStringLiteral("bin/lowriter"));
    ASSERT_EQ(GetSnapshotService()->SnapshotToQm(), S_OK);
    ASSERT_EQ(launcher.starts.size(), 1);
    EXPECT_EQ(launcher.starts[0].program, writer);
    ASSERT_EQ(launcher.starts[0].arguments.size(), 1);
    const QFileInfo document(launcher.starts[0].arguments[0]);
    EXPECT_EQ(document.suffix(), QStringLiteral("htm"));
    const QImage picture(
        document.dir().filePath(document.completeBaseName() + QStringLiteral(".png")));
    EXPECT_EQ(picture.size(), ScreenPixels());
    // Only the word processor's hand-over folder stays; the grab's own folder is gone.
    EXPECT_EQ(TempEntries(), QStringList{document.dir().dirName()});
}

} // namespace
