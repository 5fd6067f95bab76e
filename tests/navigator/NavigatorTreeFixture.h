#pragma once

#include "NavigatorModelFixture.h"

#include "app/CCommandRouter.h"
#include "navigator/WNavigatorTree.h"

#include <QEvent>
#include <QList>
#include <QPoint>

#include <memory>

// A shown tree over a loaded notebook, its context menus running through the command table,
// and real mouse and key events sent to it.
class QLineEdit;

class NavigatorTreeFixture : public NavigatorModelFixture {
protected:
    void SetUp() override;
    void TearDown() override;

    // Loads the catalog and fills the tree.
    WNavDS* Show();
    QTreeWidgetItem* TreeItem(const QString& itemId) const { return tree->ItemOf(itemId); }
    // The middle of the item's label, in viewport coordinates.
    QPoint At(const QString& itemId) const;

    void Mouse(QEvent::Type type, const QPoint& at, Qt::MouseButton button, Qt::MouseButtons held);
    void Press(const QPoint& at, Qt::MouseButton button = Qt::LeftButton) {
        Mouse(QEvent::MouseButtonPress, at, button, button);
    }
    void MoveHeld(const QPoint& at) { Mouse(QEvent::MouseMove, at, Qt::NoButton, Qt::LeftButton); }
    void Release(const QPoint& at) {
        Mouse(QEvent::MouseButtonRelease, at, Qt::LeftButton, Qt::NoButton);
    }
    void Key(int key);
    // The in-place editor, while one is open.
    QLineEdit* Editor() const;
    // Right-clicks at the point; answers whether a menu came up and the command ids of its
    // entries (submenus included) with whether each was enabled.
    bool ContextMenuAt(const QPoint& at, QList<int>* ids, QList<bool>* enabled);

    std::unique_ptr<CCommandRouter> router;
    std::unique_ptr<WNavigatorTree> tree;
};
