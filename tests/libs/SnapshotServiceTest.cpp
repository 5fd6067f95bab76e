#include "ServicesTestSupport.h"

#include "libs/toolwell/CSnapshotService.h"

#include <QClipboard>
#include <QFileInfo>
#include <QGuiApplication>
#include <QImage>
#include <QRegularExpression>
#include <QScreen>

namespace {

QSize ScreenPixels() {
    const QScreen* screen = QGuiApplication::primaryScreen();
    return screen->geometry().size() * screen->devicePixelRatio();
}

QImage Filled(int side, Qt::GlobalColor color) {
    QImage image(side, side, QImage::Format_RGB32);
    image.fill(color);
    return image;
}

using SnapshotServiceTest = ServicesTest;

TEST_F(SnapshotServiceTest, ScreensAreLaidOutAsTheyStand) {
    // A screen left of and below the primary one, a screen of twice the density to its right,
    // and one whose grab failed.
    const QImage picture = CSnapshotService::ComposeScreens({
        {QRect(0, 0, 2, 2), Filled(2, Qt::red)},
        {QRect(-3, 1, 3, 3), Filled(3, Qt::blue)},
        {QRect(2, 0, 1, 1), Filled(2, Qt::green)},
        {QRect(3, 0, 2, 2), QImage()},
    });
    ASSERT_EQ(picture.size(), QSize(12, 8));
    const QList<QPair<QPoint, Qt::GlobalColor>> pixels{
        {{0, 0}, Qt::black}, {{0, 2}, Qt::blue},  {{5, 7}, Qt::blue},   {{6, 0}, Qt::red},
        {{9, 3}, Qt::red},   {{6, 4}, Qt::black}, {{11, 1}, Qt::green}, {{10, 2}, Qt::black}};
    for (const auto& [at, color] : pixels)
        EXPECT_EQ(picture.pixelColor(at), QColor(color)) << at.x() << "," << at.y();
    EXPECT_TRUE(CSnapshotService::ComposeScreens({{QRect(0, 0, 2, 2), QImage()}}).isNull());

    QGuiApplication::clipboard()->clear();
    ASSERT_EQ(GetSnapshotService()->SnapshotToClipboard(), S_OK);
    EXPECT_EQ(QGuiApplication::clipboard()->image().size(), ScreenPixels());
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
    EXPECT_EQ(size, ScreenPixels());
    // The file's name is the note's title.
    EXPECT_TRUE(QRegularExpression(QStringLiteral("^%1/[^/]+/Snapshot \\d{4}-\\d\\d-\\d\\d "
                                                  "\\d\\d\\.\\d\\d\\.\\d\\d\\.png$")
                                       .arg(QRegularExpression::escape(TempFolder())))
                    .match(handed)
                    .hasMatch())
        << handed.toStdString();

    // A failing handler or none: the answer is passed on. Nothing is ever left behind.
    SetSnapshotNoteHandler([](const QString&) { return E_INVALIDARG; });
    EXPECT_EQ(GetSnapshotService()->SnapshotToNewNote(), E_INVALIDARG);
    SetSnapshotNoteHandler({});
    EXPECT_EQ(GetSnapshotService()->SnapshotToNewNote(), E_FAIL);
    EXPECT_TRUE(TempEntries().isEmpty());
}

TEST_F(SnapshotServiceTest, SnapshotOpensInTheWordProcessor) {
    EXPECT_EQ(GetSnapshotService()->SnapshotToQm(), E_FAIL);
    EXPECT_TRUE(TempEntries().isEmpty());

    InstallWriter();
    ASSERT_EQ(GetSnapshotService()->SnapshotToQm(), S_OK);
    ASSERT_EQ(launcher.starts.size(), 1);
    const QFileInfo document(launcher.starts[0].arguments.value(0));
    EXPECT_EQ(document.suffix(), QStringLiteral("htm"));
    EXPECT_EQ(QImage(document.dir().filePath(document.completeBaseName() + QStringLiteral(".png")))
                  .size(),
              ScreenPixels());
    // Only the word processor's hand-over folder stays; the grab's own folder is gone.
    EXPECT_EQ(TempEntries(), QStringList{document.dir().dirName()});
}

} // namespace
