#pragma once

#include <QString>

#include <cstdint>

// The CSS length units a note document uses.
namespace LengthUnit {
enum : int {
    Pixels = 0,
    Percent = 1,
    Inches = 2,
    Points = 3,
    Millimeters = 4,
    Picas = 5,
    Ems = 6,
};
}

// The value with its unit, "12 pt"; an unknown unit gives the bare number.
QString FormatLength(std::uint32_t value, int unit);
