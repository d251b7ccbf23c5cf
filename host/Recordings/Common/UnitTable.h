#pragma once

#include <array>
#include <cstdint>
#include <numbers>
#include <optional>
#include <string_view>

namespace Recordings
{

// The units that are known, for the readers, for the subtypes of channels and, through those, for expressions. A new
// unit is a row here: one of UnitWords for another way to write a known one, else one of UnitBases as well.

struct UnitPrefix
{
    std::string_view Name;
    std::string_view Symbol;
    double Scale;
};

/// Ids of units hold the place in this table, so rows are only ever added at the end.
inline constexpr std::array<UnitPrefix, 21> UnitPrefixes{{
    {"", "", 1.0},        {"yocto", "y", 1e-24}, {"zepto", "z", 1e-21}, {"atto", "a", 1e-18}, {"femto", "f", 1e-15},
    {"pico", "p", 1e-12}, {"nano", "n", 1e-9},   {"micro", "µ", 1e-6},  {"milli", "m", 1e-3}, {"centi", "c", 1e-2},
    {"deci", "d", 1e-1},  {"deka", "da", 1e1},   {"hecto", "h", 1e2},   {"kilo", "k", 1e3},   {"mega", "M", 1e6},
    {"giga", "G", 1e9},   {"tera", "T", 1e12},   {"peta", "P", 1e15},   {"exa", "E", 1e18},   {"zetta", "Z", 1e21},
    {"yotta", "Y", 1e24},
}};

struct UnitBase
{
    static constexpr std::uint16_t Length = 0; ///< this and the angle are known to everybody, the others are the host's
    static constexpr std::uint16_t Time = 2;

