#pragma once

#include "libs/toolwell/IDataStoreHost.h"

#include <atomic>

// The data store host over a notebook folder ("Catalog" below the application data folder).
class CDataStoreHost final : public IDataStoreHost {
public:
    explicit CDataStoreHost(const QString& applicationDataFolder);

    unsigned long AddRef() override;
    unsigned long Release() override;
    int GetStoreFolder(QString* folder, bool* exists) override;
    int GetCatalogPath(QString* path, bool* exists) override;
    HRESULT GetNotesFolder(IUnicodeString* sink, int reserved) override;
    int GetItemFolder(QString* folder, const QString& itemId, bool create) override;

private:
    ~CDataStoreHost() override = default;

    std::atomic<unsigned long> m_references{1};
    QString m_storeFolder;
};
