#pragma once

#include "drop/CBasicOperationHandler.h"

#include <QObject>
#include <QPointer>
#include <QString>

#include <map>
#include <memory>

class IDropFeedback;
class QDropEvent;
class QMimeData;
class QWidget;

// Takes files and text dragged from other programs onto the tree's viewport. The first format
// of the dragged data that an operation handles decides what the drop does; the tree is asked
// where the drop would land. Drags that start inside this program are left to the tree.
class CDropTarget final : public QObject {
public:
    // Watches the viewport (which becomes the parent) and lets it take drops.
    CDropTarget(QWidget* viewport, IDropFeedback* feedback);
    ~CDropTarget() override;

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    enum class DragState { Idle, Examining, Accepted };

    // Fills the operations once: "text/uri-list" files and "text/plain" text.
    void RegisterDropOperations();
    // The operation of the first offered format that has one; null for none.
    CBasicOperationHandler* ChooseOperation(const QMimeData* data) const;

    void OnDragEnter(QDropEvent* event);
    void OnDragMove(QDropEvent* event);
    void OnDrop(QDropEvent* event);
    void OnDragLeave();

    QPointer<QWidget> m_viewport;
    IDropFeedback* m_feedback;
    std::map<QString, std::unique_ptr<CBasicOperationHandler>> m_operations;
    CBasicOperationHandler* m_current = nullptr;
    DragState m_state = DragState::Idle;
};
