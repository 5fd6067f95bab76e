#pragma once

#include "common/IUnicodeString.h"
#include "common/Result.h"

#include <QString>

namespace DataExchange {

class IPropertyReporter;

// Named string values sorted by name: the unit of exchange with the catalog, the note tool,
// the viewer, the message broker and the settings file. Booleans are "true" / "false".
class IProperties {
public:
    virtual ~IProperties() = default;
    // Sets every pair of the source into this set.
    virtual HRESULT CopyProperties(IProperties* source) = 0;
    // 0 with the value handed to the sink's Assign (its answer) when the name is present;
    // 1 when it is absent or no sink is given, leaving the sink untouched.
    virtual HRESULT GetProperty(const QString& name, IUnicodeString* value) = 0;
    // Inserts or overwrites; a null value stores the empty text.
    virtual HRESULT SetProperty(const QString& name, const QString& value) = 0;
    // Every pair in ascending name order; answers the last call's result, 1 when empty.
    virtual HRESULT ReportProperties(IPropertyReporter* reporter) = 0;
    // Deletes the object; answers 0.
    virtual HRESULT Release() = 0;
};

} // namespace DataExchange
