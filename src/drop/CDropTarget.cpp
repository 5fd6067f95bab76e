#include "drop/CDropTarget.h"

#include "drop/CNavigatorClipboardDropOperation.h"
#include "drop/CNavigatorFileDropOperation.h"
#include "drop/IDropFeedback.h"

#include <QDropEvent>
#include <QMimeData>
#include <QWidget>

CDropTarget::CDropTarget(QWidget* viewport, IDropFeedback* feedback)
    : QObject(viewport), m_viewport(viewport), m_feedback(feedback) {
    RegisterDropOperations();
    if (viewport != nullptr) {
        viewport->setAcceptDrops(true);
        viewport->installEventFilter(this);
    }
}

CDropTarget::~CDropTarget() = default;

void CDropTarget::RegisterDropOperations() {
    if (!m_operations.empty())
        return;
    m_operations.emplace(QStringLiteral("text/uri-list"),
                         std::make_unique<CNavigatorFileDropOperation>());
    m_operations.emplace(QStringLiteral("text/plain"),
                         std::make_unique<CNavigatorClipboardDropOperation>());
}

CBasicOperationHandler* CDropTarget::ChooseOperation(const QMimeData* data) const {
    if (data == nullptr)
        return nullptr;
    const QStringList formats = data->formats();
    for (const QString& format : formats) {
        const auto found = m_operations.find(format);
        if (found != m_operations.end())
            return found->second.get();
    }
    return nullptr;
}

bool CDropTarget::eventFilter(QObject* watched, QEvent* event) {
    if (watched != m_viewport || m_feedback == nullptr)
        return false;
    switch (event->type()) {
    case QEvent::DragEnter:
    case QEvent::DragMove:
    case QEvent::Drop: {
        auto* drop = static_cast<QDropEvent*>(event);
        // A drag of the program's own (an item moved inside the tree) is the tree's.
        if (drop->source() != nullptr)
            return false;
        if (event->type() == QEvent::DragEnter)
            OnDragEnter(drop);
        else if (event->type() == QEvent::DragMove)
            OnDragMove(drop);
        else
            OnDrop(drop);
        return true;
    }
    case QEvent::DragLeave:
        if (m_state == DragState::Idle)
            return false;
        OnDragLeave();
        return true;
    default:
        return false;
    }
}

void CDropTarget::OnDragEnter(QDropEvent* event) {
    m_state = DragState::Examining;
    m_current = ChooseOperation(event->mimeData());
    if (m_current == nullptr || m_current->CanAccept(event->mimeData()) != 1) {
        event->ignore();
        return;
    }
    m_state = DragState::Accepted;
    event->setDropAction(Qt::CopyAction);
    event->accept();
}

void CDropTarget::OnDragMove(QDropEvent* event) {
    if (m_state == DragState::Accepted &&
        m_feedback->DragOverFromOutside(event->position().toPoint())) {
        event->setDropAction(Qt::CopyAction);
        event->accept();
    } else {
        event->ignore();
    }
}

void CDropTarget::OnDrop(QDropEvent* event) {
    m_state = DragState::Idle;
    m_feedback->RemoveInsertionMark();
    // Qt delivers a drop only after an accepted entry, so the data was found acceptable.
    m_current = ChooseOperation(event->mimeData());
    const int result = m_current != nullptr ? m_current->Perform(event->mimeData()) : 0;
    m_current = nullptr;
    m_feedback->EndExternalDrag();
    if (result == 1) {
        event->setDropAction(Qt::CopyAction);
        event->accept();
    } else {
        event->ignore();
    }
}

void CDropTarget::OnDragLeave() {
    m_feedback->RemoveInsertionMark();
    m_state = DragState::Idle;
    m_current = nullptr;
    m_feedback->EndExternalDrag();
}
