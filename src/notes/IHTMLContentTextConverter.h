#pragma once

#include "common/IUnicodeString.h"
#include "common/Result.h"

#include <QString>

// Escapes plain text for the title and attributes of a note document.
class IHTMLContentTextConverter {
public:
    // Hands the escaped text to the sink and answers the sink's result; E_INVALIDARG for a
    // null sink.
    virtual HRESULT Convert(const QString& text, IUnicodeString* sink) = 0;
    virtual unsigned long Release() = 0;

protected:
    virtual ~IHTMLContentTextConverter() = default;
};

// A new converter; it holds no state.
IHTMLContentTextConverter* CreateHTMLContentTextConverter();
