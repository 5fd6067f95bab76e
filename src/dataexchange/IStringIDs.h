#pragma once

#include "common/Result.h"

#include <QString>

namespace DataExchange {

class IStringIDReporter;

// An ordered list of strings, usually item identifiers; duplicates are kept.
class IStringIDs {
public:
    virtual ~IStringIDs() = default;
    // Appends a copy; answers 0.
    virtual HRESULT AddStringID(const QString& string) = 0;
    // Every entry in insertion order; answers the last call's result, 1 when empty.
    virtual HRESULT ReportStringIDs(IStringIDReporter* reporter) = 0;
    // Deletes the object; answers 0.
    virtual HRESULT Release() = 0;
};

} // namespace DataExchange
