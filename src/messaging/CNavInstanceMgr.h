#pragma once

#include "libs/toolwell/IMsgEvent.h"
#include "messaging/CMethodNode.h"

#include <QDeadlineTimer>

#include <deque>
#include <memory>

class INavigatorService;

// The navigator's sink for the messages of the product's other programs. Messages wait in
// arrival order until the application's idle pass dispatches them, so none runs inside another
// action of the navigator; only "WindowShowNotification" acts at once. Every message comes from
// another process: identifiers, paths and property sets are checked before anything acts.
class CNavInstanceMgr final : public IPM::IMsgEvent {
public:
    explicit CNavInstanceMgr(INavigatorService* navigatorService);
    ~CNavInstanceMgr() override;
    CNavInstanceMgr(const CNavInstanceMgr&) = delete;
    CNavInstanceMgr& operator=(const CNavInstanceMgr&) = delete;

    void OnMessage(const QString& name, const QMap<QString, QString>& properties) override;
    void OnNewNote() override;
    void OnWindowsGone(const QList<Platform::WindowHandle>& windows) override;

    // Dispatches and deletes the queued messages, oldest first: all of them, or, given a
    // deadline, at least one and no more once the deadline has passed, so that a burst of
    // messages is handled in slices between which the window answers. Answers whether messages
    // are left.
    bool ProcessQueue(QDeadlineTimer deadline = QDeadlineTimer(QDeadlineTimer::Forever));
    // Acts on one message; names compare exactly, unknown ones do nothing.
    void Dispatch(const QString& name, DataExchange::IProperties* properties);

    qsizetype QueueLength() const { return qsizetype(m_queue.size()); }

private:
    void ShowAllWindows(DataExchange::IProperties* properties);
    void UpdateMetadata(DataExchange::IProperties* properties);
    void WindowOpened(DataExchange::IProperties* properties, bool document);
    void RequestViewerFromFile(DataExchange::IProperties* properties);
    void CreateNote(DataExchange::IProperties* properties);
    void SaveDocumentToNotebook(DataExchange::IProperties* properties);

    INavigatorService* m_navigatorService;
    std::deque<std::unique_ptr<CMethodNode>> m_queue;
};
