#include "ui/AmbrelIcons.h"
#include "common/StringTable.h"

#include <gtest/gtest.h>

#include <QIcon>
#include <QImage>

namespace {

// A picture that failed to load renders no pixel that is not fully transparent.
void ExpectDrawn(const QIcon& icon, int what) {
    ASSERT_FALSE(icon.isNull()) << what;
    for (int size : {16, 20}) {
        const QImage image =
            icon.pixmap(size, size).toImage().convertToFormat(QImage::Format_ARGB32);
        int visible = 0;
        for (int y = 0; y < image.height(); ++y)
            for (int x = 0; x < image.width(); ++x)
                visible += qAlpha(image.pixel(x, y)) > 0 ? 1 : 0;
        EXPECT_GT(visible, size * size / 4) << what << " at " << size;
    }
}

TEST(AmbrelIconsTest, EveryTreeAndToolbarPictureIsDrawnWithoutAnIconTheme) {
    // With no icon theme to find, each command falls back on the product's own picture.
    const QStringList searchPaths = QIcon::themeSearchPaths();
    const QStringList fallbackPaths = QIcon::fallbackSearchPaths();
    QIcon::setThemeSearchPaths({});
    QIcon::setFallbackSearchPaths({});

    for (int index = 0; index < AmbrelIcons::TreeImageCount; ++index)
        ExpectDrawn(AmbrelIcons::TreeImage(index), index);
    EXPECT_TRUE(AmbrelIcons::TreeImage(AmbrelIcons::TreeImageCount).isNull());

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
        ExpectDrawn(AmbrelIcons::CommandImage(command), command);

    QIcon::setThemeSearchPaths(searchPaths);
    QIcon::setFallbackSearchPaths(fallbackPaths);
}

} // namespace
