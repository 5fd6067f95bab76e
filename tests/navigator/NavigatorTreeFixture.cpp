#include "NavigatorTreeFixture.h"

#include "app/CNavigatorCommands.h"

#include <QAction>
#include <QApplication>
#include <QContextMenuEvent>
#include <QKeyEvent>
#include <QLineEdit>
#include <QMenu>
#include <QMouseEvent>
#include <QTimer>

void NavigatorTreeFixture::SetUp() {
    NavigatorModelFixture::SetUp();
    router = std::make_unique<CCommandRouter>();
    tree = std::make_unique<WNavigatorTree>();
    tree->SetCommandRouter(router.get());
    CNavigatorCommands::Register(*router, tree.get());
    tree->resize(240, 200);
    tree->show();
}

void NavigatorTreeFixture::TearDown() {
    tree.reset();
    router.reset();
    NavigatorModelFixture::TearDown();
}

WNavDS* NavigatorTreeFixture::Show() {
    WNavDS* model = Load();
    tree->OnIdle();
    QApplication::processEvents();
    return model;
}

QPoint NavigatorTreeFixture::At(const QString& itemId) const {
    const QRect rect = tree->visualItemRect(TreeItem(itemId));
    return QPoint(rect.left() + 20, rect.center().y());
}

void NavigatorTreeFixture::Mouse(QEvent::Type type, const QPoint& at, Qt::MouseButton button,
                                 Qt::MouseButtons held) {
    QWidget* viewport = tree->viewport();
    QMouseEvent event(type, at, viewport->mapToGlobal(at), button, held, Qt::NoModifier);
    QApplication::sendEvent(viewport, &event);
}

void NavigatorTreeFixture::Key(int key) {
    QKeyEvent press(QEvent::KeyPress, key, Qt::NoModifier);
    QApplication::sendEvent(tree.get(), &press);
}

bool NavigatorTreeFixture::ContextMenuAt(const QPoint& at, QList<int>* ids, QList<bool>* enabled) {
    bool shown = false;
    // The menu runs a loop of its own: it is read and closed from inside that loop.
    QTimer::singleShot(0, [&] {
        auto* menu = qobject_cast<QMenu*>(QApplication::activePopupWidget());
        if (menu == nullptr)
            return;
        shown = true;
        QList<QAction*> pending = menu->actions();
        while (!pending.isEmpty()) {
            QAction* action = pending.takeFirst();
            if (action->menu() != nullptr) {
                pending = action->menu()->actions() + pending;
                continue;
            }
            ids->append(action->data().toInt());
            enabled->append(action->isEnabled());
        }
        menu->close();
    });
    Press(at, Qt::RightButton);
    QContextMenuEvent event(QContextMenuEvent::Mouse, at, tree->viewport()->mapToGlobal(at));
    QApplication::sendEvent(tree->viewport(), &event);
    QApplication::processEvents();
    return shown;
}

QLineEdit* NavigatorTreeFixture::Editor() const {
    for (auto* editor : tree->viewport()->findChildren<QLineEdit*>()) {
        if (editor->isVisible())
            return editor;
    }
    return nullptr;
}
