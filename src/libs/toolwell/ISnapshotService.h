#pragma once

#include "common/Result.h"

#include <QString>

#include <functional>

// Takes a picture of the whole screen (every screen, side by side as they stand) and puts it
// somewhere. The object stays the library's: callers never release it.
class ISnapshotService {
public:
    // The picture goes onto the clipboard.
    virtual HRESULT SnapshotToClipboard() = 0;
    // The picture becomes a new picture note through the installed note handler.
    virtual HRESULT SnapshotToNewNote() = 0;
    // The picture is opened in the word processor.
    virtual HRESULT SnapshotToQm() = 0;

protected:
    virtual ~ISnapshotService() = default;
};

ISnapshotService* GetSnapshotService();

// Makes a note of the PNG file at the given path; the handler may delete the file. The
// navigator installs one at start-up; until then a snapshot note cannot be made.
using SnapshotNoteHandler = std::function<HRESULT(const QString& picturePath)>;
// An empty handler removes the installed one.
void SetSnapshotNoteHandler(SnapshotNoteHandler handler);
