#pragma once

class QColor;
class QImage;
class QPainter;
class QRect;

// The key colour of the product's button pictures: magenta pixels are not drawn.
inline constexpr unsigned int kTransparentKey = 0xFF00FF;

// Draws a picture stretched into the target rectangle over what the painter's device already
// shows there: magenta pixels let that background through, a disabled picture is faded towards
// the background (the background keeps 186 of 255 parts), and on a black button face the
// picture is inverted first (the background then keeps 127 parts when disabled). The picture
// itself is left unchanged.
void TransparentBitmap(QPainter& painter, const QRect& target, const QImage& bitmap, bool enabled,
                       const QColor& buttonFace);
