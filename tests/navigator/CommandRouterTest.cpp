#include "NavigatorTreeFixture.h"

#include <QAction>

namespace {

class CommandRouterTest : public NavigatorTreeFixture {};

TEST_F(CommandRouterTest, IdsReachTheirOperationsEnabledByTheSelectionAndUnknownIdsAreDisabled) {
    const QString note = Add(u"note"_s);
    const QString linked = Linked(u"/docs/a.pdf"_s, 100);
    WNavDS* model = Show();

    struct Row {
        int id;
        bool onNotebook;
        bool onNote;
        bool onLinked;
    };
    // New note, rename, delete, restore, save to notebook, print, send to word processor,
    // close (nothing is open) and an id nobody knows.
    const Row rows[] = {
        {32855, true, true, true},    {32857, false, true, false},  {32858, false, true, true},
        {32901, false, false, false}, {32875, false, false, true},  {32829, false, true, true},
        {32859, true, true, false},   {32872, false, false, false}, {12345, false, false, false},
    };
    for (const QString& selected : {u"root"_s, note, linked}) {
        model->SelectById(selected);
        router->UpdateActions();
        for (const Row& row : rows) {
            const bool expected = selected == u"root"_s ? row.onNotebook
                                  : selected == note    ? row.onNote
                                                        : row.onLinked;
            EXPECT_EQ(router->IsEnabled(row.id), expected)
                << row.id << " " << selected.toStdString();
            QAction* action = router->Action(row.id);
            EXPECT_EQ(action->isEnabled(), expected) << row.id;
        }
    }
    EXPECT_FALSE(router->Execute(12345));

    // Through the shared entries: delete, then restore, then rename in the tree.
    model->SelectById(note);
    tree->OnIdle();
    router->Action(32858)->trigger();
    EXPECT_TRUE(model->IsInDeletedItems(Item(note)));
    EXPECT_FALSE(router->Action(32901)->isEnabled()) << "the old parent is selected";
    model->SelectById(note);
    router->UpdateActions();
    EXPECT_TRUE(router->Action(32901)->isEnabled());
    router->Action(32901)->trigger();
    EXPECT_FALSE(model->IsInDeletedItems(Item(note)));
    model->SelectById(note);
    tree->OnIdle();
    EXPECT_TRUE(router->Execute(32893));
    EXPECT_NE(Editor(), nullptr);

    const std::size_t before = model->GetItems().size();
    EXPECT_TRUE(router->Execute(32856));
    EXPECT_EQ(model->GetItems().size(), before + 1);
    EXPECT_EQ(model->GetSelected()->GetKind(), ItemKindFolder);
}

} // namespace
