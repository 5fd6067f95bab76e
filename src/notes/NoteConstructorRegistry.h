#pragma once

#include "notes/CBasicNoteConstructor.h"

#include <QString>

// A new, initialised note constructor for the source file, chosen by its extension
// (".txt" and ".tmp" text, ".jpg", ".gif", ".bmp" and ".png" pictures, in any case); null
// for any other file or when the constructor cannot be made.
CBasicNoteConstructor* CreateNoteConstructor(const QString& source);
