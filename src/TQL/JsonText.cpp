#include "TQL/JsonText.h"

#include "TQL/RapidJson.h"

#include <charconv>

namespace TQL::JsonText
{
namespace
{

constexpr char NoEscape = '\0';

/// The letter after the backslash; 'u' for a control character without a letter of its own.
char FindEscape(char i_Char) noexcept
{
    switch (i_Char)
    {
    case '\b':
        return 'b';
    case '\t':
        return 't';
    case '\n':
        return 'n';
    case '\f':
        return 'f';
    case '\r':
        return 'r';
    case '"':
    case '\\':
        return i_Char;
    default:
        return static_cast<unsigned char>(i_Char) < 0x20 ? 'u' : NoEscape;
    }
}

template <typename Integer>
void AppendInteger(std::string& o_rText, Integer i_Value)
{
    char digits[24];
    o_rText.append(digits, std::to_chars(std::begin(digits), std::end(digits), i_Value).ptr);
}

} // namespace

void AppendQuoted(std::string& o_rText, std::string_view i_Text)
{
    constexpr std::string_view hexDigits = "0123456789ABCDEF";
    o_rText += '"';
    for (const char c : i_Text)
    {
        const char escape = FindEscape(c);
        if (escape == NoEscape)
        {
            o_rText += c;
            continue;
        }
        o_rText += '\\';
        o_rText += escape;
        if (escape == 'u')
        {
            o_rText += "00";
            o_rText += hexDigits[static_cast<unsigned char>(c) >> 4];
            o_rText += hexDigits[static_cast<unsigned char>(c) & 15];
        }
    }
    o_rText += '"';
}

void AppendNumber(std::string& o_rText, std::int64_t i_Value)
{
    AppendInteger(o_rText, i_Value);
}

void AppendNumber(std::string& o_rText, std::uint64_t i_Value)
{
    AppendInteger(o_rText, i_Value);
}

bool AppendNumber(std::string& o_rText, double i_Value)
{
    rapidjson::StringBuffer buffer;
    rapidjson::Writer<rapidjson::StringBuffer> writer(buffer);
    const bool bWritten = writer.Double(i_Value);
    o_rText.append(buffer.GetString(), buffer.GetSize());
    return bWritten;
}

} // namespace TQL::JsonText
