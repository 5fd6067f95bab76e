#pragma once

#include <QHash>
#include <QList>
#include <QObject>
#include <QString>

#include <functional>

class QAction;
class QMenu;

// The one table from command ids to their owners. Every menu, toolbar and context-menu entry
// is a QAction whose data is the command id and which runs through Execute; the same table
// answers whether a command is enabled and checked, so that a button, a menu entry and a
// shortcut never disagree. An id that nobody registered is disabled.
class CCommandRouter final : public QObject {
    Q_OBJECT
public:
    struct Command {
        std::function<void()> execute;
        // Null: always enabled.
        std::function<bool()> enabled;
        // Null: the command has no check mark.
        std::function<bool()> checked;
    };

    explicit CCommandRouter(QObject* parent = nullptr);
    ~CCommandRouter() override;

    // Routes the ids to the command (a later registration of an id replaces the earlier).
    void Register(std::initializer_list<int> ids, const Command& command);
    bool IsRouted(int id) const { return m_commands.contains(id); }

    // The shared entry of the command, its text from the string table; made on first use.
    QAction* Action(int id);
    // An entry of the same command worded for one menu (the context menus say "Blog" where
    // the toolbar says "Send to Blog"); shared by every menu that asks for the same wording.
    QAction* Action(int id, const QString& text);

    // Runs the command when it is routed and enabled; answers whether it ran.
    bool Execute(int id);
    bool IsEnabled(int id) const;
    bool IsChecked(int id) const;

    // Brings every entry's enabled and checked state in line with the table; menus call it
    // before they show, the idle pass after every change.
    void UpdateActions();
    // The menu refreshes the entries whenever it is about to show.
    void WatchMenu(QMenu* menu);

private:
    QAction* MakeAction(int id, const QString& text);
    void UpdateAction(QAction* action) const;

    QHash<int, Command> m_commands;
    QHash<int, QAction*> m_actions;
    QHash<QPair<int, QString>, QAction*> m_wordedActions;
};
