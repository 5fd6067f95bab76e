#pragma once

#include "common/Result.h"

#include <QString>

namespace DataExchange {

// Visitor to which a string list reports its entries in order.
class IStringIDReporter {
public:
    virtual ~IStringIDReporter() = default;
    virtual HRESULT ReportStringID(const QString& string) = 0;
};

} // namespace DataExchange
