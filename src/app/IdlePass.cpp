#include "app/IdlePass.h"

#include <QAbstractEventDispatcher>
#include <QCoreApplication>
#include <QElapsedTimer>
#include <QEvent>

Q_LOGGING_CATEGORY(lcIdlePass, "ambrel.idle", QtInfoMsg)

IdlePass::IdlePass(Handler handler, QObject* parent)
    : QObject(parent), m_handler(std::move(handler)) {}

IdlePass::~IdlePass() {
    if (QCoreApplication::instance() != nullptr)
        QCoreApplication::instance()->removeEventFilter(this);
}

void IdlePass::Start() {
    QCoreApplication::instance()->installEventFilter(this);
    connect(QAbstractEventDispatcher::instance(), &QAbstractEventDispatcher::aboutToBlock, this,
            &IdlePass::OnAboutToBlock);
}

bool IdlePass::eventFilter(QObject*, QEvent* event) {
    switch (event->type()) {
    case QEvent::Paint:
    case QEvent::UpdateRequest:
    case QEvent::UpdateLater:
        break; // repainting is not work the idle pass waits for
    default:
        if (!m_inPass) {
            m_eventSinceLastLook = true;
            m_armed = true;
            m_count = 0;
        }
    }
    return false;
}

void IdlePass::OnAboutToBlock() {
    if (!m_armed || m_inPass)
        return;
    auto* dispatcher = QAbstractEventDispatcher::instance();
    // The loop announces that it will wait before it delivers the round's posted events, so
    // only a round that delivered nothing since the last look is really idle.
    if (m_eventSinceLastLook) {
        m_eventSinceLastLook = false;
        dispatcher->wakeUp();
        return;
    }
    m_inPass = true;
    QElapsedTimer duration;
    duration.start();
    const bool more = m_handler(m_count);
    m_inPass = false;
    qCDebug(lcIdlePass, "idle pass %d: %.1f ms", m_count, double(duration.nsecsElapsed()) / 1e6);
    ++m_passesRun;
    if (more) {
        ++m_count;
        dispatcher->wakeUp();
    } else {
        m_armed = false;
        m_count = 0;
    }
}
