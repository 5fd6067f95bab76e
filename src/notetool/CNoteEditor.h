#pragma once

#include "notetool/CNotePictures.h"
#include "notetool/NoteContent.h"

#include <QTextEdit>

// The rich-text editor of one note. Pictures that are pasted or dropped into it are stored
// in the note's folder and referred to by file name.
class CNoteEditor final : public QTextEdit {
    Q_OBJECT
public:
    explicit CNoteEditor(QWidget* parent = nullptr);

    // Shows the note of the file at notePath: its header's font, colours and margins as the
    // page's look, its body as the text. The document starts unmodified, with no undo steps.
    void ShowNote(const NoteContent& content, const QString& notePath);
    // The header's look again, after the navigator changed the note's font or background.
    void ApplyLook(const NoteContent& content);
    // The body to save: the document as HTML, without its header.
    QString BodyHtml() const;

    // Copies a picture file into the note's folder and inserts it at the cursor.
    bool InsertPictureFile(const QString& path);

protected:
    bool canInsertFromMimeData(const QMimeData* source) const override;
    void insertFromMimeData(const QMimeData* source) override;

private:
    void InsertPicture(const QString& fileName);

    QString m_folder;
    CNotePictures m_pictures;
};
