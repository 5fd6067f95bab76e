#include "ui/CNavigatorCustomToolbar.h"

#include "common/StringTable.h"
#include "ui/AmbrelIcons.h"

#include <QAction>
#include <QEvent>
#include <QHelpEvent>
#include <QMenu>
#include <QToolButton>
#include <QToolTip>

namespace {

// Tooltips are cut to what the toolbar's tooltip request could hold.
constexpr qsizetype kToolTipLength = 80;

QString LoadOptionalString(std::uint32_t id) {
    return id == 0 ? QString() : LoadString(static_cast<int>(id));
}

} // namespace

CNavigatorCustomToolbar::CNavigatorCustomToolbar(int imageWidth, int imageHeight, QWidget* parent)
    : ThemedToolbar(parent) {
    SetImageSize(QSize(imageWidth, imageHeight));
}

int CNavigatorCustomToolbar::AddButtons(std::span<const ButtonDescription> descriptions) {
    for (const ButtonDescription& description : descriptions) {
        if (m_buttonCount == kMaxButtons)
            break;
        ++m_buttonCount;
        if (description.style & StyleSeparator) {
            addSeparator();
            continue;
        }
        const int commandId = static_cast<int>(description.commandId);
        const QString text = LoadOptionalString(description.textId);
        QAction* action = addAction(AmbrelIcons::CommandImage(commandId), text);
        action->setData(commandId);
        action->setCheckable(description.style & StyleCheck);
        QToolButton* button = qobject_cast<QToolButton*>(widgetForAction(action));
        if (description.style & StyleDropDown) {
            auto* menu = new QMenu(text, this);
            action->setMenu(menu);
            button->setPopupMode(description.style & StyleWholeDropDown
                                     ? QToolButton::InstantPopup
                                     : QToolButton::MenuButtonPopup);
        }
        const QString toolTip = LoadOptionalString(description.tooltipId);
        if (!toolTip.isNull())
            m_toolTips.insert(commandId, toolTip.left(kToolTipLength));
        // Without a text the accessible name falls back on the tooltip, then on the command's
        // own name, so a picture-only button is still named.
        QString name = !text.isEmpty() ? text : toolTip;
        if (name.isEmpty())
            name = LoadString(commandId);
        button->setAccessibleName(name);
        button->installEventFilter(this);
    }
    return 1;
}

QAction* CNavigatorCustomToolbar::ButtonAction(int commandId) const {
    for (QAction* action : actions()) {
        if (!action->isSeparator() && action->data().toInt() == commandId)
            return action;
    }
    return nullptr;
}

QString CNavigatorCustomToolbar::ToolTipText(int commandId) const {
    return m_toolTips.value(commandId);
}

// Buttons show only their own tooltip strings; Qt would otherwise offer the button's text.
bool CNavigatorCustomToolbar::eventFilter(QObject* watched, QEvent* event) {
    if (event->type() != QEvent::ToolTip)
        return ThemedToolbar::eventFilter(watched, event);
    auto* button = qobject_cast<QToolButton*>(watched);
    const QAction* action = button ? button->defaultAction() : nullptr;
    const QString text = action ? ToolTipText(action->data().toInt()) : QString();
    if (text.isEmpty())
        QToolTip::hideText();
    else
        QToolTip::showText(static_cast<QHelpEvent*>(event)->globalPos(), text, button);
    return true;
}
