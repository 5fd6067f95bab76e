#include "viewer/CViewerWindow.h"

#include "viewer/CFileDetailsPane.h"
#include "viewer/CPdfPane.h"

#include <QAction>
#include <QCloseEvent>
#include <QFileInfo>
#include <QIcon>
#include <QLabel>
#include <QLineEdit>
#include <QPrintDialog>
#include <QPrinter>
#include <QStackedWidget>
#include <QStatusBar>
#include <QToolBar>

namespace {

constexpr int kStatusTimeoutMs = 5000;

QString ProgramName() {
    return QStringLiteral("Quillmark Ambrel Viewer");
}

bool IsPdf(const QString& path) {
    return QFileInfo(path).suffix().compare(u"pdf", Qt::CaseInsensitive) == 0;
}

QString LoadProblem(QPdfDocument::Error error) {
    switch (error) {
    case QPdfDocument::Error::IncorrectPassword:
    case QPdfDocument::Error::UnsupportedSecurityScheme:
        return CViewerWindow::tr("The document is protected by a password and cannot be shown.");
    default:
        return CViewerWindow::tr("The document is damaged or is not a PDF document, and cannot be "
                                 "shown.");
    }
}

} // namespace

CViewerWindow::CViewerWindow(QWidget* parent)
    : QMainWindow(parent), m_pdf(new CPdfPane(this)), m_details(new CFileDetailsPane(this)),
      m_message(new QLabel(this)), m_stack(new QStackedWidget(this)), m_pageLabel(new QLabel(this)),
      m_findText(new QLineEdit(this)) {
    setWindowTitle(ProgramName());
    m_message->setAlignment(Qt::AlignCenter);
    m_message->setWordWrap(true);
    m_message->setMargin(24);
    m_message->setAccessibleName(tr("Message"));
    m_stack->addWidget(m_message);
    m_stack->addWidget(m_pdf);
    m_stack->addWidget(m_details);
    setCentralWidget(m_stack);

    QToolBar* tools = addToolBar(tr("Document"));
    tools->setObjectName(QStringLiteral("DocumentToolbar"));
    tools->setMovable(false);
    const auto add = [&](const QString& iconName, const QString& text, const QKeySequence& keys,
                         auto slot) {
        QAction* action = tools->addAction(QIcon::fromTheme(iconName), text);
        action->setShortcut(keys);
        action->setToolTip(text + QStringLiteral(" (") + keys.toString(QKeySequence::NativeText) +
                           u')');
        connect(action, &QAction::triggered, this, slot);
        m_pdfActions.append(action);
        return action;
    };
    add(QStringLiteral("go-up"), tr("Previous page"),
        QKeySequence(QKeySequence::MoveToPreviousPage), [this] { m_pdf->PageUp(); });
    add(QStringLiteral("go-down"), tr("Next page"), QKeySequence(QKeySequence::MoveToNextPage),
        [this] { m_pdf->PageDown(); });
    m_pageLabel->setMinimumWidth(
        fontMetrics().horizontalAdvance(QStringLiteral("Page 0000 of 0000")));
    m_pageLabel->setAlignment(Qt::AlignCenter);
    m_pdfActions.append(tools->addWidget(m_pageLabel));
    tools->addSeparator();
    add(QStringLiteral("zoom-out"), tr("Zoom out"), QKeySequence(QKeySequence::ZoomOut),
        [this] { m_pdf->ZoomOut(); });
    add(QStringLiteral("zoom-in"), tr("Zoom in"), QKeySequence(QKeySequence::ZoomIn),
        [this] { m_pdf->ZoomIn(); });
    tools->addSeparator();
    m_findText->setPlaceholderText(tr("Find"));
    m_findText->setAccessibleName(tr("Find text"));
    m_findText->setClearButtonEnabled(true);
    m_findText->setMaximumWidth(220);
    connect(m_findText, &QLineEdit::returnPressed, this, &CViewerWindow::Find);
    QAction* findField = tools->addWidget(m_findText);
    m_pdfActions.append(findField);
    add(QStringLiteral("edit-find"), tr("Find next"), QKeySequence(QKeySequence::FindNext),
        [this] { Find(); });
    QAction* focusFind = new QAction(this);
    focusFind->setShortcut(QKeySequence::Find);
    connect(focusFind, &QAction::triggered, this, [this] {
        m_findText->setFocus();
        m_findText->selectAll();
    });
    addAction(focusFind);
    tools->addSeparator();
    add(QStringLiteral("document-print"), tr("Print"), QKeySequence(QKeySequence::Print),
        [this] { PrintWithDialog(); });

    connect(m_pdf, &CPdfPane::PageChanged, this, &CViewerWindow::UpdatePageLabel);
    connect(m_details, &CFileDetailsPane::SendToWordProcessorRequested, this,
            &CViewerWindow::SendToWordProcessorRequested);
    // Wide enough for an A4 page at the first zoom without a sideways scroll bar.
    resize(860, 900);
    ShowMessage(QString());
}

