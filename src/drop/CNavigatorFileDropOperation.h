#pragma once

#include "drop/CNavigatorOperationHandler.h"

// Local files dropped as "text/uri-list": documents of the word processor, Word and PDF are
// linked, text and picture files become notes. One file of another kind, a folder or a
// remote address refuses the whole drop.
class CNavigatorFileDropOperation final : public CNavigatorOperationHandler {
public:
    CNavigatorFileDropOperation();

    int CanAccept(const QMimeData* data) override;
    // Every file is tried; 1 only when every one was taken.
    int Perform(const QMimeData* data) override;
};
