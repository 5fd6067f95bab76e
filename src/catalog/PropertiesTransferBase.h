#pragma once

#include "dataexchange/IPropertyReporter.h"

#include <QString>

namespace Brindle::Data::XmlAccess {
class XmlDataStore;
}

// Writes each reported pair as a property of one catalog item. Lives on the stack of one
// service call, fed by the caller's property set.
class PropertiesTransferBase : public DataExchange::IPropertyReporter {
public:
    PropertiesTransferBase(Brindle::Data::XmlAccess::XmlDataStore* store, const QString& id)
        : m_store(store), m_id(id) {}

    // S_OK when the pair was added; E_FAIL for a null name or value or a refused property.
    HRESULT ReportProperty(const QString& name, const QString& value) override;

protected:
    Brindle::Data::XmlAccess::XmlDataStore* Store() const { return m_store; }
    const QString& Id() const { return m_id; }

private:
    Brindle::Data::XmlAccess::XmlDataStore* m_store;
    QString m_id;
};
