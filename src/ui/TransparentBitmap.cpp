#include "ui/TransparentBitmap.h"

#include <QColor>
#include <QImage>
#include <QPainter>
#include <QRect>

void TransparentBitmap(QPainter& painter, const QRect& target, const QImage& bitmap, bool enabled,
                       const QColor& buttonFace) {
    if (target.isEmpty() || bitmap.isNull())
        return;
    // Nearest-pixel stretching, so the key colour stays exact at the picture's edges.
    QImage work = bitmap.size() == target.size()
                      ? bitmap.convertToFormat(QImage::Format_ARGB32)
                      : bitmap.scaled(target.size(), Qt::IgnoreAspectRatio, Qt::FastTransformation)
                            .convertToFormat(QImage::Format_ARGB32);

    const bool blackFace = buttonFace.rgb() == qRgb(0, 0, 0);
    const int constant = blackFace ? 128 : 69;
    for (int y = 0; y < work.height(); ++y) {
        auto* line = reinterpret_cast<QRgb*>(work.scanLine(y));
        for (int x = 0; x < work.width(); ++x) {
            const QRgb pixel = line[x];
            if ((pixel & 0xFFFFFFu) == kTransparentKey)
                line[x] = 0;
            else if (blackFace)
                line[x] = qRgba(255 - qRed(pixel), 255 - qGreen(pixel), 255 - qBlue(pixel),
                                qAlpha(pixel));
        }
    }

    painter.save();
    // A disabled picture covers the background only by the constant's share, which is the
    // background blended over it with the rest.
    if (!enabled)
        painter.setOpacity(constant / 255.0);
    painter.drawImage(target, work);
    painter.restore();
}
