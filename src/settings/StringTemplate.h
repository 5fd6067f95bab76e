#pragma once

#include "settings/AutoRegisterStorage.h"

#include <QString>

namespace Settings {

// A text option, stored as it is.
class StringTemplate final : public AutoRegisterStorage {
public:
    StringTemplate(const QString& key, const QString& value) : m_key(key), m_value(value) {}

    void Load(DataExchange::IProperties* from) override;
    void Save(DataExchange::IProperties* into) override;

    const QString& Key() const { return m_key; }
    const QString& Value() const { return m_value; }
    void SetValue(const QString& value) { m_value = value; }

private:
    QString m_key;
    QString m_value;
};

} // namespace Settings
