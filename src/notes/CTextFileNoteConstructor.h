#pragma once

#include "notes/CBasicNoteConstructor.h"

// Makes a note from a text file: 8-bit text (UTF-8 when valid, else Windows-1252), UTF-8 or
// UTF-16 with a byte-order mark. At most the first 1,024,000 bytes are taken.
class CTextFileNoteConstructor final : public CBasicNoteConstructor {
public:
    explicit CTextFileNoteConstructor(const QString& source);

    int CanConstruct(const QString& source) override;
    int BuildContent(QString* content, const QString& noteFilePath,
                     const QString& fontFamily) override;

    // The most bytes of a text file that go into a note ("1MB" in the message).
    static constexpr qint64 kMaxTextBytes = 1024000;

private:
    ~CTextFileNoteConstructor() override = default;
};
