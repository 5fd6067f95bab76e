#include "ui/CMsgCenterDlgBar.h"

#include "libs/toolwell/IHarborUtils.h"

CMsgCenterDlgBar::CMsgCenterDlgBar(QWidget* parent)
    : QToolBar(parent), m_window(new QWidget(this)) {
    setObjectName(QStringLiteral("MessageCentreBar"));
    setAccessibleName(QStringLiteral("Message Centre"));
    setMovable(false);
    setFloatable(false);
    m_window->setAccessibleName(QStringLiteral("Message Centre"));
    // The message centre's own colours, not the toolbar's.
    m_window->setAutoFillBackground(true);
    LayOut(0);
}

QSize CMsgCenterDlgBar::CentreSize() const {
    int width = 0;
    int height = 0;
    if (IHarborUtils* utils = GetHarborUtilsInterface())
        utils->GetMessageCenterSize(&width, &height);
    return {width, height};
}

int CMsgCenterDlgBar::CentreX(int documentToolbarWidth, int centreWidth) {
    return centreWidth < documentToolbarWidth ? documentToolbarWidth / 2 - centreWidth / 2 : 0;
}

void CMsgCenterDlgBar::LayOut(int documentToolbarWidth) {
    const QSize size = CentreSize();
    setFixedHeight(size.height());
    m_window->setGeometry(CentreX(documentToolbarWidth, size.width()), 0, size.width(),
                          size.height());
}
