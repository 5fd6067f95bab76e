#include "settings/StringTemplate.h"

#include "common/IUnicodeString.h"

namespace Settings {

void StringTemplate::Load(DataExchange::IProperties* from) {
    if (from == nullptr)
        return;
    UnicodeStringPtr sink(&m_value);
    from->GetProperty(m_key, &sink);
}

void StringTemplate::Save(DataExchange::IProperties* into) {
    if (into != nullptr)
        into->SetProperty(m_key, m_value);
}

} // namespace Settings
