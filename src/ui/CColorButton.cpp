#include "ui/CColorButton.h"

#include "ui/CBmpButton.h"

#include <QColorDialog>
#include <QPainter>
#include <QPointer>

namespace {

constexpr int kEdge = 2;

QColor ToQColor(std::uint32_t color) {
    return QColor(color & 0xFF, (color >> 8) & 0xFF, (color >> 16) & 0xFF);
}

std::uint32_t FromQColor(const QColor& color) {
    return static_cast<std::uint32_t>(color.red()) |
           static_cast<std::uint32_t>(color.green()) << 8 |
           static_cast<std::uint32_t>(color.blue()) << 16;
}

} // namespace

CColorButton::CColorButton(const QString& accessibleName, QWidget* parent)
    : QPushButton(parent), m_defaultColor(FromQColor(palette().color(QPalette::Dark))) {
    setAccessibleName(accessibleName);
    connect(this, &QPushButton::clicked, this, &CColorButton::ChooseColor);
}

void CColorButton::SetColor(std::uint32_t color) {
    m_color = color;
    update();
}

QRect CColorButton::InnerRect() const {
    const bool pressed = isDown() || m_dialogOpen;
    return CBmpButton::ContentRect(rect(), pressed).adjusted(kEdge, kEdge, -kEdge, -kEdge);
}

// From the inner rectangle's right: half an edge, the 4-pixel arrow, half an edge, the etched
// line, and two edges and a pixel of room before the swatch.
QRect CColorButton::ArrowRect() const {
    const QRect inner = InnerRect();
    const int middle = inner.top() + inner.height() / 2;
    const int left = inner.left() + inner.width() - kEdge / 2 - 4;
    return QRect(left, middle - 1, 4, 2);
}

QRect CColorButton::SwatchRect() const {
    const QRect inner = InnerRect();
    const int etchedRight = ArrowRect().left() - kEdge / 2;
    const int swatchRight = etchedRight - (2 * kEdge + 1);
    return QRect(inner.left(), inner.top(), swatchRight - inner.left(), inner.height());
}

void CColorButton::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    const bool pressed = isDown() || m_dialogOpen;
    const bool focused = hasFocus() || m_dialogOpen;
    CBmpButton::DrawFrame(painter, *this, CBmpButton::ContentRect(rect(), pressed), pressed,
                          focused);

    const QRect arrow = ArrowRect();
    const QColor arrowColor =
        isEnabled() ? QColor(Qt::black) : palette().color(QPalette::Disabled, QPalette::Text);
    painter.setPen(arrowColor);
    painter.setBrush(arrowColor);
    const QPoint corners[] = {{arrow.left(), arrow.top()},
                              {arrow.left() + arrow.width(), arrow.top()},
                              {arrow.left() + arrow.width() / 2, arrow.top() + arrow.height()}};
    painter.drawPolygon(corners, 3, Qt::WindingFill);

    // The etched line runs down the right side of the room left of the arrow.
    const int etchedRight = arrow.left() - kEdge / 2;
    const QRect swatch = SwatchRect();
    painter.setPen(palette().color(QPalette::Dark));
    painter.drawLine(etchedRight - 2, swatch.top(), etchedRight - 2, swatch.bottom());
    painter.setPen(palette().color(QPalette::Light));
    painter.drawLine(etchedRight - 1, swatch.top(), etchedRight - 1, swatch.bottom());

    if (!isEnabled())
        return;
    painter.fillRect(swatch, ToQColor(m_color == kNoColor ? m_defaultColor : m_color));
    painter.setPen(Qt::black);
    painter.setBrush(Qt::NoBrush);
    painter.drawRect(swatch.adjusted(0, 0, -1, -1));
}

void CColorButton::ChooseColor() {
    m_dialogOpen = true;
    update();
    // The dialog is the button's child: whoever ends the button during the dialog ends the
    // dialog too, and this call must then not touch the button again.
    const QPointer<CColorButton> alive(this);
    const QPointer<QColorDialog> dialog = new QColorDialog(ToQColor(m_color), this);
    const int result = dialog->exec();
    if (!alive)
        return;
    if (dialog && result == QDialog::Accepted)
        SetColor(FromQColor(dialog->selectedColor()));
    delete dialog;
    m_dialogOpen = false;
    update();
}
