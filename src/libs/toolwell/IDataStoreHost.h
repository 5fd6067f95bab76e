#pragma once

#include "common/IUnicodeString.h"

#include <QString>

// Where the notebook lives on disk: the store folder, the catalog file and the item folders.
// Reference-counted; the one who obtains it releases it.
class IDataStoreHost {
public:
    virtual unsigned long AddRef() = 0;
    virtual unsigned long Release() = 0;

    // Non-zero on success; *exists tells whether the folder or file is there now.
    virtual int GetStoreFolder(QString* folder, bool* exists) = 0;
    virtual int GetCatalogPath(QString* path, bool* exists) = 0;
    // The base folder of the item (note) folders.
    virtual HRESULT GetNotesFolder(IUnicodeString* sink, int reserved) = 0;
    // 1 when the item's folder exists afterwards (made when create is true). Refuses, with 0
    // and nothing made, any identifier that is not of the catalog's GUID form.
    virtual int GetItemFolder(QString* folder, const QString& itemId, bool create) = 0;

protected:
    virtual ~IDataStoreHost() = default;
};

// A new reference to the host over the user's application data folder.
IDataStoreHost* GetDataStoreHost();
