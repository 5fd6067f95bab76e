#include "notes/FormatLength.h"

QString FormatLength(std::uint32_t value, int unit) {
    const QString number = QString::number(value);
    switch (unit) {
    case LengthUnit::Pixels:
        return number + QLatin1StringView(" px");
    case LengthUnit::Percent:
        return number + QLatin1StringView(" %");
    case LengthUnit::Inches:
        return number + QLatin1StringView(" in");
    case LengthUnit::Points:
        return number + QLatin1StringView(" pt");
    case LengthUnit::Millimeters:
        return number + QLatin1StringView(" mm");
    case LengthUnit::Picas:
        return number + QLatin1StringView(" pc");
    case LengthUnit::Ems:
        return number + QLatin1StringView(" em");
    default:
        return number;
    }
}
