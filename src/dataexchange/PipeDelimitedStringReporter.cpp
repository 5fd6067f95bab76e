#include "dataexchange/PipeDelimitedStringReporter.h"

namespace DataExchange {

namespace {

void AppendEscaped(QString& text, const QString& field) {
    for (const QChar c : field) {
        if (c == u'|' || c == u'\\')
            text.append(u'\\');
        text.append(c);
    }
}

} // namespace

HRESULT PipeDelimitedStringReporter::ReportProperty(const QString& name, const QString& value) {
    AppendEscaped(m_text, name);
    m_text.append(u'|');
    AppendEscaped(m_text, value);
    m_text.append(u'|');
    return S_OK;
}

HRESULT PipeDelimitedStringReporter::GetString(IUnicodeString* sink) const {
    if (sink == nullptr)
        return E_INVALIDARG;
    return sink->Assign(m_text);
}

} // namespace DataExchange
