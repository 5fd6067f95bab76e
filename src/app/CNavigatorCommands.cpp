#include "app/CNavigatorCommands.h"

#include "app/CApplicationCommands.h"
#include "app/CCommandRouter.h"
#include "navigator/WNavDS.h"
#include "navigator/WNavigatorTree.h"

#include <QPointer>

namespace {

// The data source as it is now: tests and shut-down make it anew.
WNavDS* Model() {
    return WNavDS::Instance();
}

// A command on the data source, enabled by one of its selection predicates (null: always).
CCommandRouter::Command On(void (WNavDS::*operation)(), bool (WNavDS::*enabled)() const = nullptr) {
    CCommandRouter::Command command;
    command.execute = [operation] { (Model()->*operation)(); };
    if (enabled != nullptr)
        command.enabled = [enabled] { return (Model()->*enabled)(); };
    return command;
}

} // namespace

void CNavigatorCommands::Register(CCommandRouter& router, WNavigatorTree* tree) {
    router.Register({32769, 32855}, {[] { Model()->NewNote(nullptr, nullptr); }, nullptr, nullptr});
    router.Register({32824, 32856}, {[] { Model()->NewFolder(nullptr); }, nullptr, nullptr});

    const QPointer<WNavigatorTree> editor(tree);
    router.Register({32857, 32874, 32893},
                    {[editor] {
                         if (editor)
                             editor->EditSelectedLabel();
                     },
                     [editor] { return editor && Model()->CanRenameSelected(); }, nullptr});

    router.Register({32831, 32858, 32873, 32892},
                    On(&WNavDS::DeleteSelected, &WNavDS::CanEditSelected));
    // Only offered on items in Deleted Items, where Delete removes for good.
    router.Register({32900}, On(&WNavDS::DeleteSelected, &WNavDS::IsSelectedInDeletedItems));
    router.Register({32830, 32901},
                    On(&WNavDS::RestoreSelected, &WNavDS::IsSelectedInDeletedItems));
    router.Register({32875}, {[] { Model()->MoveSelectedTo(nullptr); },
                              [] { return Model()->IsLinkedDocumentSelected(); }, nullptr});

    router.Register({32871, 32890}, On(&WNavDS::OpenSelected));
    router.Register({32872, 32891}, On(&WNavDS::CloseSelected, &WNavDS::IsSelectedOpen));
    router.Register({32861}, On(&WNavDS::OpenAllInSelectedFolder));
    router.Register({32860}, On(&WNavDS::CloseAllInSelectedFolder));
    router.Register({32825}, On(&WNavDS::CloseAllOpenNotes));
    router.Register({32826}, On(&WNavDS::CloseAllOpenDocuments));

    router.Register({32829, 32880, 32897}, On(&WNavDS::PrintSelected, &WNavDS::CanPrintSelected));
    router.Register({32827, 32834, 32859, 32896}, On(&WNavDS::SendSelectedToWordProcessor,
                                                     &WNavDS::CanSendSelectedToWordProcessor));
    router.Register({32879}, On(&WNavDS::SendSelectedToWordProcessor, &WNavDS::CanPrintSelected));
    router.Register({32770}, On(&WNavDS::NewWordProcessorDocument));
    router.Register({32774}, On(&WNavDS::OpenNewDocumentInViewer));

    const std::pair<int, WNavDS::TypeFilter> filters[] = {
        {32794, WNavDS::TypeFilter::Notes}, {32795, WNavDS::TypeFilter::Qmd},
        {32796, WNavDS::TypeFilter::Doc},   {32797, WNavDS::TypeFilter::Pdf},
        {32798, WNavDS::TypeFilter::All},
    };
    for (const auto& entry : filters) {
        const WNavDS::TypeFilter filter = entry.second;
        router.Register({entry.first}, {[filter] { Model()->ChooseTypeFilter(filter); }, nullptr,
                                        [filter] { return Model()->IsTypeFilterChosen(filter); }});
    }
    router.Register({32799}, {[] { Model()->ToggleOpenedItemsOnly(); }, nullptr,
                              [] { return Model()->IsOpenedItemsOnly(); }});

    // The tree sits in the navigator's window.
    CApplicationCommands::Register(
        router, [editor]() -> QWidget* { return editor ? editor->window() : nullptr; });
}
