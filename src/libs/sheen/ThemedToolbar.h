#pragma once

#include <QSize>
#include <QToolBar>

namespace BrindleTheming {

// The base of the product's toolbars: fixed in place, flat buttons with their text beside the
// picture, and the background of the current toolbar look (see ThemeUtilities.h).
class ThemedToolbar : public QToolBar {
    Q_OBJECT
public:
    explicit ThemedToolbar(QWidget* parent = nullptr);

    // Size of the button pictures; 20 by 20 unless set.
    void SetImageSize(const QSize& size);
    // The side that carries the separating line: the bottom for a bar above the content (the
    // default), the top for one below it.
    void SetBorderEdge(Qt::Edge edge);

    // Applies the look again; UpdateThemeUtilities calls it on every themed toolbar.
    void ApplyTheme();

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    QSize m_imageSize{20, 20};
    Qt::Edge m_borderEdge = Qt::BottomEdge;
};

} // namespace BrindleTheming
