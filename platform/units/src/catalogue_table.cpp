// SPDX-License-Identifier: MIT
// The catalogue itself. Identifiers are scattered on purpose: an item type's
// identifier never equals its sequence number, and a unit's identifier is
// unique across the whole catalogue, so a unit name that stands under several
// item types ("meter") has a distinct identifier under each.
#include "catalogue_table.h"

#include <array>

namespace units::detail {
namespace {

constexpr std::array kUndefined{
    UnitEntry{2000, "undefined", "-"},
};
constexpr std::array kWaterLevel{
    UnitEntry{2100, "meter", "m"},
    UnitEntry{2101, "centimeter", "cm"},
    UnitEntry{2102, "millimeter", "mm"},
    UnitEntry{2103, "feet", "ft"},
    UnitEntry{2104, "inch", "in"},
};
constexpr std::array kDischarge{
    UnitEntry{2200, "meter^3/sec", "m^3/s"},
    UnitEntry{2201, "liter/sec", "l/s"},
    UnitEntry{2202, "meter^3/hour", "m^3/h"},
    UnitEntry{2203, "feet^3/sec", "ft^3/s"},
    UnitEntry{2204, "meter^3/day", "m^3/d"},
};
constexpr std::array kRainfall{
    UnitEntry{2300, "millimeter", "mm"},
    UnitEntry{2301, "centimeter", "cm"},
    UnitEntry{2302, "meter", "m"},
    UnitEntry{2303, "inch", "in"},
};
constexpr std::array kRainfallIntensity{
    UnitEntry{2400, "mm/hour", "mm/h"},
    UnitEntry{2401, "mm/day", "mm/d"},
    UnitEntry{2402, "inch/hour", "in/h"},
    UnitEntry{2403, "liter/sec/hectare", "l/s/ha"},
};
constexpr std::array kEvaporation{
    UnitEntry{2500, "millimeter", "mm"},
    UnitEntry{2501, "inch", "in"},
};
constexpr std::array kTemperature{
    UnitEntry{2600, "degree Celsius", "deg C"},
    UnitEntry{2601, "degree Fahrenheit", "deg F"},
    UnitEntry{2602, "degree Kelvin", "K"},
};
constexpr std::array kWindSpeed{
    UnitEntry{2700, "meter/sec", "m/s"},
    UnitEntry{2701, "km/hour", "km/h"},
    UnitEntry{2702, "knot", "kn"},
    UnitEntry{2703, "miles/hour", "mph"},
};
constexpr std::array kWindDirection{
    UnitEntry{2800, "degree", "deg"},
    UnitEntry{2801, "radian", "rad"},
};
constexpr std::array kPressure{
    UnitEntry{2900, "hectopascal", "hPa"},
    UnitEntry{2901, "kilopascal", "kPa"},
    UnitEntry{2902, "millibar", "mbar"},
    UnitEntry{2903, "meter of water", "mH2O"},
    UnitEntry{2904, "pound/inch^2", "psi"},
};
constexpr std::array kConcentration{
    UnitEntry{3000, "mg/liter", "mg/l"},
    UnitEntry{3001, "microgram/liter", "ug/l"},
    UnitEntry{3002, "gram/meter^3", "g/m^3"},
    UnitEntry{3003, "parts per million", "ppm"},
};
constexpr std::array kVelocity{
    UnitEntry{3100, "meter/sec", "m/s"},
    UnitEntry{3101, "cm/sec", "cm/s"},
    UnitEntry{3102, "feet/sec", "ft/s"},
};
constexpr std::array kVolume{
    UnitEntry{3200, "meter^3", "m^3"},
    UnitEntry{3201, "liter", "l"},
    UnitEntry{3202, "million meter^3", "Mm^3"},
    UnitEntry{3203, "feet^3", "ft^3"},
    UnitEntry{3204, "acre-feet", "ac-ft"},
};
constexpr std::array kArea{
    UnitEntry{3300, "meter^2", "m^2"},
    UnitEntry{3301, "hectare", "ha"},
    UnitEntry{3302, "kilometer^2", "km^2"},
    UnitEntry{3303, "acre", "ac"},
    UnitEntry{3304, "feet^2", "ft^2"},
};
constexpr std::array kGroundwaterLevel{
    UnitEntry{3400, "meter", "m"},
    UnitEntry{3401, "centimeter", "cm"},
    UnitEntry{3402, "feet", "ft"},
};
constexpr std::array kRelativeHumidity{
    UnitEntry{3500, "percent", "%"},
    UnitEntry{3501, "fraction", "-"},
};
constexpr std::array kRadiation{
    UnitEntry{3600, "watt/meter^2", "W/m^2"},
    UnitEntry{3601, "MJ/meter^2/day", "MJ/m^2/d"},
    UnitEntry{3602, "joule/cm^2", "J/cm^2"},
};
constexpr std::array kWaterDepth{
    UnitEntry{3700, "meter", "m"},
    UnitEntry{3701, "centimeter", "cm"},
    UnitEntry{3702, "feet", "ft"},
};
constexpr std::array kSnowDepth{
    UnitEntry{3800, "centimeter", "cm"},
    UnitEntry{3801, "meter", "m"},
    UnitEntry{3802, "inch", "in"},
};

constexpr std::array kItemTypes{
    ItemTypeEntry{999, "Undefined", kUndefined},
    ItemTypeEntry{1000, "Water Level", kWaterLevel},
    ItemTypeEntry{1001, "Discharge", kDischarge},
    ItemTypeEntry{1002, "Rainfall", kRainfall},
    ItemTypeEntry{1004, "Rainfall Intensity", kRainfallIntensity},
    ItemTypeEntry{1006, "Evaporation", kEvaporation},
    ItemTypeEntry{1008, "Temperature", kTemperature},
    ItemTypeEntry{1010, "Wind Speed", kWindSpeed},
    ItemTypeEntry{1011, "Wind Direction", kWindDirection},
    ItemTypeEntry{1013, "Pressure", kPressure},
    ItemTypeEntry{1014, "Concentration", kConcentration},
    ItemTypeEntry{1022, "Velocity", kVelocity},
    ItemTypeEntry{1024, "Volume", kVolume},
    ItemTypeEntry{1030, "Area", kArea},
    ItemTypeEntry{1040, "Groundwater Level", kGroundwaterLevel},
    ItemTypeEntry{1041, "Relative Humidity", kRelativeHumidity},
    ItemTypeEntry{1050, "Radiation", kRadiation},
    ItemTypeEntry{1055, "Water Depth", kWaterDepth},
    ItemTypeEntry{1060, "Snow Depth", kSnowDepth},
};

}  // namespace

std::span<const ItemTypeEntry> ItemTypes() noexcept { return kItemTypes; }

}  // namespace units::detail
