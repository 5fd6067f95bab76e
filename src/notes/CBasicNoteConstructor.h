#pragma once

#include "common/ReleasePtr.h"
#include "notes/INoteDocumentCreator.h"
#include "notes/NoteDefaults.h"

#include <QString>

#include <optional>

// Turns one source file into a new note file. Older-style results: 1 for success, 0 for
// failure. Made by CreateNoteConstructor, used for one note, then released.
class CBasicNoteConstructor {
public:
    CBasicNoteConstructor(const CBasicNoteConstructor&) = delete;
    CBasicNoteConstructor& operator=(const CBasicNoteConstructor&) = delete;

    // Makes the document creator; 1 when it exists.
    virtual int Initialize();
    // 1 when a note can be made from the source.
    virtual int CanConstruct(const QString& source) = 0;
    // The HTML body of the note; 1 on success.
    virtual int BuildContent(QString* content, const QString& noteFilePath,
                             const QString& fontFamily) = 0;
    // Fills the document creator from the defaults and the source and writes the note file.
    // Shows the "cannot open" message when the body cannot be built.
    virtual int ConstructNote(const QString& noteFilePath, const QString& title);
    // CanConstruct, then ConstructNote.
    virtual int Create(const QString& noteFilePath, const QString& title);
    virtual void SetSource(const QString& source);
    // 1 wraps text in PRE and FONT; 0 leaves it as it is.
    virtual void SetPreformatted(int preformatted);
    virtual void Release();

    // The settings values the note gets; without them no note is made.
    void SetNoteDefaults(const NoteDefaults& defaults);

protected:
    explicit CBasicNoteConstructor(const QString& source);
    virtual ~CBasicNoteConstructor();

    const QString& Source() const { return m_source; }
    int Preformatted() const { return m_preformatted; }
    // The source's file name, as messages show it.
    QString SourceFileName() const;
    // Shows a string resource about the source file, with the program's title.
    void ShowSourceMessage(int stringId) const;

    // Plain text as HTML element content: "&", "<" and ">" become entities.
    static QString EscapeText(const QString& text);
    // Text as a double-quoted HTML attribute value.
    static QString EscapeAttribute(const QString& text);

private:
    ReleasePtr<INoteDocumentCreator> m_creator;
    QString m_source;
    int m_preformatted = 1;
    std::optional<NoteDefaults> m_defaults;
};
