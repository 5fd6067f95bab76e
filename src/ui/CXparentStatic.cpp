#include "ui/CXparentStatic.h"

#include "ui/TransparentBitmap.h"

#include <QPainter>

CXparentStatic::CXparentStatic(const QString& accessibleName, QWidget* parent) : QLabel(parent) {
    setAccessibleName(accessibleName);
}

void CXparentStatic::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    TransparentBitmap(painter, rect(), pixmap().toImage(), true, palette().color(QPalette::Button));
}
