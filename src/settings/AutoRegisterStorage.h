#pragma once

#include "settings/IStorage.h"

namespace Settings {

// A storage that enters the registry when constructed and leaves it when destroyed.
class AutoRegisterStorage : public IStorage {
public:
    AutoRegisterStorage();
    ~AutoRegisterStorage() override;

    // A copy would be a second, unregistered storage of the same key.
    AutoRegisterStorage(const AutoRegisterStorage&) = delete;
    AutoRegisterStorage& operator=(const AutoRegisterStorage&) = delete;
};

} // namespace Settings
