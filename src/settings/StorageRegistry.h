#pragma once

#include "dataexchange/IProperties.h"

namespace Settings {

class IStorage;

// The process-wide list of storages, in construction order. Loading and saving the settings
// walk it, so declaring one more storage member is all it takes to persist one more option.
class StorageRegistry {
public:
    // Appends; a storage already listed is not added twice.
    static void Register(IStorage* storage);
    static void Unregister(IStorage* storage);
    static bool Contains(const IStorage* storage);

    static void LoadAll(DataExchange::IProperties* from);
    static void SaveAll(DataExchange::IProperties* into);
};

} // namespace Settings
