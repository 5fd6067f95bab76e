#include "catalog/PropertiesTransferBase.h"

#include "catalog/XmlDataStore.h"

HRESULT PropertiesTransferBase::ReportProperty(const QString& name, const QString& value) {
    if (name.isNull() || value.isNull() || m_store == nullptr)
        return E_FAIL;
    return m_store->AddProperty(m_id, name, value) ? S_OK : E_FAIL;
}
