#pragma once

#include "common/Result.h"

#include <QString>

#include <cstdint>

// Writes a new note file: one fixed HTML document with an embedded style sheet, UTF-8, to a
// file that must not exist yet. Colours are 32-bit values with red in the low byte.
class INoteDocumentCreator {
public:
    // Stored escaped; E_FAIL (title unchanged) when it cannot be escaped.
    virtual HRESULT SetTitle(const QString& title) = 0;
    // "none" in any case gives the word "none"; anything else "url( path )".
    virtual HRESULT SetBackgroundImage(const QString& path) = 0;
    virtual HRESULT SetBackgroundColor(std::uint32_t color) = 0;
    // An empty family leaves the FONT-FAMILY declaration out.
    virtual HRESULT SetFontFamily(const QString& family) = 0;
    // Only the unit "points" is taken; any other gives E_INVALIDARG and keeps the size.
    virtual HRESULT SetFontSize(std::uint32_t value, const QString& unit) = 0;
    virtual HRESULT SetTextColor(std::uint32_t color) = 0;
    // Keeps its place for the note tool's creator; nothing here uses it.
    virtual HRESULT SetReserved(std::uint32_t value) = 0;
    // Top and bottom paragraph margin in ems.
    virtual HRESULT SetMargin(std::uint32_t value) = 0;
    // The body, HTML already: stored as it is.
    virtual HRESULT SetContent(const QString& html) = 0;
    virtual HRESULT SetFilePath(const QString& path) = 0;
    // Writes the document. S_OK when it was written, and also when the file exists already
    // (then it is left untouched); E_FAIL when it could not be created or written whole.
    virtual HRESULT Write() = 0;
    virtual unsigned long Release() = 0;

protected:
    virtual ~INoteDocumentCreator() = default;
};

// A new creator with the first values of a note; null when it cannot be made.
INoteDocumentCreator* CreateNoteDocumentCreator();
