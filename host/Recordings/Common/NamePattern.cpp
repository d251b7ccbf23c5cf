#include "Recordings/Common/NamePattern.h"

#include <cstddef>

namespace Recordings
{

namespace
{

// The place behind the character that starts at i_Place; further bytes of a UTF-8 character are 10xxxxxx.
std::size_t NextCharacter(std::string_view i_Text, std::size_t i_Place)
{
    ++i_Place;
    while (i_Place < i_Text.size() && (static_cast<unsigned char>(i_Text[i_Place]) & 0xC0u) == 0x80u)
        ++i_Place;
    return i_Place;
}

} // namespace

bool MatchesPattern(std::string_view i_Name, std::string_view i_Pattern)
{
    std::size_t name = 0;
    std::size_t pattern = 0;
    std::size_t retryName = 0;
    std::size_t retryPattern = std::string_view::npos; // behind the last star seen
    while (name < i_Name.size())
    {
        if (pattern < i_Pattern.size() && i_Pattern[pattern] == '*')
        {
            retryPattern = ++pattern;
            retryName = name;
        }
        else if (pattern < i_Pattern.size() && i_Pattern[pattern] == '?')
        {
            name = NextCharacter(i_Name, name);
            ++pattern;
        }
        else if (pattern < i_Pattern.size() && i_Pattern[pattern] == i_Name[name])
        {
            ++name;
            ++pattern;
        }
        else if (retryPattern != std::string_view::npos)
        {
            retryName = NextCharacter(i_Name, retryName);
            name = retryName;
            pattern = retryPattern;
        }
        else
        {
            return false;
        }
    }
    return i_Pattern.find_first_not_of('*', pattern) == std::string_view::npos;
}

} // namespace Recordings
