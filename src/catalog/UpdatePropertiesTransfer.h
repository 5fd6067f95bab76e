#pragma once

#include "catalog/PropertiesTransferBase.h"

// Replaces only the properties named by the reported pairs; the others stay.
class UpdatePropertiesTransfer final : public PropertiesTransferBase {
public:
    using PropertiesTransferBase::PropertiesTransferBase;

    HRESULT ReportProperty(const QString& name, const QString& value) override;
};
