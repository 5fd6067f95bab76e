#pragma once

#include "dataexchange/IProperties.h"

#include <QMap>
#include <QString>

namespace DataExchange {

// The property set: one map from name to value. QString orders keys by their UTF-16 code
// units, case-sensitively, which is the order every reporter sees and every file is written in.
class WProperties final : public IProperties {
public:
    WProperties() = default;
    ~WProperties() override = default;

    HRESULT CopyProperties(IProperties* source) override;
    HRESULT GetProperty(const QString& name, IUnicodeString* value) override;
    HRESULT SetProperty(const QString& name, const QString& value) override;
    HRESULT ReportProperties(IPropertyReporter* reporter) override;
    HRESULT Release() override;

private:
    QMap<QString, QString> m_properties;
};

// A new, empty property set on the heap; its holder ends it with Release().
IProperties* CreateProperties();

} // namespace DataExchange
