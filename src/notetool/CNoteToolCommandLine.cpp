#include "notetool/CNoteToolCommandLine.h"

#include "common/ReleasePtr.h"
#include "dataexchange/ParsePipeDelimitedString.h"
#include "dataexchange/WProperties.h"
#include "messaging/PropertiesToMap.h"

CNoteToolCommandLine::CNoteToolCommandLine(const QStringList& arguments) {
    for (qsizetype i = 0; i < arguments.size(); ++i) {
        const QString& argument = arguments[i];
        if (argument.compare(QLatin1StringView("/PROPERTY"), Qt::CaseInsensitive) == 0) {
            if (i + 1 < arguments.size()) {
                ReleasePtr<DataExchange::IProperties> properties(DataExchange::CreateProperties());
                DataExchange::ParsePipeDelimitedString(arguments[++i], properties.get());
                m_properties = PropertiesToMap(properties.get());
            }
        } else if (m_notePath.isEmpty()) {
            m_notePath = argument;
        }
    }
}
