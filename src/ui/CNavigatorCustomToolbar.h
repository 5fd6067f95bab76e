#pragma once

#include "libs/sheen/ThemedToolbar.h"

#include <QHash>
#include <QString>

#include <cstdint>
#include <span>

class QAction;

// The frame's second toolbar: buttons with their own texts, tooltips and styles, described by
// command id and string ids. Each button is an action whose data is its command id; its picture
// is the command's picture of the product's icon set.
class CNavigatorCustomToolbar : public BrindleTheming::ThemedToolbar {
    Q_OBJECT
public:
    // Toolbar button styles as the descriptions give them.
    enum ButtonStyle : std::uint32_t {
        StyleButton = 0x00,
        StyleSeparator = 0x01,
        StyleCheck = 0x02,
        StyleDropDown = 0x08,
        StyleWholeDropDown = 0x80,
    };

    // One button: its command, the string ids of its text and tooltip (0: none) and its style
    // (0: a plain button). A drop-down button gets an empty menu for its owner to fill; with
    // StyleWholeDropDown the whole button opens it, otherwise only its arrow.
    struct ButtonDescription {
        std::uint32_t commandId;
        std::uint32_t textId;
        std::uint32_t style;
        std::uint32_t tooltipId;
    };

    static constexpr int kMaxButtons = 20;

    CNavigatorCustomToolbar(int imageWidth, int imageHeight, QWidget* parent = nullptr);

    // Adds the buttons in order; those beyond the twentieth are left out. Answers 1.
    int AddButtons(std::span<const ButtonDescription> descriptions);

    // The button of a command, or null.
    QAction* ButtonAction(int commandId) const;
    // The tooltip of a command's button; a null string when it has none.
    QString ToolTipText(int commandId) const;

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    int m_buttonCount = 0;
    QHash<int, QString> m_toolTips;
};
