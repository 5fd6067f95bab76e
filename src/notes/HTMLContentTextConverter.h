#pragma once

#include "notes/IHTMLContentTextConverter.h"

// Less-than, greater-than, blank, number sign and percent sign become their percent-encoded
// forms, double quote and ampersand their entities; everything else stays as it is. Other
// programs read titles written this way, so the table must not change.
class HTMLContentTextConverter final : public IHTMLContentTextConverter {
public:
    HRESULT Convert(const QString& text, IUnicodeString* sink) override;
    unsigned long Release() override;
};
