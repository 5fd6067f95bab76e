#pragma once

class CCommandRouter;
class WNavigatorTree;

// The navigator's item commands: new notes and folders, rename, delete and restore, open and
// close, saving a linked document to the notebook, printing and sending to the word
// processor, each enabled from the current selection; the tree's filters; and, through
// CApplicationCommands, the commands of the application itself.
class CNavigatorCommands {
public:
    // Routes the commands to the data source, and rename to the tree's in-place editor. The
    // tree's window is the navigator's window for the application's commands.
    static void Register(CCommandRouter& router, WNavigatorTree* tree);
};
