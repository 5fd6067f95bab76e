#pragma once

#include "dataexchange/IProperties.h"

namespace Settings {

// One persisted option that knows its own key.
class IStorage {
public:
    virtual ~IStorage() = default;
    // Reads the option from the set; a missing key leaves the value as it is.
    virtual void Load(DataExchange::IProperties* from) = 0;
    virtual void Save(DataExchange::IProperties* into) = 0;
};

} // namespace Settings
