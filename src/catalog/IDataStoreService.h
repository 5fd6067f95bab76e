#pragma once

#include "common/IUnicodeString.h"
#include "common/Result.h"
#include "dataexchange/IDataStoreReporter.h"
#include "dataexchange/IProperties.h"
#include "dataexchange/IStringIDReporter.h"

#include <QString>

class IDataStoreHost;

// Thrown inside the service's creation only; it never leaves CreateDataStoreService.
enum enum_DSPublicException {
    // The data store host could not tell where the catalog file lives.
    DSPublicException_NoCatalogPath = 1,
};

// The only door to the catalog. Identifiers are item identifiers or "root" (the Notebook);
// a null QString stands for a missing argument and answers E_FAIL. Every operation that needs
// the catalog answers E_FAIL while the catalog is not loaded or the service is suspended.
// The service never saves by itself: the idle pass calls Save after model changes and
// shut-down calls Shutdown(1).
class IDataStoreService {
public:
    // Saves first when save is 1, then destroys the service.
    virtual void Shutdown(int save) = 0;
    // Destroys the process-wide service, whichever reference it is called on.
    virtual void Release() = 0;

    // A note item (properties required) with its folder on disk; the new identifier goes to
    // the sink.
    virtual HRESULT CreateNote(DataExchange::IProperties* properties, IUnicodeString* id) = 0;
    // A document item; when the properties carry a "path" that an existing document already
    // has, that document's identifier is handed out and nothing is created.
    virtual HRESULT CreateDocument(DataExchange::IProperties* properties, IUnicodeString* id) = 0;
    virtual HRESULT CreateFolder(DataExchange::IProperties* properties, IUnicodeString* id) = 0;
    // Removes the item, its descendants and their folders on disk. "root" is refused.
    virtual HRESULT DeleteItem(const QString& id) = 0;

    // S_OK when at least one property was copied into target.
    virtual HRESULT GetProperties(const QString& id, DataExchange::IProperties* target) = 0;
    // Replaces all properties of the item with the source's; an empty source changes nothing
    // and answers 1. Otherwise the answer of the last pair written.
    virtual HRESULT SetProperties(const QString& id, DataExchange::IProperties* source) = 0;
    // Replaces only the properties the source names; answers as SetProperties.
    virtual HRESULT UpdateProperties(const QString& id, DataExchange::IProperties* source) = 0;

    // Every descendant, parent before its children; answers how many were reported.
    virtual HRESULT ReportDescendants(const QString& id, IDataStoreReporter* reporter) = 0;
    // The direct children in display order; E_FAIL when there are none.
    virtual HRESULT ReportChildren(const QString& id,
                                   DataExchange::IStringIDReporter* reporter) = 0;
    // Places the item under newParent, before the sibling `before` (last when `before` is
    // empty or not a child of newParent). A parent inside the item's own subtree is refused.
    virtual HRESULT MoveItemBefore(const QString& id, const QString& newParent,
                                   const QString& before) = 0;
    virtual HRESULT MoveItem(const QString& id, const QString& newParent) = 0;

    // Makes the catalog file when there is none and loads it.
    virtual HRESULT Open() = 0;
    virtual HRESULT Close() = 0;
    // Writes the catalog when it changed since it was loaded or last written, and answers S_OK
    // without writing otherwise; a catalog that failed to load is never written over.
    virtual HRESULT Save() = 0;
    // After a Save that could not write the file (a full disk, a read-only folder): S_OK, the
    // catalog file's path and the reason. S_FALSE when the last Save worked or wrote nothing
    // (suspended, or a catalog that failed to load).
    virtual HRESULT GetSaveError(IUnicodeString* path, IUnicodeString* reason) = 0;
    // While suspended every catalog operation, Save included, answers E_FAIL.
    virtual HRESULT Suspend() = 0;
    virtual HRESULT Resume() = 0;
    virtual HRESULT IsSuspended(int* suspended) = 0;

protected:
    virtual ~IDataStoreService() = default;
};

// Creates (once) and opens the process-wide service over the host's catalog file. Null without
// a host or when the host cannot name the catalog file. A failed load still gives a service,
// over an empty catalog that refuses every item operation.
IDataStoreService* CreateDataStoreService(IDataStoreHost* host);

// The process-wide service, or null before creation and after Release.
IDataStoreService* GetDataStoreService();
