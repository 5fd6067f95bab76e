#include "navigator/CTreeInsertionLine.h"

#include <QPainter>
#include <QPalette>

void CTreeInsertionLine::Show() {
    m_visible = true;
    if (m_window)
        m_window->update(m_rect);
}

void CTreeInsertionLine::Hide() {
    if (m_visible && m_window)
        m_window->update(m_rect);
    m_visible = false;
}

void CTreeInsertionLine::SetRect(const QRect& rect) {
    const QRect normalised = rect.normalized();
    if (normalised == m_rect)
        return;
    if (m_window && m_visible) {
        m_window->update(m_rect);
        m_window->update(normalised);
    }
    m_rect = normalised;
}

void CTreeInsertionLine::Paint(QPainter& painter) const {
    if (!m_visible || !m_window)
        return;
    painter.fillRect(m_rect, m_window->palette().brush(QPalette::Highlight));
}
