#pragma once

#include "drop/CNavigatorOperationHandler.h"

#include <QtGlobal>

// Text dropped as "text/plain" becomes a note with the default title, made through a
// temporary ".tmp" file, whose rules let control bytes through as blanks.
class CNavigatorClipboardDropOperation final : public CNavigatorOperationHandler {
public:
    // Text of this many bytes or more is not taken, and nothing is said about it.
    static constexpr qsizetype kMaxTextBytes = 324160;

    CNavigatorClipboardDropOperation();

    int CanAccept(const QMimeData* data) override;
    int Perform(const QMimeData* data) override;
};
