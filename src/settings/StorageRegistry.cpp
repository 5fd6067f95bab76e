#include "settings/StorageRegistry.h"

#include "settings/IStorage.h"

#include <QGlobalStatic>

#include <algorithm>
#include <vector>

namespace Settings {

namespace {

// A storage may outlive the list at process exit (a singleton destroyed late); the list
// then answers as destroyed and is left alone.
Q_GLOBAL_STATIC(std::vector<IStorage*>, g_storages)

} // namespace

void StorageRegistry::Register(IStorage* storage) {
    if (storage == nullptr || g_storages.isDestroyed())
        return;
    if (std::find(g_storages->begin(), g_storages->end(), storage) == g_storages->end())
        g_storages->push_back(storage);
}

void StorageRegistry::Unregister(IStorage* storage) {
    if (g_storages.isDestroyed())
        return;
    const auto found = std::find(g_storages->begin(), g_storages->end(), storage);
    if (found != g_storages->end())
        g_storages->erase(found);
}

bool StorageRegistry::Contains(const IStorage* storage) {
    return !g_storages.isDestroyed() &&
           std::find(g_storages->begin(), g_storages->end(), storage) != g_storages->end();
}

void StorageRegistry::LoadAll(DataExchange::IProperties* from) {
    if (from == nullptr || g_storages.isDestroyed())
        return;
    for (IStorage* storage : *g_storages)
        storage->Load(from);
}

void StorageRegistry::SaveAll(DataExchange::IProperties* into) {
    if (into == nullptr || g_storages.isDestroyed())
        return;
    for (IStorage* storage : *g_storages)
        storage->Save(into);
}

} // namespace Settings
