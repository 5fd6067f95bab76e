#pragma once

#include <QString>

// "Save As..." for a document of the notebook: what the save dialog offers for the document's
// file, and the copy to the place the user chose.
class SaveAsDocument {
public:
    struct FileType {
        // The part of the path after its last separator.
        QString fileName;
        // After the file name's last "."; "*" when it has none.
        QString extension;
        // "Microsoft Word Document", "PDF Document", "Quillmark Document" or empty.
        QString typeText;
        // The dialog's filter: type text, " (*.", extension, ")".
        QString nameFilter;
        // What the dialog appends to a name typed without extension; empty for "*".
        QString defaultSuffix;
    };
    static FileType Describe(const QString& path);

    // Copies the document to target. A target that is the document itself is left alone, and
    // an existing target is replaced whole or not at all: the copy is written beside it and
    // renamed over it. False when nothing was copied.
    static bool Copy(const QString& source, const QString& target);
};
