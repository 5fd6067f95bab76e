#include "ui/WMainFrame.h"

#include "libs/toolwell/IHarborUtils.h"
#include "navigator/WNavDS.h"
#include "settings/NavigatorSettings.h"
#include "ui/ModalDialog.h"

WMainFrame::WMainFrame(QWidget* parent) : QMainWindow(parent) {
    setWindowTitle(QStringLiteral("Quillmark Ambrel"));
}

WMainFrame::~WMainFrame() {
    // Dialogs without this window as their parent would otherwise outlive it.
    const ModalDialog::ClosingAll closing;
    // The settings outlive the window.
    if (NavigatorSettings* settings = NavigatorSettings::Instance(); settings->GetFrame() == this)
        settings->SetFrame(nullptr);
}

void WMainFrame::PlaceFrame(const QRect& outer) {
    m_placedSize = outer.size();
    move(outer.topLeft()); // a window's position is that of its frame
    FitToPlacedSize();
}

void WMainFrame::FitToPlacedSize() {
    if (!m_placedSize)
        return;
    const QSize outer = *m_placedSize;
    const QSize decorations = frameGeometry().size() - size();
    if (!decorations.isNull())
        m_placedSize.reset();
    resize(outer - decorations);
}

void WMainFrame::SetTrackPosition(bool track) {
    m_trackPosition = track;
    RecordPosition();
}

void WMainFrame::SetKeepOnTop(bool onTop) {
    if (windowFlags().testFlag(Qt::WindowStaysOnTopHint) == onTop) {
        show();
        return;
    }
    // Changing a window flag hides the window; it is shown again at the same place.
    setWindowFlag(Qt::WindowStaysOnTopHint, onTop);
    show();
}

void WMainFrame::ShowFrame(bool show) {
    if (windowFlags().testFlag(Qt::FramelessWindowHint) == !show)
        return;
    const bool visible = isVisible();
    setWindowFlag(Qt::FramelessWindowHint, !show);
    if (visible)
        this->show();
}

void WMainFrame::OnIdleWork() {
    // The frame shows no tree of its own yet, so there is nothing to rebuild from the model;
    // the change has reached the catalog.
    WNavDS::Instance()->SetChanged(false);
}

// There is no message centre bar on this platform yet; the option is kept for when it comes.
void WMainFrame::ShowMessageCentre(bool) {}

void WMainFrame::closeEvent(QCloseEvent* event) {
    // An open dialog is ended unanswered, and none opens while the other programs' windows
    // are closed: the navigator must be able to end without anyone at the screen.
    const ModalDialog::ClosingAll closing;
    Q_EMIT Closing();
    if (IHarborUtils* utils = GetHarborUtilsInterface())
        utils->SetShuttingDown(true);
    // The note tool's and the viewer's windows go with the navigator, and the catalog then
    // records nothing as open.
    WNavDS* navigator = WNavDS::Instance();
    navigator->CloseAllWindowsAndWait();
    navigator->CloseAllOpenDocuments();
    navigator->CloseAllOpenNotes();
    QMainWindow::closeEvent(event);
}

void WMainFrame::moveEvent(QMoveEvent* event) {
    QMainWindow::moveEvent(event);
    FitToPlacedSize();
    RecordPosition();
}

void WMainFrame::resizeEvent(QResizeEvent* event) {
    QMainWindow::resizeEvent(event);
    FitToPlacedSize();
    RecordPosition();
}

void WMainFrame::RecordPosition() {
    // A minimised or maximised window keeps the place it will return to.
    if (!m_trackPosition || isMinimized() || isMaximized() || isFullScreen())
        return;
    NavigatorSettings* settings = NavigatorSettings::Instance();
    const WindowRect position = WindowRect::FromGeometry(frameGeometry());
    if (settings->GetApplicationPosition() != position)
        settings->SetApplicationPosition(position);
}
