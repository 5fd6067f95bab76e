#include "catalog/SetPropertiesTransfer.h"

#include "catalog/XmlDataStore.h"

HRESULT SetPropertiesTransfer::ReportProperty(const QString& name, const QString& value) {
    if (m_first == 1) {
        m_first = 0;
        if (Store() != nullptr)
            Store()->ClearProperties(Id());
    }
    return PropertiesTransferBase::ReportProperty(name, value);
}
