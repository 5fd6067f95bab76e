#pragma once

#include <QImage>
#include <QPushButton>

// A push button that shows only a picture, drawn with the transparent key colour; a disabled
// button shows it faded.
class CBmpButton : public QPushButton {
    Q_OBJECT
public:
    // The accessible name says what the picture shows.
    CBmpButton(const QString& accessibleName, QWidget* parent = nullptr);

    void SetBitmap(const QImage& bitmap);
    const QImage& Bitmap() const { return m_bitmap; }

    // The rectangle inside the button's frame that the picture fills, for a pressed or raised
    // button; shared with the colour button.
    static QRect ContentRect(const QRect& bounds, bool pressed);
    // Draws the push-button frame and, when focused, the focus rectangle.
    static void DrawFrame(QPainter& painter, const QPushButton& button, const QRect& content,
                          bool pressed, bool focused);

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    QImage m_bitmap;
};
