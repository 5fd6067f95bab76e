#pragma once

#include "common/Result.h"

#include <QString>

namespace DataExchange {

// Visitor to which a property set reports its pairs one at a time.
class IPropertyReporter {
public:
    virtual HRESULT ReportProperty(const QString& name, const QString& value) = 0;
    virtual ~IPropertyReporter() = default;
};

} // namespace DataExchange
