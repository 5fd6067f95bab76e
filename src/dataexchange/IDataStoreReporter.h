#pragma once

#include "common/Result.h"

#include <QString>

// Visitor of a walk over the catalog's items.
class IDataStoreReporter {
public:
    virtual ~IDataStoreReporter() = default;
    virtual HRESULT ReportItem(const QString& identifier) = 0;
    // Nonzero stops the walk from descending below the item just reported.
    virtual int SkipChildren() = 0;
};
