#include "app/CCommandRouter.h"

#include "common/StringTable.h"

#include <QAction>
#include <QMenu>

CCommandRouter::CCommandRouter(QObject* parent) : QObject(parent) {}

CCommandRouter::~CCommandRouter() = default;

void CCommandRouter::Register(std::initializer_list<int> ids, const Command& command) {
    for (int id : ids) {
        m_commands.insert(id, command);
        if (QAction* action = m_actions.value(id))
            UpdateAction(action);
    }
}

QAction* CCommandRouter::MakeAction(int id, const QString& text) {
    auto* action = new QAction(text, this);
    action->setData(id);
    connect(action, &QAction::triggered, this, [this, id] { Execute(id); });
    UpdateAction(action);
    return action;
}

QAction* CCommandRouter::Action(int id) {
    QAction*& action = m_actions[id];
    if (action == nullptr)
        action = MakeAction(id, LoadString(id));
    return action;
}

QAction* CCommandRouter::Action(int id, const QString& text) {
    QAction*& action = m_wordedActions[qMakePair(id, text)];
    if (action == nullptr)
        action = MakeAction(id, text);
    return action;
}

bool CCommandRouter::Execute(int id) {
    if (!IsEnabled(id))
        return false;
    // Copied: the command may register others and so move the table.
    const std::function<void()> execute = m_commands.value(id).execute;
    if (execute)
        execute();
    UpdateActions();
    return true;
}

bool CCommandRouter::IsEnabled(int id) const {
    const auto command = m_commands.constFind(id);
    if (command == m_commands.cend() || !command->execute)
        return false;
    return !command->enabled || command->enabled();
}

bool CCommandRouter::IsChecked(int id) const {
    const auto command = m_commands.constFind(id);
    return command != m_commands.cend() && command->checked && command->checked();
}

void CCommandRouter::UpdateAction(QAction* action) const {
    const int id = action->data().toInt();
    const auto command = m_commands.constFind(id);
    const bool checkable = command != m_commands.cend() && bool(command->checked);
    action->setCheckable(checkable);
    action->setChecked(checkable && IsChecked(id));
    action->setEnabled(IsEnabled(id));
}

void CCommandRouter::UpdateActions() {
    for (QAction* action : std::as_const(m_actions))
        UpdateAction(action);
    for (QAction* action : std::as_const(m_wordedActions))
        UpdateAction(action);
}

void CCommandRouter::WatchMenu(QMenu* menu) {
    connect(menu, &QMenu::aboutToShow, this, &CCommandRouter::UpdateActions);
}
