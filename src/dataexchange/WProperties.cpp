#include "dataexchange/WProperties.h"

#include "dataexchange/IPropertyReporter.h"

namespace DataExchange {

namespace {

// Feeds every reported pair into another set.
class CopyReporter final : public IPropertyReporter {
public:
    explicit CopyReporter(IProperties* target) : m_target(target) {}
    HRESULT ReportProperty(const QString& name, const QString& value) override {
        return m_target->SetProperty(name, value);
    }

private:
    IProperties* m_target;
};

// Stored texts are never null, so that a sink accepts even an empty value.
QString NonNull(const QString& text) {
    return text.isNull() ? QStringLiteral("") : text;
}

} // namespace

HRESULT WProperties::CopyProperties(IProperties* source) {
    if (source == nullptr)
        return E_INVALIDARG;
    CopyReporter copier(this);
    source->ReportProperties(&copier);
    return S_OK;
}

HRESULT WProperties::GetProperty(const QString& name, IUnicodeString* value) {
    if (value == nullptr)
        return S_FALSE;
    const auto found = m_properties.constFind(name);
    if (found == m_properties.constEnd())
        return S_FALSE;
    return value->Assign(found.value());
}

HRESULT WProperties::SetProperty(const QString& name, const QString& value) {
    if (name.isNull())
        return E_INVALIDARG;
    m_properties.insert(name, NonNull(value));
    return S_OK;
}

HRESULT WProperties::ReportProperties(IPropertyReporter* reporter) {
    if (m_properties.isEmpty())
        return S_FALSE;
    if (reporter == nullptr)
        return E_INVALIDARG;
    // A reporter may change this very set (copying a set into itself); walk a snapshot.
    const QMap<QString, QString> snapshot = m_properties;
    HRESULT result = S_FALSE;
    for (auto it = snapshot.constBegin(); it != snapshot.constEnd(); ++it)
        result = reporter->ReportProperty(it.key(), it.value());
    return result;
}

HRESULT WProperties::Release() {
    delete this;
    return S_OK;
}

IProperties* CreateProperties() {
    return new WProperties;
}

} // namespace DataExchange
