#include "Recordings/Text/C3dText.h"

#include <cstdint>
#include <unordered_map>
#include <unordered_set>
#include <utility>

namespace Recordings
{

namespace
{

// Number of bytes of the UTF-8 character at the start of the text; 0 when there is none.
std::size_t CharacterBytes(std::string_view i_Text)
{
    const auto byteAt = [&](std::size_t i_Index)
    {
        return static_cast<std::uint8_t>(i_Text[i_Index]);
    };
    const std::uint8_t lead = byteAt(0);
    if (lead < 0x80)
        return 1;
    const std::size_t length = lead >= 0xF0 ? 4 : lead >= 0xE0 ? 3 : 2;
    if (lead < 0xC2 || lead > 0xF4 || i_Text.size() < length)
        return 0;
    for (std::size_t i = 1; i < length; ++i)
        if ((byteAt(i) & 0xC0u) != 0x80u)
            return 0;
    // No longer form of a shorter character, no surrogates, nothing behind U+10FFFF.
    const std::uint8_t second = byteAt(1);
    const bool bForbidden = (lead == 0xE0 && second < 0xA0) || (lead == 0xED && second > 0x9F) ||
                            (lead == 0xF0 && second < 0x90) || (lead == 0xF4 && second > 0x8F);
    return bForbidden ? 0 : length;
}

bool IsUtf8(std::string_view i_Text)
{
    while (!i_Text.empty())
    {
        const std::size_t length = CharacterBytes(i_Text);
        if (length == 0)
            return false;
        i_Text.remove_prefix(length);
    }
    return true;
}

std::string Latin1ToUtf8(std::string_view i_Text)
{
    std::string text;
    for (const char character : i_Text)
    {
        const auto value = static_cast<std::uint8_t>(character);
        if (value < 0x80)
        {
            text.push_back(character);
            continue;
        }
        text.push_back(static_cast<char>(0xC0u | value >> 6));
        text.push_back(static_cast<char>(0x80u | (value & 0x3Fu)));
    }
    return text;
}

std::string Numbered(const std::string& i_rLabel, std::size_t i_Number)
{
    return i_rLabel + "#" + std::to_string(i_Number);
}

} // namespace

std::string C3dText(std::span<const std::byte> i_Bytes)
{
    std::string text;
    for (const std::byte byte : i_Bytes)
    {
        const auto character = static_cast<char>(std::to_integer<std::uint8_t>(byte));
        if (character == '\0')
            break;
        const bool bControl = std::to_integer<std::uint8_t>(byte) < 0x20 || character == 0x7F;
        text.push_back(bControl ? ' ' : character);
    }
    text.erase(text.find_last_not_of(' ') + 1);
    return IsUtf8(text) ? text : Latin1ToUtf8(text);
}

std::string C3dCapitals(std::string_view i_Text)
{
    std::string text(i_Text);
    for (char& rCharacter : text)
        if (rCharacter >= 'a' && rCharacter <= 'z')
            rCharacter = static_cast<char>(rCharacter - 'a' + 'A');
    return text;
}

std::vector<std::string> UniqueLabels(std::vector<std::string> i_Labels, std::size_t i_Count, std::string_view i_Word)
{
    i_Labels.resize(i_Count);
    for (std::size_t i = 0; i < i_Count; ++i)
        if (i_Labels[i].empty())
            i_Labels[i] = std::string(i_Word) + " " + std::to_string(i + 1);

    // A name made here must not meet one that stands in the file further on.
    const std::unordered_set<std::string> inFile(i_Labels.begin(), i_Labels.end());
    std::unordered_set<std::string> taken;
    std::unordered_map<std::string, std::size_t> timesSeen;
    for (std::string& rLabel : i_Labels)
    {
        std::string name = rLabel;
        std::size_t& rTimes = timesSeen[rLabel];
        if (++rTimes > 1)
        {
            name = Numbered(rLabel, rTimes);
            while (inFile.contains(name) || taken.contains(name))
                name = Numbered(rLabel, ++rTimes);
        }
        taken.insert(name);
        rLabel = std::move(name);
    }
    return i_Labels;
}

std::string SubjectOfLabel(std::string_view i_Label)
{
    const std::size_t colon = i_Label.find(':');
    return colon == std::string_view::npos ? std::string() : std::string(i_Label.substr(0, colon));
}

} // namespace Recordings
