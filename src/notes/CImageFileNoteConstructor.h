#pragma once

#include "notes/CBasicNoteConstructor.h"

// Makes a note from a picture: the picture is copied beside the note file, and the note's
// body is one img element that refers to it by its bare file name.
class CImageFileNoteConstructor final : public CBasicNoteConstructor {
public:
    explicit CImageFileNoteConstructor(const QString& source);

    int CanConstruct(const QString& source) override;
    int BuildContent(QString* content, const QString& noteFilePath,
                     const QString& fontFamily) override;

private:
    ~CImageFileNoteConstructor() override = default;
};
