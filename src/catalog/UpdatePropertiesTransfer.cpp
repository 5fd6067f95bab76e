#include "catalog/UpdatePropertiesTransfer.h"

#include "catalog/XmlDataStore.h"

HRESULT UpdatePropertiesTransfer::ReportProperty(const QString& name, const QString& value) {
    if (Store() != nullptr && !name.isNull())
        Store()->RemoveProperty(Id(), name);
    return PropertiesTransferBase::ReportProperty(name, value);
}
