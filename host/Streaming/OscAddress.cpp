#include "Streaming/OscAddress.h"

#include <algorithm>
#include <charconv>
#include <system_error>

namespace Streaming
{

namespace
{

constexpr std::size_t LongestAddress = 255;

std::vector<std::string_view> SplitAddress(std::string_view i_Address)
{
    std::vector<std::string_view> parts;
    while (!i_Address.empty())
    {
        const std::size_t slash = std::min(i_Address.find('/'), i_Address.size());
        if (slash > 0)
            parts.push_back(i_Address.substr(0, slash));
        i_Address.remove_prefix(std::min(slash + 1, i_Address.size()));
    }
    return parts;
}

bool SaysPosition(std::string_view i_Part)
{
    std::string part(i_Part);
    for (char& rCharacter : part)
        if (rCharacter >= 'A' && rCharacter <= 'Z')
            rCharacter = static_cast<char>(rCharacter - 'A' + 'a');
    return part == "position" || part == "positions" || part == "marker" || part == "markers";
}

std::string Join(const std::vector<std::string_view>& i_rParts, std::size_t i_First)
{
    std::string text;
    for (std::size_t i = i_First; i < i_rParts.size(); ++i)
        text.append(i == i_First ? "" : "/").append(i_rParts[i]);
    return text;
}

} // namespace

bool IsUsableAddress(std::string_view i_Address)
{
    const auto isPrintable = [](char i_Character)
    {
        return i_Character >= ' ' && i_Character <= '~';
    };
    return i_Address.size() > 1 && i_Address.size() <= LongestAddress && i_Address[0] == '/' &&
           std::ranges::all_of(i_Address, isPrintable) && !SplitAddress(i_Address).empty();
}

OscChannelName NameOfAddress(std::string_view i_Address, std::size_t i_Components)
{
    std::vector<std::string_view> parts = SplitAddress(i_Address);
    const std::string whole = Join(parts, 0);
    const auto kind = std::ranges::find_if(parts, SaysPosition);
    if (i_Components != 3 || kind == parts.end() || parts.size() == 1)
        return {false, {}, whole};
    parts.erase(kind);
    if (parts.size() == 1)
        return {true, {}, std::string(parts[0])};
    return {true, std::string(parts[0]), std::string(parts[0]) + ":" + Join(parts, 1)};
}

std::vector<std::string> ComponentNamesOfColumn(std::size_t i_Components)
{
    if (i_Components == 1)
        return {""};
    std::vector<std::string> names;
    for (std::size_t i = 1; i <= i_Components; ++i)
        names.push_back(std::to_string(i));
    return names;
}

bool ReadOscEndpoint(std::string_view i_Text, std::string& io_rAddress, std::uint16_t& o_rPort)
{
    const std::size_t colon = i_Text.rfind(':');
    const std::string_view digits = colon == std::string_view::npos ? i_Text : i_Text.substr(colon + 1);
    std::uint16_t port = 0;
    const auto [pEnd, error] = std::from_chars(digits.data(), digits.data() + digits.size(), port);
    if (error != std::errc() || pEnd != digits.data() + digits.size() || port == 0)
        return false;
    if (colon != std::string_view::npos)
    {
        std::string_view address = i_Text.substr(0, colon);
        const bool bBrackets = address.starts_with('[') && address.ends_with(']');
        if (bBrackets)
            address = address.substr(1, address.size() - 2);
        if (address.empty() || bBrackets != (address.find(':') != std::string_view::npos))
            return false;
        io_rAddress = address;
    }
    o_rPort = port;
    return true;
}

} // namespace Streaming
