#pragma once

#include "companion/CompanionBus.h"

#include <QObject>
#include <QPointer>
#include <QString>

class CViewerWindow;
class QFileDialog;

// One viewer process's dealings with the navigator: which item its window shows, the reports
// the navigator keeps track of the window by, and the navigator's requests for this window.
class CViewerSession : public QObject {
    Q_OBJECT
public:
    // The viewer's own window number, as it reports it and as window commands name it.
    static constexpr qint64 kWindowNumber = 1;

    CViewerSession(CompanionBus* bus, CViewerWindow* window, QString itemId,
                   QObject* parent = nullptr);

    // Shows the window and the named file, and tells the navigator the window is open.
    void StartWithFile(const QString& path);
    // Shows the window and tells the navigator, which hands over the file.
    void StartAwaitingFile();
    // Shows the window and asks the user for a file, which the navigator links and hands back.
    void StartAskingForFile();

    QString ItemId() const { return m_itemId; }

private:
    bool IsForThisItem(const CompanionBus::Properties& properties) const;
    void OnHubNotified(const QString& name, const CompanionBus::Properties& properties);
    void OnWindowCommand(qint64 handle, const QString& command, int showCommand);
    void OnFileChosen(const QString& path);
    void ShowFile(const QString& path);
    void ReportOpen();
    void BringForward();
    void ReportClosed();

    CompanionBus* m_bus;
    QPointer<CViewerWindow> m_window;
    QPointer<QFileDialog> m_fileDialog;
    QString m_itemId;
    bool m_closeReported = false;
    bool m_showsFile = false;
};
