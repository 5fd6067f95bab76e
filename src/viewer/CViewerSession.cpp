#include "viewer/CViewerSession.h"

#include "viewer/CViewerWindow.h"

#include "ui/ShowCommand.h"

#include <QFileDialog>

namespace {

const QString kItemId = QStringLiteral("itemid");

} // namespace

CViewerSession::CViewerSession(CompanionBus* bus, CViewerWindow* window, QString itemId,
                               QObject* parent)
    : QObject(parent), m_bus(bus), m_window(window), m_itemId(std::move(itemId)) {
    connect(m_bus, &CompanionBus::HubNotified, this, &CViewerSession::OnHubNotified);
    connect(m_bus, &CompanionBus::WindowCommandReceived, this, &CViewerSession::OnWindowCommand);
    connect(m_window, &CViewerWindow::Activated, this, [this] {
        m_bus->Post(
            QStringLiteral("EventNotification"),
            {{kItemId, m_itemId}, {QStringLiteral("event"), QStringLiteral("WindowOnActivate")}});
    });
    connect(m_window, &CViewerWindow::Closed, this, &CViewerSession::ReportClosed);
    // A viewer that still waits for the navigator's document has nothing left to show once the
    // navigator has gone; one that shows a file stays for the user.
    connect(m_bus, &CompanionBus::NavigatorGone, this, [this] {
        if (m_window != nullptr && !m_showsFile)
            m_window->close();
    });
    connect(m_window, &CViewerWindow::SendToWordProcessorRequested, this, [this] {
        m_bus->Post(QStringLiteral("RequestExportToQm"), {{kItemId, m_itemId}});
    });
}

void CViewerSession::StartWithFile(const QString& path) {
    m_window->show();
    ShowFile(path);
}

void CViewerSession::StartAwaitingFile() {
    m_window->ShowMessage(CViewerWindow::tr("Opening the document…"));
    m_window->show();
    ReportOpen();
}

void CViewerSession::StartAskingForFile() {
    m_window->ShowMessage(CViewerWindow::tr("Choose a document to view."));
    m_window->show();
    // A navigator that started this viewer for a document hands it over on this report.
    ReportOpen();
    m_fileDialog =
        new QFileDialog(m_window, CViewerWindow::tr("Open a document"), QString(),
                        CViewerWindow::tr("Documents (*.pdf *.qmd *.doc);;All files (*)"));
    m_fileDialog->setAttribute(Qt::WA_DeleteOnClose);
    m_fileDialog->setFileMode(QFileDialog::ExistingFile);
    connect(m_fileDialog, &QFileDialog::fileSelected, this, &CViewerSession::OnFileChosen);
    connect(m_fileDialog, &QFileDialog::rejected, m_window, &QWidget::close);
    m_fileDialog->open();
}

bool CViewerSession::IsForThisItem(const CompanionBus::Properties& properties) const {
    return properties.value(kItemId).compare(m_itemId, Qt::CaseInsensitive) == 0;
}

void CViewerSession::OnHubNotified(const QString& name,
                                   const CompanionBus::Properties& properties) {
    if (m_window == nullptr)
        return;
    if (name == u"OpenDocumentInViewer") {
        if (properties.value(QStringLiteral("viewerid")).compare(m_itemId, Qt::CaseInsensitive) !=
            0)
            return;
        const QString path = properties.value(QStringLiteral("path"));
        // Nothing to hand over: the user is choosing a file.
        if (path.isEmpty())
            return;
        if (m_fileDialog != nullptr) {
            m_fileDialog->disconnect(this);
            m_fileDialog->disconnect(m_window);
            m_fileDialog->close();
        }
        if (const QString itemId = properties.value(kItemId); !itemId.isEmpty())
            m_itemId = itemId;
        ShowFile(path);
        BringForward();
    } else if (!IsForThisItem(properties)) {
        return;
    } else if (name == u"ActivateDocument") {
        BringForward();
    } else if (name == u"PrintDocument") {
        BringForward();
        m_window->PrintWithDialog();
    } else if (name == u"UpdateDocumentProperties") {
        if (properties.contains(QStringLiteral("title")))
            m_window->SetDocumentTitle(properties.value(QStringLiteral("title")));
    }
}

void CViewerSession::OnWindowCommand(qint64 handle, const QString& command, int showCommand) {
    if (handle != kWindowNumber || m_window == nullptr)
        return;
    if (command == u"close") {
        m_window->close();
    } else if (command == u"activate") {
        BringForward();
    } else if (command == u"focus") {
        m_window->activateWindow();
    } else if (command == u"show") {
        ApplyShowCommand(m_window, showCommand);
    }
}

void CViewerSession::OnFileChosen(const QString& path) {
    // The navigator links the file and hands it back to this viewer under the new item's id;
    // without a navigator the viewer shows it on its own.
    if (!m_bus->IsNavigatorRunning() ||
        !m_bus->Post(QStringLiteral("RequestViewerFromFile"),
                     {{QStringLiteral("filename"), path}, {kItemId, m_itemId}}))
        ShowFile(path);
}

void CViewerSession::ShowFile(const QString& path) {
    m_showsFile = true;
    m_window->ShowFile(path);
    ReportOpen();
}

void CViewerSession::ReportOpen() {
    m_bus->Post(QStringLiteral("DocumentOpenNotification"),
                {{kItemId, m_itemId},
                 {QStringLiteral("openwindowhandle"), QString::number(kWindowNumber)}});
}

void CViewerSession::BringForward() {
    if (m_window->isMinimized())
        m_window->showNormal();
    else
        m_window->show();
    m_window->raise();
    m_window->activateWindow();
}

void CViewerSession::ReportClosed() {
    if (m_closeReported)
        return;
    m_closeReported = true;
    m_bus->Post(QStringLiteral("UpdateMetadata"),
                {{kItemId, m_itemId}, {QStringLiteral("open"), QStringLiteral("false")}});
    // A round trip to the bus: the report has left this process before it ends.
    m_bus->IsNavigatorRunning();
}
