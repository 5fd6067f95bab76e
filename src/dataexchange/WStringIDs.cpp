#include "dataexchange/WStringIDs.h"

#include "dataexchange/IStringIDReporter.h"

namespace DataExchange {

HRESULT WStringIDs::AddStringID(const QString& string) {
    if (string.isNull())
        return E_INVALIDARG;
    m_strings.append(string);
    return S_OK;
}

HRESULT WStringIDs::ReportStringIDs(IStringIDReporter* reporter) {
    if (m_strings.isEmpty())
        return S_FALSE;
    if (reporter == nullptr)
        return E_INVALIDARG;
    // A reporter may add to this very list; walk a snapshot.
    const QStringList snapshot = m_strings;
    HRESULT result = S_FALSE;
    for (const QString& string : snapshot)
        result = reporter->ReportStringID(string);
    return result;
}

HRESULT WStringIDs::Release() {
    delete this;
    return S_OK;
}

IStringIDs* CreateStringIDs() {
    return new WStringIDs;
}

} // namespace DataExchange
