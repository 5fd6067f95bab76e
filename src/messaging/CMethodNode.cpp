#include "messaging/CMethodNode.h"

#include "dataexchange/WProperties.h"

CMethodNode::CMethodNode(QString name)
    : m_name(std::move(name)), m_properties(DataExchange::CreateProperties()) {}

HRESULT CMethodNode::ReportProperty(const QString& name, const QString& value) {
    if (name.isNull() || value.isNull() || !m_properties)
        return E_FAIL;
    m_properties->SetProperty(name, value);
    return S_OK;
}
