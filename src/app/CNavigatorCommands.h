#pragma once

class CCommandRouter;
class WNavigatorTree;

// The navigator's item commands: new notes and folders, rename, delete and restore, open and
// close, saving a linked document to the notebook, printing and sending to the word
// processor, each enabled from the current selection.
class CNavigatorCommands {
public:
    // Routes the commands to the data source, and rename to the tree's in-place editor.
    static void Register(CCommandRouter& router, WNavigatorTree* tree);
};
