#include "messaging/PropertiesToMap.h"

#include "dataexchange/IProperties.h"
#include "dataexchange/IPropertyReporter.h"

namespace {

class MapReporter final : public DataExchange::IPropertyReporter {
public:
    explicit MapReporter(QMap<QString, QString>* map) : m_map(map) {}
    HRESULT ReportProperty(const QString& name, const QString& value) override {
        m_map->insert(name, value);
        return S_OK;
    }

private:
    QMap<QString, QString>* m_map;
};

} // namespace

QMap<QString, QString> PropertiesToMap(DataExchange::IProperties* properties) {
    QMap<QString, QString> map;
    if (properties != nullptr) {
        MapReporter reporter(&map);
        properties->ReportProperties(&reporter);
    }
    return map;
}
