#pragma once

#include "common/IUnicodeString.h"
#include "dataexchange/IPropertyReporter.h"

#include <QString>

namespace DataExchange {

// Writes the reported pairs as pipe-delimited text: escaped name, "|", escaped value, "|" per
// pair, with a backslash put before every "|" and every backslash. Fed by ReportProperties,
// the pairs come in name order; no header, count or terminator is added.
class PipeDelimitedStringReporter final : public IPropertyReporter {
public:
    HRESULT ReportProperty(const QString& name, const QString& value) override;

    // Hands the text over: E_INVALIDARG without a sink, otherwise the sink's answer.
    HRESULT GetString(IUnicodeString* sink) const;

private:
    QString m_text = QStringLiteral("");
};

} // namespace DataExchange
