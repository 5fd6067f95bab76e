#include "ui/CBmpButton.h"

#include "ui/TransparentBitmap.h"

#include <QPainter>
#include <QStyle>
#include <QStyleOptionButton>
#include <QStyleOptionFocusRect>

namespace {

// The width of the push-button frame and of the edge inside it.
constexpr int kFrame = 2;
constexpr int kEdge = 2;

} // namespace

CBmpButton::CBmpButton(const QString& accessibleName, QWidget* parent) : QPushButton(parent) {
    setAccessibleName(accessibleName);
}

void CBmpButton::SetBitmap(const QImage& bitmap) {
    m_bitmap = bitmap;
    update();
}

QRect CBmpButton::ContentRect(const QRect& bounds, bool pressed) {
    QRect content = bounds.adjusted(kFrame, kFrame, -kFrame, -kFrame);
    if (pressed)
        content.translate(1, 1);
    return content;
}

void CBmpButton::DrawFrame(QPainter& painter, const QPushButton& button, const QRect& content,
                           bool pressed, bool focused) {
    QStyleOptionButton option;
    option.initFrom(&button);
    option.state &= ~QStyle::State_HasFocus;
    option.state |= pressed ? QStyle::State_Sunken : QStyle::State_Raised;
    button.style()->drawControl(QStyle::CE_PushButtonBevel, &option, &painter, &button);
    if (!focused)
        return;
    QStyleOptionFocusRect focus;
    focus.initFrom(&button);
    focus.rect = content.adjusted(1, 1, -1, -1);
    button.style()->drawPrimitive(QStyle::PE_FrameFocusRect, &focus, &painter, &button);
}

void CBmpButton::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    const bool pressed = isDown();
    const QRect content = ContentRect(rect(), pressed);
    DrawFrame(painter, *this, content, pressed, hasFocus());
    const QRect picture = content.adjusted(kEdge, kEdge, -kEdge, -kEdge);
    painter.setClipRect(picture);
    TransparentBitmap(painter, picture, m_bitmap, isEnabled(), palette().color(QPalette::Button));
}
