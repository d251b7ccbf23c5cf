#include "TQL/JsonText.h"

#include "TQL/RapidJson.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <limits>
#include <system_error>

namespace TQL::JsonText
{
namespace
{

constexpr char NoEscape = '\0';

/// The letter after the backslash; 'u' for a control character without a letter of its own.
constexpr char FindEscape(char i_Char) noexcept
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

constexpr auto s_Escapes = []
{
    std::array<char, 256> escapes{};
    for (std::size_t i = 0; i < escapes.size(); ++i)
        escapes[i] = FindEscape(static_cast<char>(i));
    return escapes;
}();

template <typename Integer>
void AppendInteger(std::string& o_rText, Integer i_Value)
{
    char digits[24];
    o_rText.append(digits, std::to_chars(std::begin(digits), std::end(digits), i_Value).ptr);
}

} // namespace

void AppendEscaped(std::string& o_rText, std::string_view i_Text)
{
    constexpr std::string_view hexDigits = "0123456789ABCDEF";
    const char* pPlain = i_Text.data(); // what needs no escape is appended in one piece
    const char* const pEnd = pPlain + i_Text.size();
    for (const char* pChar = pPlain; pChar != pEnd; ++pChar)
    {
        const auto byte = static_cast<unsigned char>(*pChar);
        const char escape = s_Escapes[byte];
        if (escape == NoEscape)
            continue;
        o_rText.append(pPlain, pChar);
        pPlain = pChar + 1;
        o_rText += '\\';
        o_rText += escape;
        if (escape == 'u')
            o_rText.append("00").append({hexDigits[byte >> 4], hexDigits[byte & 15]});
    }
    o_rText.append(pPlain, pEnd);
}

void AppendQuoted(std::string& o_rText, std::string_view i_Text)
{
    o_rText += '"';
    AppendEscaped(o_rText, i_Text);
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
    if (!std::isfinite(i_Value))
        return false;
    char digits[32]; // 25 are the most that a number takes
    o_rText.append(digits, rapidjson::internal::dtoa(i_Value, digits));
    return true;
}

double ReadDecimal(std::string_view i_Digits, std::int64_t i_Exponent)
{
    i_Digits.remove_prefix(std::min(i_Digits.find_first_not_of('0'), i_Digits.size()));
    if (i_Digits.empty())
        return 0.0;
    std::string text(i_Digits);
    text += 'e';
    AppendInteger(text, i_Exponent);
    double number = 0.0;
    const auto [pEnd, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc::result_out_of_range)
        return number;
    const bool bBig = i_Exponent + static_cast<std::int64_t>(i_Digits.size()) > 0;
    return bBig ? std::numeric_limits<double>::infinity() : 0.0;
}

} // namespace TQL::JsonText
