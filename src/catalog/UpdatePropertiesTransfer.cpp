#include "catalog/UpdatePropertiesTransfer.h"

#include "catalog/XmlDataStore.h"

HRESULT UpdatePropertiesTransfer::ReportProperty(const QString& name, const QString& value) {
    // A property that already stands last with this value stays as it is, so that writing a
    // value again (a folder marked expanded on every selection inside it) changes nothing.
    if (Store() != nullptr && !name.isNull() && !value.isNull() &&
        Store()->IsLastProperty(Id(), name, value))
        return S_OK;
    if (Store() != nullptr && !name.isNull())
        Store()->RemoveProperty(Id(), name);
    return PropertiesTransferBase::ReportProperty(name, value);
}
