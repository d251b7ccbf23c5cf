#pragma once

#include <cstdint>
#include <string>
#include <string_view>

/// The spelling of JSON texts and numbers that all texts and files of this system share. It does not depend on the
/// locale.
namespace TQL::JsonText
{

/// Appends the text in double quotes. Escaped are \b \t \n \f \r \" \\ and other control characters as \u00XX with
/// upper-case digits; all else, "/" and bytes above 0x7E too, passes unchanged.
void AppendQuoted(std::string& o_rText, std::string_view i_Text);

/// The same without the quotes: for a text that is appended in pieces.
void AppendEscaped(std::string& o_rText, std::string_view i_Text);

void AppendNumber(std::string& o_rText, std::int64_t i_Value);
void AppendNumber(std::string& o_rText, std::uint64_t i_Value);

/// Appends the shortest digits that read back as the same number (nearly always), with a point or an exponent: 1.0,
/// 1e-7. False, and nothing is appended, for a number that is not finite.
[[nodiscard]] bool AppendNumber(std::string& o_rText, double i_Value);

/// The nearest number to the digits, read as a whole number, times ten to the power of i_Exponent; infinity where that
/// is too big.
double ReadDecimal(std::string_view i_Digits, std::int64_t i_Exponent);

} // namespace TQL::JsonText
