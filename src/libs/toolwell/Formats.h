#pragma once

#include "common/Result.h"

#include <QList>
#include <QString>

#include <cstdint>

// Text forms the product shares between its programs.

// A time in seconds since 1970 (UTC) as ISO 8601 text, "2026-12-06T07:12:49Z".
HRESULT FormatTime(QString* text, std::int64_t time);
// Reads FormatTime's text back; E_FAIL for anything else, leaving the time untouched.
HRESULT ParseTime(std::int64_t* time, const QString& text);

// Comma-separated decimal integers (blanks around each allowed, optional sign). Reading stops
// at the first piece that is not a whole integer; answers how many were read.
int ParseIntegerList(const QString& text, QList<int>* numbers);

// A colour value (red in the low byte, then green, then blue) as "r,g,b" and back. ParseColor
// answers 0 (black) for text that does not hold three numbers from 0 to 255.
HRESULT FormatColor(QString* text, std::uint32_t color);
std::uint32_t ParseColor(const QString& text);
