#include "ui/AmbrelIcons.h"
#include "common/StringTable.h"

#include <gtest/gtest.h>

#include <QIcon>
#include <QImage>
#include <QStringList>

#include <utility>

namespace {

constexpr int kSizes[] = {16, 20};

QImage Render(const QIcon& icon, int size) {
    return icon.pixmap(size, size).toImage().convertToFormat(QImage::Format_ARGB32);
}

// Pixels that are not fully transparent: a picture that failed to load renders none.
int VisiblePixels(const QImage& image) {
    int count = 0;
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x)
            count += qAlpha(image.pixel(x, y)) > 0 ? 1 : 0;
    return count;
}

void ExpectDrawn(const QIcon& icon, const char* what) {
    ASSERT_FALSE(icon.isNull()) << what;
    for (int size : kSizes) {
        const QImage image = Render(icon, size);
        EXPECT_EQ(image.size(), QSize(size, size)) << what;
        EXPECT_GT(VisiblePixels(image), size * size / 4) << what << " at " << size;
    }
}

TEST(AmbrelIconsTest, EveryTreeImageIsDrawnAndEachStateLooksDifferent) {
    for (int index = 0; index < AmbrelIcons::TreeImageCount; ++index)
        ExpectDrawn(AmbrelIcons::TreeImage(index), qPrintable(QString::number(index)));

    EXPECT_TRUE(AmbrelIcons::TreeImage(-1).isNull());
    EXPECT_TRUE(AmbrelIcons::TreeImage(AmbrelIcons::TreeImageCount).isNull());

    // Collapsed against expanded, closed against open and against deleted.
    const std::pair<int, int> differing[] = {{0, 1},  {2, 3},   {4, 5},   {4, 6},   {5, 7},
                                             {8, 9},  {8, 10},  {9, 10},  {11, 12}, {11, 13},
                                             {8, 11}, {14, 15}, {14, 16}, {15, 16}, {17, 18}};
    for (const auto& [first, second] : differing)
        for (int size : kSizes)
            EXPECT_NE(Render(AmbrelIcons::TreeImage(first), size),
                      Render(AmbrelIcons::TreeImage(second), size))
                << first << " and " << second << " at " << size;
}

TEST(AmbrelIconsTest, EveryToolbarCommandHasItsOwnPictureWithoutAnIconTheme) {
    // With no icon theme to find, each command falls back on the product's own picture.
    const QStringList searchPaths = QIcon::themeSearchPaths();
    const QStringList fallbackPaths = QIcon::fallbackSearchPaths();
    QIcon::setThemeSearchPaths({});
    QIcon::setFallbackSearchPaths({});

    constexpr int kHelpTopics = 57670;
    const int commands[] = {StringId::NewNote,
                            StringId::OpenDocument,
                            StringId::SnapshotToNewNote,
                            StringId::Settings,
                            kHelpTopics,
                            StringId::KeepOnTop,
                            StringId::CloseAllNotes,
                            StringId::CloseAllDocuments,
                            StringId::SendTo,
                            StringId::Print,
                            StringId::Restore,
                            StringId::Delete,
                            StringId::Show,
                            StringId::NewFolder,
                            StringId::ActivityCenter};
    for (int command : commands)
        ExpectDrawn(AmbrelIcons::CommandImage(command), qPrintable(QString::number(command)));
    EXPECT_TRUE(AmbrelIcons::CommandImage(StringId::About).isNull());

    QIcon::setThemeSearchPaths(searchPaths);
    QIcon::setFallbackSearchPaths(fallbackPaths);
}

} // namespace