    std::string_view Name;
    std::string_view Symbol;
    std::uint16_t Dimension;
    double Scale;   ///< to the first base of the dimension
    bool bPrefixes; ///< whether its symbol is written with prefixes
};

inline constexpr double RadiansInDegree = std::numbers::pi / 180.0;

/// As above, rows are only ever added at the end.
inline constexpr std::array<UnitBase, 40> UnitBases{{
    {"meter", "m", 0, 1.0, true},
    {"gram", "g", 1, 1e-3, true},
    {"second", "s", 2, 1.0, true},
    {"ampere", "A", 3, 1.0, true},
    {"kelvin", "K", 4, 1.0, true},
    {"mole", "mol", 5, 1.0, true},
    {"candela", "cd", 6, 1.0, true},
    {"radian", "rad", 7, 1.0, true},
    {"steradian", "sr", 8, 1.0, true},
    {"hertz", "Hz", 9, 1.0, true},
    {"newton", "N", 10, 1.0, true},
    {"pascal", "Pa", 11, 1.0, true},
    {"joule", "J", 12, 1.0, true},
    {"watt", "W", 13, 1.0, true},
    {"coulomb", "C", 14, 1.0, true},
    {"volt", "V", 15, 1.0, true},
    {"farad", "F", 16, 1.0, true},
    {"ohm", "Ω", 17, 1.0, true},
    {"siemens", "S", 18, 1.0, true},
    {"weber", "Wb", 19, 1.0, true},
    {"tesla", "T", 20, 1.0, true},
    {"henry", "H", 21, 1.0, true},
    {"lumen", "lm", 22, 1.0, true},
    {"lux", "lx", 23, 1.0, true},
    {"becquerel", "Bq", 24, 1.0, true},
    {"gray", "Gy", 25, 1.0, true},
    {"sievert", "Sv", 26, 1.0, true},
    {"katal", "kat", 27, 1.0, true},
    {"hour", "h", 2, 3600.0, false},
    {"minute", "min", 2, 60.0, false},
    {"degree", "°", 7, RadiansInDegree, false},
    {"arcminute", "′", 7, RadiansInDegree / 60.0, false},
    {"arcsecond", "″", 7, RadiansInDegree / 3600.0, false},
    {"celsius", "°C", 28, 1.0, false},
    {"inch", "in", 0, 0.0254, false},
    {"foot", "ft", 0, 0.3048, false},
    {"percent", "%", 29, 0.01, false},
    {"newton meter", "N·m", 30, 1.0, false},
    {"frame", "frame", 31, 1.0, false},
    {"per frame", "1/frame", 32, 1.0, false},
}};

/// A way in which files write a unit, in small letters; files may use capitals.
struct UnitWord
{
    std::string_view Word;
    std::string_view Prefix = {};
    std::string_view Base = {}; ///< empty: known as a unit, but none that another converts into
};

inline constexpr std::array UnitWords{
    UnitWord{"s", "", "second"},
    UnitWord{"sec", "", "second"},
    UnitWord{"secs", "", "second"},
    UnitWord{"second", "", "second"},
    UnitWord{"seconds", "", "second"},
    UnitWord{"ms", "milli", "second"},
    UnitWord{"msec", "milli", "second"},
    UnitWord{"msecs", "milli", "second"},
    UnitWord{"millis", "milli", "second"},
    UnitWord{"millisecond", "milli", "second"},
    UnitWord{"milliseconds", "milli", "second"},
    UnitWord{"us", "micro", "second"},
    UnitWord{"\xC2\xB5s", "micro", "second"}, // the sign, and the letter below: they look the same
    UnitWord{"\xCE\xBCs", "micro", "second"},
    UnitWord{"usec", "micro", "second"},
    UnitWord{"microsecond", "micro", "second"},
    UnitWord{"microseconds", "micro", "second"},
    UnitWord{"ns", "nano", "second"},
    UnitWord{"nanosecond", "nano", "second"},
    UnitWord{"nanoseconds", "nano", "second"},
    UnitWord{"min", "", "minute"},
    UnitWord{"mins", "", "minute"},
    UnitWord{"minute", "", "minute"},
    UnitWord{"minutes", "", "minute"},
    UnitWord{"h", "", "hour"},
    UnitWord{"hr", "", "hour"},
    UnitWord{"hour", "", "hour"},
    UnitWord{"hours", "", "hour"},
    UnitWord{"hz", "", "hertz"},
    UnitWord{"khz", "kilo", "hertz"},
    UnitWord{"m", "", "meter"},
    UnitWord{"metre", "", "meter"},
    UnitWord{"cm", "centi", "meter"},
    UnitWord{"centimetre", "centi", "meter"},
    UnitWord{"mm", "milli", "meter"},
    UnitWord{"millimetre", "milli", "meter"},
    UnitWord{"um", "micro", "meter"},
    UnitWord{"in", "", "inch"},
    UnitWord{"inch", "", "inch"},
    UnitWord{"ft", "", "foot"},
    UnitWord{"n", "", "newton"},
    UnitWord{"kn", "kilo", "newton"},
    UnitWord{"nm", "", "newton meter"},
    UnitWord{"n.m", "", "newton meter"},
    UnitWord{"n*m", "", "newton meter"},
    UnitWord{"n-m", "", "newton meter"},
    UnitWord{"nmm"},
    UnitWord{"n.mm"},
    UnitWord{"n*mm"},
    UnitWord{"kg", "kilo", "gram"},
    UnitWord{"g", "", "gram"},
    UnitWord{"v", "", "volt"},
    UnitWord{"volt", "", "volt"},
    UnitWord{"volts", "", "volt"},
    UnitWord{"mv", "milli", "volt"},
    UnitWord{"uv", "micro", "volt"},
    UnitWord{"\xC2\xB5v", "micro", "volt"},
    UnitWord{"\xCE\xBCv", "micro", "volt"},
    UnitWord{"a", "", "ampere"},
    UnitWord{"ma", "milli", "ampere"},
    UnitWord{"deg", "", "degree"},
    UnitWord{"degree", "", "degree"},
    UnitWord{"degrees", "", "degree"},
    UnitWord{"\xC2\xB0", "", "degree"},
    UnitWord{"rad", "", "radian"},
    UnitWord{"radians", "", "radian"},
    UnitWord{"deg/s"},
    UnitWord{"rad/s"},
    UnitWord{"\xC2\xB0/s"},
    UnitWord{"dps"},
    UnitWord{"deg/s^2"},
    UnitWord{"rad/s^2"},
    UnitWord{"m/s"},
    UnitWord{"mm/s"},
    UnitWord{"m/s^2"},
    UnitWord{"m/s2"},
    UnitWord{"m/s\xC2\xB2"},
    UnitWord{"m/s/s"},
    UnitWord{"mm/s^2"},
    UnitWord{"t", "", "tesla"},
    UnitWord{"ut", "micro", "tesla"},
    UnitWord{"\xC2\xB5t", "micro", "tesla"},
    UnitWord{"\xCE\xBCt", "micro", "tesla"},
    UnitWord{"gauss"},
    UnitWord{"pa", "", "pascal"},
    UnitWord{"kpa", "kilo", "pascal"},
    UnitWord{"mmhg"},
    UnitWord{"%", "", "percent"},
    UnitWord{"w", "", "watt"},
    UnitWord{"j", "", "joule"},
    UnitWord{"deg c", "", "celsius"},
    UnitWord{"degc", "", "celsius"},
    UnitWord{"\xC2\xB0"
             "c",
             "", "celsius"},
    UnitWord{"bpm"},
    UnitWord{"count"},
    UnitWord{"counts"},
    UnitWord{"frames", "", "frame"},
    UnitWord{"px"},
    UnitWord{"pixels"},
};

/// The row of a word, whatever its capitals; null for a word that is none.
const UnitWord* FindUnitWord(std::string_view i_Text);

/// What the unit of a word is in the first base of its dimension, if it is one of that dimension.
std::optional<double> ScaleOfUnitWord(std::string_view i_Text, std::uint16_t i_Dimension);

} // namespace Recordings
