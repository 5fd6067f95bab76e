#pragma once

#include "catalog/PropertiesTransferBase.h"

// Replaces all properties of the item. They are cleared at the first pair, so an empty set
// leaves the item as it was.
class SetPropertiesTransfer final : public PropertiesTransferBase {
public:
    using PropertiesTransferBase::PropertiesTransferBase;

    HRESULT ReportProperty(const QString& name, const QString& value) override;

private:
    int m_first = 1;
};
