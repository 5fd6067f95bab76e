#pragma once

#include "common/ReleasePtr.h"
#include "dataexchange/IProperties.h"
#include "dataexchange/WProperties.h"

#include <QString>

// Property-set helpers shared by the data source's files.
namespace ItemProperties {

using PropertiesPtr = ReleasePtr<DataExchange::IProperties>;

inline PropertiesPtr NewProperties() {
    return PropertiesPtr(DataExchange::CreateProperties());
}

inline PropertiesPtr OneProperty(const QString& name, const QString& value) {
    PropertiesPtr set = NewProperties();
    set->SetProperty(name, value);
    return set;
}

// The property's text; null when the set does not hold it.
inline QString Property(DataExchange::IProperties* properties, const QString& name) {
    QString value;
    UnicodeStringPtr sink(&value);
    if (properties == nullptr || properties->GetProperty(name, &sink) != S_OK)
        return {};
    return value;
}

} // namespace ItemProperties
