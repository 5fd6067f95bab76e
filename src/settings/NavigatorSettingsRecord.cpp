#include "settings/NavigatorSettingsRecord.h"

#include <cstdint>

namespace {

// Edges and sizes come from a file that anyone may edit; wrap around like the 32-bit machine
// arithmetic they were written with instead of overflowing.
int WrappingAdd(int a, int b) {
    return static_cast<int>(static_cast<std::uint32_t>(a) + static_cast<std::uint32_t>(b));
}

int WrappingSubtract(int a, int b) {
    return static_cast<int>(static_cast<std::uint32_t>(a) - static_cast<std::uint32_t>(b));
}

} // namespace

int WindowRect::Width() const {
    return WrappingSubtract(right, left);
}

int WindowRect::Height() const {
    return WrappingSubtract(bottom, top);
}

WindowRect WindowRect::FromGeometry(const QRect& geometry) {
    return {geometry.x(), geometry.y(), WrappingAdd(geometry.x(), geometry.width()),
            WrappingAdd(geometry.y(), geometry.height())};
}

QRect WindowRect::ToGeometry() const {
    return {left, top, Width(), Height()};
}

NavigatorSettingsRecord::NavigatorSettingsRecord(
    const WindowRect& applicationPosition, int maxLinkedDocuments, bool cleanDeletedOnClose,
    bool launchAppOnStart, bool showNotes, bool showQmd, bool showDoc, bool showPdf,
    bool showAllTypes, bool showOpenedItemsOnly, const QString& lastSelectedItemId,
    int defaultFontSize, const QString& defaultFont, const QString& defaultBackgroundColor,
    const QString& defaultBackgroundImage)
    : applicationPosition(applicationPosition), maxLinkedDocuments(maxLinkedDocuments),
      cleanDeletedOnClose(QStringLiteral("cleandeletedonclose"), cleanDeletedOnClose),
      launchAppOnStart(QStringLiteral("launchapponstart"), launchAppOnStart),
      showNotes(QStringLiteral("shownotes"), showNotes),
      showQmd(QStringLiteral("showqmd"), showQmd), showDoc(QStringLiteral("showdoc"), showDoc),
      showPdf(QStringLiteral("showpdf"), showPdf),
      showAllTypes(QStringLiteral("showalltypes"), showAllTypes),
      showOpenedItemsOnly(QStringLiteral("showopeneditemsonly"), showOpenedItemsOnly),
      lastSelectedItemId(QStringLiteral("lastselecteditemid"), lastSelectedItemId),
      defaultFontSize(defaultFontSize), defaultFont(QStringLiteral("defaultfont"), defaultFont),
      defaultBackgroundColor(QStringLiteral("defaultbackgroundcolor"), defaultBackgroundColor),
      defaultBackgroundImage(QStringLiteral("defaultbackgroundimage"), defaultBackgroundImage) {}
