#pragma once

#include <QString>

class QImage;

// The pictures of one note live in the note's folder beside "note.htm"; the note refers to
// them by file name. A picture never replaces a file that is there already.
class CNotePictures {
public:
    explicit CNotePictures(QString folder);

    // Stores a pasted or dropped picture as a PNG file; its file name, empty on failure.
    QString AddImage(const QImage& image) const;
    // Copies a picture file into the folder under its own name (numbered when taken); the
    // file name, empty when the source is no regular file or the copy failed.
    QString CopyFile(const QString& source) const;

    // Whether a file's name says it holds a picture the editor can show.
    static bool IsPictureFile(const QString& path);

private:
    // "base.suffix", or "base-2.suffix", "base-3.suffix"... whichever is free.
    QString FreeName(const QString& base, const QString& suffix) const;

    QString m_folder;
};
