#pragma once

#include <QPointer>
#include <QRect>
#include <QWidget>

class QPainter;

// The thin line that shows where a dragged item will land: drawn over the items by the tree
// after they are painted.
class CTreeInsertionLine {
public:
    explicit CTreeInsertionLine(QWidget* window = nullptr) : m_window(window) {}

    void SetWindow(QWidget* window) { m_window = window; }
    void Show();
    void Hide();
    // Takes the rectangle (normalised); a different one repaints the window.
    void SetRect(const QRect& rect);
    // Fills the rectangle with the highlight colour while the line is visible.
    void Paint(QPainter& painter) const;

    bool IsVisible() const { return m_visible; }
    const QRect& Rect() const { return m_rect; }

private:
    QRect m_rect;
    QPointer<QWidget> m_window;
    bool m_visible = false;
};
