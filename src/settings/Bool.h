#pragma once

#include "settings/AutoRegisterStorage.h"

#include <QString>

namespace Settings {

// A yes/no option, stored as "true" or "false" and read back ignoring case; any other text
// reads as false.
class Bool final : public AutoRegisterStorage {
public:
    Bool(const QString& key, bool value) : m_key(key), m_value(value) {}

    void Load(DataExchange::IProperties* from) override;
    void Save(DataExchange::IProperties* into) override;

    const QString& Key() const { return m_key; }
    bool Value() const { return m_value; }
    void SetValue(bool value) { m_value = value; }

private:
    QString m_key;
    bool m_value;
};

} // namespace Settings
