#include "settings/Bool.h"

#include "common/IUnicodeString.h"

namespace Settings {

void Bool::Load(DataExchange::IProperties* from) {
    if (from == nullptr)
        return;
    QString text;
    UnicodeStringPtr sink(&text);
    if (from->GetProperty(m_key, &sink) == S_OK)
        m_value = text.compare(QLatin1StringView("true"), Qt::CaseInsensitive) == 0;
}

void Bool::Save(DataExchange::IProperties* into) {
    if (into != nullptr)
        into->SetProperty(m_key, m_value ? QStringLiteral("true") : QStringLiteral("false"));
}

} // namespace Settings
