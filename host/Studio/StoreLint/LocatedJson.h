#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace Studio
{

struct LocatedMember;

/// A JSON value that knows where it stands. Raw lies in the text that was parsed, which must outlive it.
struct LocatedValue
{
    enum class EKind
    {
        Null,
        Bool,
        Number,
        String,
        List,
        Object
    };

    EKind Kind = EKind::Null;
    std::string_view Raw;               ///< as it is written, with quotes and brackets
    std::string Text;                   ///< of a string
    std::vector<LocatedMember> Members; ///< of an object in the order of the text, or of a list, without names
};

struct LocatedMember
{
    std::string Name;
    std::string_view RawName;
    LocatedValue Value;
};

/// One thing that is wrong with a text.
struct TextProblem
{
    std::size_t Offset = 0; ///< in bytes
    std::string Path;       ///< of the entry that it is in; empty where there is none
    std::string Text;
};

/// Accepts what store files may be: the same JSON and no deeper than their reader does. The problem says what was
/// expected where.
std::optional<TextProblem> ParseLocated(std::string_view i_Text, LocatedValue& o_rRoot);

/// Both from 1; columns are characters.
struct TextPosition
{
    std::size_t Line = 1;
    std::size_t Column = 1;
};

TextPosition FindPosition(std::string_view i_Text, std::size_t i_Offset);

} // namespace Studio