void CViewerWindow::ShowFile(const QString& path) {
    m_path = path;
    const QFileInfo info(path);
    SetDocumentTitle(info.fileName());
    if (!info.exists() || !info.isFile()) {
        ShowMessage(tr("The file \"%1\" cannot be found.").arg(path));
        return;
    }
    if (!info.isReadable()) {
        ShowMessage(tr("The file \"%1\" cannot be read.").arg(path));
        return;
    }
    if (!IsPdf(path)) {
        m_details->ShowFile(path);
        m_showing = Showing::Details;
        m_stack->setCurrentWidget(m_details);
        UpdateActions();
        return;
    }
    const QPdfDocument::Error error = m_pdf->Load(path);
    if (error != QPdfDocument::Error::None) {
        ShowMessage(LoadProblem(error));
        return;
    }
    m_showing = Showing::Pdf;
    m_stack->setCurrentWidget(m_pdf);
    UpdateActions();
    UpdatePageLabel();
}

void CViewerWindow::ShowMessage(const QString& text) {
    m_message->setText(text);
    m_showing = text.isEmpty() ? Showing::Nothing : Showing::Message;
    m_stack->setCurrentWidget(m_message);
    UpdateActions();
}

void CViewerWindow::SetDocumentTitle(const QString& title) {
    setWindowTitle(title.isEmpty() ? ProgramName() : title + QStringLiteral(" - ") + ProgramName());
}

QString CViewerWindow::MessageText() const {
    return m_message->text();
}

void CViewerWindow::PrintWithDialog() {
    if (m_showing != Showing::Pdf) {
        statusBar()->showMessage(tr("There is no page to print."), kStatusTimeoutMs);
        return;
    }
    // The dialog owns its printer; a window closed meanwhile takes the dialog with it.
    auto* printer = new QPrinter(QPrinter::HighResolution);
    auto* dialog = new QPrintDialog(printer, this);
    dialog->setAttribute(Qt::WA_DeleteOnClose);
    connect(dialog, &QObject::destroyed, this, [printer] { delete printer; });
    dialog->setMinMax(1, m_pdf->PageCount());
    connect(dialog, &QDialog::accepted, this, [this, printer] {
        if (!m_pdf->Print(printer))
            statusBar()->showMessage(tr("The document could not be printed."), kStatusTimeoutMs);
    });
    dialog->open();
}

void CViewerWindow::changeEvent(QEvent* event) {
    QMainWindow::changeEvent(event);
    if (event->type() == QEvent::ActivationChange && isActiveWindow())
        Q_EMIT Activated();
}

void CViewerWindow::closeEvent(QCloseEvent* event) {
    QMainWindow::closeEvent(event);
    if (event->isAccepted())
        Q_EMIT Closed();
}

void CViewerWindow::UpdateActions() {
    const bool pdf = m_showing == Showing::Pdf;
    for (QAction* action : std::as_const(m_pdfActions))
        action->setEnabled(pdf);
    if (pdf)
        UpdatePageLabel();
    else
        m_pageLabel->clear();
}

void CViewerWindow::UpdatePageLabel() {
    m_pageLabel->setText(tr("Page %1 of %2").arg(m_pdf->CurrentPage() + 1).arg(m_pdf->PageCount()));
}

void CViewerWindow::Find() {
    const QString text = m_findText->text();
    if (text.isEmpty())
        return;
    if (!m_pdf->FindNext(text))
        statusBar()->showMessage(tr("\"%1\" was not found.").arg(text), kStatusTimeoutMs);
    else
        statusBar()->clearMessage();
}
