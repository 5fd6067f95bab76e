#pragma once

#include "dataexchange/IStringIDReporter.h"

#include <QStringList>

namespace DataExchange {

// Collects the reported strings in order; the owner reads them afterwards.
class CBasicStringIDReporter final : public IStringIDReporter {
public:
    HRESULT ReportStringID(const QString& string) override {
        m_stringIDs.append(string);
        return S_OK;
    }

    const QStringList& StringIDs() const { return m_stringIDs; }

private:
    QStringList m_stringIDs;
};

} // namespace DataExchange
