#include "Channels/Common/VSubTypeTable.h"

#include "Recordings/Common/UnitTable.h"
#include "Recordings/Text/TextScan.h"
#include "TQL/HashMix.h"

#include <algorithm>
#include <mutex>

namespace Channels
{

namespace
{

constexpr std::uint16_t UnknownFlag = 0x8000;
constexpr std::uint16_t UnknownDimension = 0xffff; ///< of units that nobody told the meaning of

constexpr const auto& Prefixes = Recordings::UnitPrefixes;
constexpr const auto& Bases = Recordings::UnitBases;

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
    const auto prefix = std::ranges::find(Prefixes, i_Prefix, &Recordings::UnitPrefix::Name);
    const auto base = std::ranges::find(Bases, i_Base, &Recordings::UnitBase::Name);
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

/// "millimeter", "meter", "degree"; a word that files write; or one of those with an s behind it. In any case.
bool FindByWord(std::string_view i_Text, std::uint16_t& o_rId)
{
    if (const Recordings::UnitWord* pWord = Recordings::FindUnitWord(i_Text))
        return !pWord->Base.empty() && FindNames(pWord->Prefix, pWord->Base, o_rId);
    const std::string text = Recordings::SmallLetters(i_Text);
    for (const Recordings::UnitPrefix& rPrefix : Prefixes)
        if (text.starts_with(rPrefix.Name) && FindNames(rPrefix.Name, text.substr(rPrefix.Name.size()), o_rId))
            return true;
    return text.size() > 3 && text.ends_with('s') && FindByWord(text.substr(0, text.size() - 1), o_rId);
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
    const Recordings::UnitPrefix& rPrefix = Prefixes[prefix];
    const Recordings::UnitBase& rBase = Bases[base];
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
