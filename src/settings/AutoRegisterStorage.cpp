#include "settings/AutoRegisterStorage.h"

#include "settings/StorageRegistry.h"

namespace Settings {

AutoRegisterStorage::AutoRegisterStorage() {
    StorageRegistry::Register(this);
}

AutoRegisterStorage::~AutoRegisterStorage() {
    StorageRegistry::Unregister(this);
}

} // namespace Settings
