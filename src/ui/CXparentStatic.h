#pragma once

#include <QLabel>

// A static picture drawn with the transparent key colour over its whole area, so magenta
// pixels show the dialog behind it. The picture is the label's pixmap.
class CXparentStatic : public QLabel {
    Q_OBJECT
public:
    CXparentStatic(const QString& accessibleName, QWidget* parent = nullptr);

protected:
    void paintEvent(QPaintEvent* event) override;
};
