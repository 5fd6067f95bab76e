#pragma once

#include "catalog/IDataStoreService.h"
#include "catalog/XmlDataStore.h"

// The data store service: the process-wide catalog store behind IDataStoreService. It counts
// as open only while the store is open and not suspended. The store is a member rather than a
// private base: both declare a virtual Close with different results.
class DataStoreAdapter final : public IDataStoreService {
public:
    DataStoreAdapter(const QString& path, IDataStoreHost* host);

    void Shutdown(int save) override;
    void Release() override;
    HRESULT CreateNote(DataExchange::IProperties* properties, IUnicodeString* id) override;
    HRESULT CreateDocument(DataExchange::IProperties* properties, IUnicodeString* id) override;
    HRESULT CreateFolder(DataExchange::IProperties* properties, IUnicodeString* id) override;
    HRESULT DeleteItem(const QString& id) override;
    HRESULT GetProperties(const QString& id, DataExchange::IProperties* target) override;
    HRESULT SetProperties(const QString& id, DataExchange::IProperties* source) override;
    HRESULT UpdateProperties(const QString& id, DataExchange::IProperties* source) override;
    HRESULT ReportDescendants(const QString& id, IDataStoreReporter* reporter) override;
    HRESULT ReportChildren(const QString& id, DataExchange::IStringIDReporter* reporter) override;
    HRESULT MoveItemBefore(const QString& id, const QString& newParent,
                           const QString& before) override;
    HRESULT MoveItem(const QString& id, const QString& newParent) override;
    HRESULT Open() override;
    HRESULT Close() override;
    HRESULT Save() override;
    HRESULT GetSaveError(IUnicodeString* path, IUnicodeString* reason) override;
    HRESULT Suspend() override;
    HRESULT Resume() override;
    HRESULT IsSuspended(int* suspended) override;

private:
    ~DataStoreAdapter() override;

    bool IsServiceOpen() const;
    HRESULT CreateItemWithProperties(const QString& kind, DataExchange::IProperties* properties,
                                     bool withFolder, IUnicodeString* id);

    Brindle::Data::XmlAccess::XmlDataStore m_store;
    IDataStoreHost* m_host;
    QString m_saveError;
};
