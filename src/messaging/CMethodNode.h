#pragma once

#include "common/ReleasePtr.h"
#include "dataexchange/IProperties.h"
#include "dataexchange/IPropertyReporter.h"

#include <QString>

// One message waiting in the instance manager's queue: its name and its own copy of the pairs.
class CMethodNode final : public DataExchange::IPropertyReporter {
public:
    explicit CMethodNode(QString name);

    // Stores the pair; E_FAIL for a null name or value.
    HRESULT ReportProperty(const QString& name, const QString& value) override;

    const QString& Name() const { return m_name; }
    DataExchange::IProperties* Properties() const { return m_properties.get(); }

private:
    QString m_name;
    ReleasePtr<DataExchange::IProperties> m_properties;
};
