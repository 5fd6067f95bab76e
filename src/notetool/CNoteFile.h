#pragma once

#include "notetool/NoteContent.h"

#include <QByteArray>
#include <QString>

// One note's "note.htm": read as well as its text allows, written whole through a temporary
// file. A file that exists but is not text is never written over.
class CNoteFile {
public:
    enum class State { New, Read, Unreadable };

    explicit CNoteFile(QString path);

    const QString& Path() const { return m_path; }
    QString Folder() const;

    // New: no file yet, the content stays as it is. Unreadable: the file could not be read or
    // is no text; the content stays as it is and Save refuses from then on.
    State Load(NoteContent* content);
    // False when the file was unreadable, Load was never called, or the write failed (the old
    // file then stays whole).
    bool Save(const NoteContent& content);
    // Why the last Save failed to write; empty when it worked or wrote nothing.
    const QString& SaveError() const { return m_saveError; }

    // The file's bytes: the note header with the content's font, size and background, the
    // body, UTF-8, one zero byte at the end.
    static QByteArray Format(const NoteContent& content);
    // Reads file bytes into the content; false when they are no text. Missing header parts
    // keep the content's values; a file cut short keeps what it has of its body.
    static bool Parse(const QByteArray& bytes, NoteContent* content);
    // The inside of an HTML text's body, without the one division a note wraps it in.
    static QString BodyOf(const QString& html);

private:
    QString m_path;
    bool m_writable = false;
    QString m_saveError;
};
