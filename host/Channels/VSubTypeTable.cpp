#include "Channels/VSubTypeTable.h"

#include "TQL/HashMix.h"

#include <algorithm>
#include <array>
#include <mutex>
#include <numbers>

namespace Channels
{

namespace
{

constexpr std::uint16_t UnknownFlag = 0x8000;
constexpr std::uint16_t UnknownDimension = 0xffff; ///< of units that nobody told the meaning of

struct Prefix
{
    std::string_view Name;
    std::string_view Symbol;
    double Scale;
};

/// Ids hold the place in this table, so rows are only ever added at the end.
constexpr std::array<Prefix, 21> Prefixes{{
    {"", "", 1.0},        {"yocto", "y", 1e-24}, {"zepto", "z", 1e-21}, {"atto", "a", 1e-18}, {"femto", "f", 1e-15},
    {"pico", "p", 1e-12}, {"nano", "n", 1e-9},   {"micro", "µ", 1e-6},  {"milli", "m", 1e-3}, {"centi", "c", 1e-2},
    {"deci", "d", 1e-1},  {"deka", "da", 1e1},   {"hecto", "h", 1e2},   {"kilo", "k", 1e3},   {"mega", "M", 1e6},
    {"giga", "G", 1e9},   {"tera", "T", 1e12},   {"peta", "P", 1e15},   {"exa", "E", 1e18},   {"zetta", "Z", 1e21},
    {"yotta", "Y", 1e24},
}};

struct Base
{
    std::string_view Name;
    std::string_view Symbol;
    std::uint16_t Dimension; ///< 0 length and 7 angle are known to everybody, the others are this host's
    double Scale;
    bool bPrefixes; ///< whether its symbol is written with prefixes
};

constexpr double Degrees = std::numbers::pi / 180.0;

/// As above, rows are only ever added at the end.
constexpr std::array<Base, 40> Bases{{
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
    {"degree", "°", 7, Degrees, false},
    {"arcminute", "′", 7, Degrees / 60.0, false},
    {"arcsecond", "″", 7, Degrees / 3600.0, false},
    {"celsius", "°C", 28, 1.0, false},
    {"inch", "in", 0, 0.0254, false},
    {"foot", "ft", 0, 0.3048, false},
    {"percent", "%", 29, 0.01, false},
    {"newton meter", "N·m", 30, 1.0, false},
    {"frame", "frame", 31, 1.0, false},
    {"per frame", "1/frame", 32, 1.0, false},
}};

/// Other ways in which recordings write a unit.
struct Alias
{
    std::string_view Text;
    std::string_view Prefix;
    std::string_view Base;
};

constexpr std::array<Alias, 14> Aliases{{
    {"deg", "", "degree"},
    {"Deg", "", "degree"},
    {"metre", "", "meter"},
    {"millimetre", "milli", "meter"},
    {"centimetre", "centi", "meter"},
    {"Meter", "", "meter"},
    {"Volt", "", "volt"},
    {"Newton", "", "newton"},
    {"sec", "", "second"},
    {"Nm", "", "newton meter"},
    {"N.m", "", "newton meter"},
    {"uV", "micro", "volt"},
    {"um", "micro", "meter"},
    {"us", "micro", "second"},
}};

constexpr std::uint16_t MakeId(std::size_t i_Prefix, std::size_t i_Base)
{
    return static_cast<std::uint16_t>(i_Prefix << 8 | i_Base);
}

std::string_view Trim(std::string_view i_Text)
{
    constexpr std::string_view blanks = " \t\r\n";
    const std::size_t first = i_Text.find_first_not_of(blanks);
    if (first == std::string_view::npos)
        return {};
    return i_Text.substr(first, i_Text.find_last_not_of(blanks) - first + 1);
}

bool FindNames(std::string_view i_Prefix, std::string_view i_Base, std::uint16_t& o_rId)
{
    const auto prefix = std::ranges::find(Prefixes, i_Prefix, &Prefix::Name);
    const auto base = std::ranges::find(Bases, i_Base, &Base::Name);
    if (prefix == Prefixes.end() || base == Bases.end())
        return false;
    o_rId = MakeId(static_cast<std::size_t>(prefix - Prefixes.begin()), static_cast<std::size_t>(base - Bases.begin()));
    return true;
}

bool FindBySymbol(std::string_view i_Text, std::uint16_t& o_rId)
{
    for (std::size_t p = 0; p < Prefixes.size(); ++p)
        for (std::size_t b = 0; b < Bases.size(); ++b)
            if ((p == 0 || Bases[b].bPrefixes) && i_Text.starts_with(Prefixes[p].Symbol) &&
                i_Text.substr(Prefixes[p].Symbol.size()) == Bases[b].Symbol)
            {
                o_rId = MakeId(p, b);
                return true;
            }
    return false;
}

/// "millimeter", "meter", "degree"; an alias; or one of those with an s behind it.
bool FindByWord(std::string_view i_Text, std::uint16_t& o_rId)
{
    const auto alias = std::ranges::find(Aliases, i_Text, &Alias::Text);
    if (alias != Aliases.end())
        return FindNames(alias->Prefix, alias->Base, o_rId);
    for (const Prefix& rPrefix : Prefixes)
        if (i_Text.starts_with(rPrefix.Name) && FindNames(rPrefix.Name, i_Text.substr(rPrefix.Name.size()), o_rId))
            return true;
    return i_Text.size() > 3 && i_Text.ends_with('s') && FindByWord(i_Text.substr(0, i_Text.size() - 1), o_rId);
}

} // namespace

const std::uint16_t VSubTypeTable::Metre = MakeId(0, 0);
const std::uint16_t VSubTypeTable::Millimetre = MakeId(8, 0);
const std::uint16_t VSubTypeTable::Radian = MakeId(0, 7);
const std::uint16_t VSubTypeTable::Degree = MakeId(0, 30);

TQL::IResult VSubTypeTable::Find(std::uint16_t i_Id, TQL::SubTypeRecord& o_rRecord) const
{
    if ((i_Id & UnknownFlag) != 0)
    {
        const std::shared_lock lock(m_Mutex);
        const auto unknown = m_Unknown.find(i_Id);
        if (unknown == m_Unknown.end())
            return TQL::Result::InvalidId;
        o_rRecord = {0, UnknownDimension, 1.0, unknown->second, unknown->second};
        return TQL::Result::Ok;
    }
    const std::size_t prefix = i_Id >> 8;
    const std::size_t base = i_Id & 0xff;
    if (prefix >= Prefixes.size() || base >= Bases.size())
        return TQL::Result::InvalidId;
    const Prefix& rPrefix = Prefixes[prefix];
    const Base& rBase = Bases[base];
    o_rRecord = {0, rBase.Dimension, rPrefix.Scale * rBase.Scale, std::string(rPrefix.Name) += rBase.Name,
                 std::string(rPrefix.Symbol) += rBase.Symbol};
    return TQL::Result::Ok;
}

bool VSubTypeTable::FindByName(std::string_view i_Prefix, std::string_view i_Base, std::uint16_t& o_rId) const
{
    return FindNames(i_Prefix, i_Base, o_rId);
}

std::optional<double> VSubTypeTable::RadiansIn(std::uint16_t i_Id)
{
    const std::size_t prefix = i_Id >> 8;
    const std::size_t base = i_Id & 0xff;
    if (prefix >= Prefixes.size() || base >= Bases.size() ||
        Bases[base].Dimension != TQL::SubTypeRecord::DimensionAngle)
        return std::nullopt;
    return Prefixes[prefix].Scale * Bases[base].Scale;
}

std::uint16_t VSubTypeTable::IdOfUnit(std::string_view i_Text)
{
    const std::string_view text = Trim(i_Text);
    std::uint16_t id = 0;
    if (FindBySymbol(text, id) || FindByWord(text, id))
        return id;
    const std::unique_lock lock(m_Mutex);
    id = static_cast<std::uint16_t>(TQL::HashText(text) | UnknownFlag);
    while (m_Unknown.contains(id) && m_Unknown[id] != text)
        id = static_cast<std::uint16_t>((id + 1) | UnknownFlag);
    m_Unknown[id] = std::string(text);
    return id;
}

} // namespace Channels
