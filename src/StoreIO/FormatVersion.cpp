#include "StoreIO/FormatVersion.h"

#include "StoreIO/JsonMembers.h"
#include "StoreIO/StoreFormat.h"
#include "StoreIO/StoreIOLog.h"

#include <charconv>
#include <cstdint>
#include <optional>
#include <string_view>

namespace StoreIO
{
namespace
{

/// What a document without the member has.
constexpr TQL::StoreVersion s_AbsentVersion{1, 0};

bool ReadNumber(std::string_view i_Text, std::int32_t& o_rNumber)
{
    const char* const pEnd = i_Text.data() + i_Text.size();
    const auto [pNext, error] = std::from_chars(i_Text.data(), pEnd, o_rNumber);
    return error == std::errc() && pNext == pEnd;
}

std::optional<TQL::StoreVersion> ReadVersion(std::string_view i_Text)
{
    const std::size_t dot = i_Text.find('.');
    TQL::StoreVersion version;
    if (dot == std::string_view::npos || !ReadNumber(i_Text.substr(0, dot), version.Major) ||
        !ReadNumber(i_Text.substr(dot + 1), version.Minor))
        return std::nullopt;
    return version;
}

} // namespace

bool HasSupportedVersion(const rapidjson::Value& i_rRoot)
{
    const rapidjson::Value* const pMember = FindMember(i_rRoot, VersionMember);
    if (pMember && !pMember->IsString())
    {
        LogError("The file format version element \"%1%\" is not a string type json element", VersionMember);
        return false;
    }
    const auto version = pMember ? ReadVersion(TextOf(*pMember)) : s_AbsentVersion;
    if (!version)
        LogError("The file format version element \"%1%\" is invalid.", VersionMember);
    else if (*version < LowestFormat)
        LogError("StoreFileReader cannot load IStore file with version %1%, minimum supported version is %2%",
                 VersionText(*version), VersionText(LowestFormat));
    else if (*version > HighestFormat)
        LogError("Cannot load IStore file with version %1%, maximum supported version is %2%", VersionText(*version),
                 VersionText(HighestFormat));
    else
        return true;
    return false;
}

} // namespace StoreIO
