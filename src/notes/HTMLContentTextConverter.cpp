#include "notes/HTMLContentTextConverter.h"

#include <array>
#include <new>

namespace {

struct EscapeRow {
    char16_t character;
    QLatin1StringView replacement;
};

// Searched from the top; the first row for a character wins, so the entity rows below the
// percent-encoded ones for the same character never apply.
constexpr std::array<EscapeRow, 10> kEscapeTable{{
    {u'<', QLatin1StringView("%3C")},
    {u'<', QLatin1StringView("&lt;")},
    {u'>', QLatin1StringView("%3E")},
    {u'>', QLatin1StringView("&gt;")},
    {u' ', QLatin1StringView("%20")},
    {u' ', QLatin1StringView("&nbsp;")},
    {u'#', QLatin1StringView("%23")},
    {u'%', QLatin1StringView("%25")},
    {u'"', QLatin1StringView("&quot;")},
    {u'&', QLatin1StringView("&amp;")},
}};

const EscapeRow* FindRow(QChar c) {
    for (const EscapeRow& row : kEscapeTable) {
        if (c == row.character)
            return &row;
    }
    return nullptr;
}

} // namespace

HRESULT HTMLContentTextConverter::Convert(const QString& text, IUnicodeString* sink) {
    if (sink == nullptr)
        return E_INVALIDARG;
    QString escaped(0, u'\0'); // empty but not null: an empty text is a valid result
    escaped.reserve(text.size());
    for (QChar c : text) {
        if (const EscapeRow* row = FindRow(c))
            escaped.append(row->replacement);
        else
            escaped.append(c);
    }
    return sink->Assign(escaped);
}

unsigned long HTMLContentTextConverter::Release() {
    delete this;
    return 0;
}

IHTMLContentTextConverter* CreateHTMLContentTextConverter() {
    return new (std::nothrow) HTMLContentTextConverter();
}
