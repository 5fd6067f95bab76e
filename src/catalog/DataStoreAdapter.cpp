#include "catalog/DataStoreAdapter.h"

#include "catalog/SetPropertiesTransfer.h"
#include "catalog/UpdatePropertiesTransfer.h"
#include "libs/toolwell/IDataStoreHost.h"

namespace {

DataStoreAdapter* g_service = nullptr;

} // namespace

DataStoreAdapter::DataStoreAdapter(const QString& path, IDataStoreHost* host)
    : m_store(path, host), m_host(host) {
    if (m_host != nullptr)
        m_host->AddRef();
}

DataStoreAdapter::~DataStoreAdapter() {
    if (m_host != nullptr)
        m_host->Release();
}

bool DataStoreAdapter::IsServiceOpen() const {
    return m_store.IsOpen() && m_store.Suspended() == 0;
}

void DataStoreAdapter::Shutdown(int save) {
    if (g_service == nullptr)
        return;
    if (save == 1)
        g_service->Save();
    g_service->Release();
}

void DataStoreAdapter::Release() {
    delete g_service;
    g_service = nullptr;
}

HRESULT DataStoreAdapter::CreateItemWithProperties(const QString& kind,
                                                   DataExchange::IProperties* properties,
                                                   bool withFolder, IUnicodeString* id) {
    const QString created = m_store.CreateItem(kind);
    if (created.isEmpty())
        return E_FAIL;
    if (properties != nullptr)
        SetProperties(created, properties);
    if (m_host != nullptr) {
        QString folder;
        m_host->GetItemFolder(&folder, created, withFolder);
        if (id != nullptr)
            id->Assign(created);
    }
    return S_OK;
}

HRESULT DataStoreAdapter::CreateNote(DataExchange::IProperties* properties, IUnicodeString* id) {
    if (!IsServiceOpen() || properties == nullptr)
        return E_FAIL;
    return CreateItemWithProperties(QStringLiteral("note"), properties, true, id);
}

HRESULT DataStoreAdapter::CreateDocument(DataExchange::IProperties* properties,
                                         IUnicodeString* id) {
    if (!IsServiceOpen())
        return E_FAIL;
    if (properties != nullptr) {
        QString path;
        UnicodeStringPtr pathSink(&path);
        if (properties->GetProperty(QStringLiteral("path"), &pathSink) == S_OK) {
            const QString existing = m_store.FindDocumentByPath(path);
            if (!existing.isEmpty()) {
                if (id != nullptr)
                    id->Assign(existing);
                return S_OK;
            }
        }
    }
    return CreateItemWithProperties(QStringLiteral("document"), properties, false, id);
}

HRESULT DataStoreAdapter::CreateFolder(DataExchange::IProperties* properties, IUnicodeString* id) {
    if (!IsServiceOpen())
        return E_FAIL;
    return CreateItemWithProperties(QStringLiteral("folder"), properties, false, id);
}

HRESULT DataStoreAdapter::DeleteItem(const QString& id) {
    if (!IsServiceOpen() || id.isNull())
        return E_FAIL;
    return m_store.DeleteItem(id) ? S_OK : E_FAIL;
}

HRESULT DataStoreAdapter::GetProperties(const QString& id, DataExchange::IProperties* target) {
    if (!IsServiceOpen() || id.isNull() || target == nullptr)
        return E_FAIL;
    return m_store.CopyPropertiesTo(id, target) > 0 ? S_OK : E_FAIL;
}

HRESULT DataStoreAdapter::SetProperties(const QString& id, DataExchange::IProperties* source) {
    if (!IsServiceOpen() || id.isNull() || source == nullptr)
        return E_FAIL;
    SetPropertiesTransfer transfer(&m_store, id);
    return source->ReportProperties(&transfer);
}

HRESULT DataStoreAdapter::UpdateProperties(const QString& id, DataExchange::IProperties* source) {
    if (!IsServiceOpen() || id.isNull() || source == nullptr)
        return E_FAIL;
    UpdatePropertiesTransfer transfer(&m_store, id);
    return source->ReportProperties(&transfer);
}

HRESULT DataStoreAdapter::ReportDescendants(const QString& id, IDataStoreReporter* reporter) {
    if (!IsServiceOpen() || id.isNull() || reporter == nullptr)
        return E_FAIL;
    return m_store.ReportDescendants(id, reporter);
}

HRESULT DataStoreAdapter::ReportChildren(const QString& id,
                                         DataExchange::IStringIDReporter* reporter) {
    if (!IsServiceOpen() || id.isNull() || reporter == nullptr)
        return E_FAIL;
    return m_store.ReportChildren(id, reporter) > 0 ? S_OK : E_FAIL;
}

HRESULT DataStoreAdapter::MoveItemBefore(const QString& id, const QString& newParent,
                                         const QString& before) {
    if (!IsServiceOpen() || id.isNull() || newParent.isNull())
        return E_FAIL;
    return m_store.MoveItem(id, newParent, before) ? S_OK : E_FAIL;
}

HRESULT DataStoreAdapter::MoveItem(const QString& id, const QString& newParent) {
    return MoveItemBefore(id, newParent, QString());
}

HRESULT DataStoreAdapter::Open() {
    m_store.Initialize();
    QString path = m_store.Path();
    if (m_host != nullptr && m_host->GetCatalogPath(&path, nullptr) == 0)
        return E_FAIL;
    return m_store.LoadFrom(path) ? S_OK : E_FAIL;
}

HRESULT DataStoreAdapter::Close() {
    if (!IsServiceOpen())
        return E_FAIL;
    m_store.Close();
    return S_OK;
}

HRESULT DataStoreAdapter::Save() {
    m_saveError.clear();
    if (!IsServiceOpen())
        return E_FAIL;
    if (m_store.SaveIfModified())
        return S_OK;
    m_saveError = m_store.SaveError();
    return E_FAIL;
}

HRESULT DataStoreAdapter::GetSaveError(IUnicodeString* path, IUnicodeString* reason) {
    if (m_saveError.isEmpty())
        return S_FALSE;
    if (path != nullptr)
        path->Assign(m_store.Path());
    if (reason != nullptr)
        reason->Assign(m_saveError);
    return S_OK;
}

HRESULT DataStoreAdapter::Suspend() {
    m_store.SetSuspended(1);
    return S_OK;
}

HRESULT DataStoreAdapter::Resume() {
    m_store.SetSuspended(0);
    return S_OK;
}

HRESULT DataStoreAdapter::IsSuspended(int* suspended) {
    if (suspended == nullptr)
        return E_FAIL;
    *suspended = m_store.Suspended();
    return S_OK;
}

IDataStoreService* CreateDataStoreService(IDataStoreHost* host) {
    if (host == nullptr)
        return nullptr;
    try {
        if (g_service == nullptr) {
            QString path;
            if (host->GetCatalogPath(&path, nullptr) == 0)
                throw DSPublicException_NoCatalogPath;
            g_service = new DataStoreAdapter(path, host);
        }
    } catch (...) {
        return nullptr;
    }
    g_service->Open();
    return g_service;
}

IDataStoreService* GetDataStoreService() {
    return g_service;
}
