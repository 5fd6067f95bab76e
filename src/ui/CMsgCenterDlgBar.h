#pragma once

#include <QSize>
#include <QToolBar>

// The bar below the document toolbar that holds the utility engine's message centre. It spans
// the frame and is exactly as high as the message centre; the message centre sits centred
// under the document toolbar when it is narrower than that toolbar, else at the left edge.
class CMsgCenterDlgBar final : public QToolBar {
    Q_OBJECT
public:
    explicit CMsgCenterDlgBar(QWidget* parent = nullptr);

    // Reads the message centre's size from the utility engine again and places its window for
    // a document toolbar of the given width.
    void LayOut(int documentToolbarWidth);

    // Where the message centre's window goes; the engine draws into it.
    QWidget* MessageCentreWindow() const { return m_window; }

    // The left edge of a message centre of this width under a toolbar of that width.
    static int CentreX(int documentToolbarWidth, int centreWidth);

private:
    QSize CentreSize() const;

    QWidget* m_window;
};
