#include "libs/sheen/ThemedToolbar.h"

#include "libs/sheen/ThemeUtilities.h"

#include <QLinearGradient>
#include <QPainter>

namespace BrindleTheming {

ThemedToolbar::ThemedToolbar(QWidget* parent) : QToolBar(parent) {
    ApplyTheme();
}

void ThemedToolbar::SetImageSize(const QSize& size) {
    m_imageSize = size;
    setIconSize(size);
}

void ThemedToolbar::SetBorderEdge(Qt::Edge edge) {
    m_borderEdge = edge;
    update();
}

void ThemedToolbar::ApplyTheme() {
    setMovable(false);
    setFloatable(false);
    setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
    setIconSize(m_imageSize);
    update();
}

void ThemedToolbar::paintEvent(QPaintEvent* event) {
    const ToolbarLook* look = CurrentToolbarLook();
    if (!look) {
        QToolBar::paintEvent(event);
        return;
    }
    QPainter painter(this);
    QLinearGradient gradient(0, 0, 0, height());
    gradient.setColorAt(0, look->top);
    gradient.setColorAt(1, look->bottom);
    painter.fillRect(rect(), gradient);
    painter.setPen(look->border);
    const QRect bounds = rect();
    if (m_borderEdge == Qt::TopEdge)
        painter.drawLine(bounds.topLeft(), bounds.topRight());
    else
        painter.drawLine(bounds.bottomLeft(), bounds.bottomRight());
}

} // namespace BrindleTheming
