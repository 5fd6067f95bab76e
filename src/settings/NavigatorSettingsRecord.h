#pragma once

#include "settings/Bool.h"
#include "settings/StringTemplate.h"

#include <QRect>
#include <QString>

// A window rectangle in screen coordinates, by its edges: right and bottom lie just outside
// the window, so the width is right minus left.
struct WindowRect {
    int left = 0;
    int top = 0;
    int right = 0;
    int bottom = 0;

    int Width() const;
    int Height() const;
    // Edges from and to a widget geometry (position and size).
    static WindowRect FromGeometry(const QRect& geometry);
    QRect ToGeometry() const;

    bool operator==(const WindowRect&) const = default;
};

// The navigator's options. The storages enter the settings registry as they are constructed;
// the position, the linked-document limit and the font size are read and written explicitly.
class NavigatorSettingsRecord {
public:
    NavigatorSettingsRecord(const WindowRect& applicationPosition, int maxLinkedDocuments,
                            bool cleanDeletedOnClose, bool launchAppOnStart, bool showNotes,
                            bool showQmd, bool showDoc, bool showPdf, bool showAllTypes,
                            bool showOpenedItemsOnly, const QString& lastSelectedItemId,
                            int defaultFontSize, const QString& defaultFont,
                            const QString& defaultBackgroundColor,
                            const QString& defaultBackgroundImage);

    WindowRect applicationPosition;
    int maxLinkedDocuments;
    Settings::Bool cleanDeletedOnClose;
    Settings::Bool launchAppOnStart;
    Settings::Bool showNotes;
    Settings::Bool showQmd;
    Settings::Bool showDoc;
    Settings::Bool showPdf;
    Settings::Bool showAllTypes;
    Settings::Bool showOpenedItemsOnly;
    Settings::StringTemplate lastSelectedItemId;
    int defaultFontSize;
    Settings::StringTemplate defaultFont;
    Settings::StringTemplate defaultBackgroundColor;
    Settings::StringTemplate defaultBackgroundImage;
};
