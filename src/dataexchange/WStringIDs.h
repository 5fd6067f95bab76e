#pragma once

#include "dataexchange/IStringIDs.h"

#include <QStringList>

namespace DataExchange {

// The string list: entries in insertion order, duplicates kept.
class WStringIDs final : public IStringIDs {
public:
    WStringIDs() = default;
    ~WStringIDs() override = default;

    HRESULT AddStringID(const QString& string) override;
    HRESULT ReportStringIDs(IStringIDReporter* reporter) override;
    HRESULT Release() override;

private:
    QStringList m_strings;
};

// A new, empty string list on the heap; its holder ends it with Release().
IStringIDs* CreateStringIDs();

} // namespace DataExchange
