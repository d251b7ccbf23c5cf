#include "TQL/SchemaHistory.h"

#include <algorithm>
#include <map>

namespace TQL
{
namespace
{

void Rename(const std::string& i_rFrom, const std::string& i_rTo, std::vector<std::string>& io_rNames)
{
    if (!i_rFrom.empty())
        std::ranges::replace(io_rNames, i_rFrom, i_rTo);
}

/// The highest value that an enum of that storage can hold in a file.
bool FitsStorage(std::int32_t i_Value, EType i_Storage) noexcept
{
    if (i_Value < 256)
        return true;
    return i_Storage == EType::Enum32 || (i_Storage == EType::Enum16 && i_Value < 65536);
}

using NamesByValue = std::map<std::int32_t, std::vector<std::string>>;

void CheckStorage(const NamesByValue& i_rNames, EType i_Storage, std::vector<std::string>& o_rMessages)
{
    for (const auto& [value, names] : i_rNames)
    {
        for (const std::string& rName : names)
        {
            if (!FitsStorage(value, i_Storage))
                o_rMessages.push_back("Enum value " + rName + "too large for enum storage type");
        }
    }
}

void MapValues(const NamesByValue& i_rNames, const ISchema& i_rNew, EnumMapping& o_rMapping)
{
    for (const auto& [value, names] : i_rNames)
    {
        bool bRecorded = false;
        for (const std::string& rName : names)
        {
            const auto found = std::ranges::find(i_rNew.EnumValues, rName, &SchemaEnumValue::Name);
            if (found == i_rNew.EnumValues.end())
                o_rMapping.Messages.push_back("Enum value " + rName + " could not be mapped");
            else if (!bRecorded)
                o_rMapping.Values.emplace_back(value, found->Value);
            bRecorded |= found != i_rNew.EnumValues.end();
        }
    }
    if (std::ranges::all_of(o_rMapping.Values, [](const auto& i_rPair) { return i_rPair.first == i_rPair.second; }))
        o_rMapping.Values.clear();
}

} // namespace

bool CarryNames(std::span<const SchemaRename> i_From, std::span<const SchemaRename> i_To,
                std::vector<std::string>& io_rNames)
{
    const std::size_t common = std::min(i_From.size(), i_To.size());
    if (!std::ranges::equal(i_From.first(common), i_To.first(common)))
        return false;
    for (const SchemaRename& rStep : i_To.subspan(common))
        Rename(rStep.From, rStep.To, io_rNames);
    for (std::size_t i = i_From.size(); i-- != common;)
        Rename(i_From[i].To, i_From[i].From, io_rNames);
    return true;
}

EnumMapping MapEnum(const ISchema& i_rOld, const ISchema& i_rNew)
{
    EnumMapping mapping;
    std::vector<std::string> names;
    for (const SchemaEnumValue& rValue : i_rOld.EnumValues)
        names.push_back(rValue.Name);
    if (!CarryNames(i_rOld.History, i_rNew.History, names))
    {
        mapping.Messages.push_back("Mismatch in enum history");
        return mapping;
    }
    NamesByValue namesByValue;
    for (std::size_t i = 0; i < names.size(); ++i)
    {
        const std::int32_t value = i_rOld.EnumValues[i].Value;
        if (names[i].empty())
            mapping.Removed.push_back(value);
        else
            namesByValue[value].push_back(names[i]);
    }
    std::ranges::sort(mapping.Removed);
    CheckStorage(namesByValue, i_rNew.Type, mapping.Messages);
    MapValues(namesByValue, i_rNew, mapping);
    return mapping;
}

MemberMatch MatchMembers(const ISchema& i_rFrom, const ISchema& i_rTo)
{
    MemberMatch match;
    std::vector<std::string> names;
    for (const SchemaMember& rMember : i_rFrom.SubSchemas)
        names.push_back(rMember.Name);
    match.bHistoriesAgree = CarryNames(i_rFrom.History, i_rTo.History, names);
    if (!match.bHistoriesAgree)
        return match;
    for (const std::string& rName : names)
    {
        const auto found = std::ranges::find(i_rTo.SubSchemas, rName, &SchemaMember::Name);
        const bool bFound = !rName.empty() && found != i_rTo.SubSchemas.end();
        match.Partners.push_back(bFound ? static_cast<int>(found - i_rTo.SubSchemas.begin()) : -1);
    }
    return match;
}

} // namespace TQL
