#pragma once

#include <QMap>
#include <QString>

namespace DataExchange {
class IProperties;
}

// The pairs of a property set as a map, the form in which they travel to other programs.
// Empty for a null set.
QMap<QString, QString> PropertiesToMap(DataExchange::IProperties* properties);
