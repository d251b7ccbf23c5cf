#include "Recordings/Text/TextScan.h"

#include "Recordings/Text/C3dText.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <cstring>
#include <iterator>
#include <limits>
#include <system_error>

namespace Recordings
{

namespace
{

constexpr std::size_t LongestNumber = 1024; // characters; longer cells are text

constexpr std::array<std::string_view, 15> MissingWords{"nan",  "nan(ind)", "nan(snan)", "na",      "n/a",
                                                        "#n/a", "#num!",    "#value!",   "null",    "none",
                                                        "-",    ".",        "1.#ind",    "1.#qnan", "missing"};

char Small(char i_Character)
{
    return i_Character >= 'A' && i_Character <= 'Z' ? static_cast<char>(i_Character - 'A' + 'a') : i_Character;
}

bool IsDigit(char i_Character)
{
    return i_Character >= '0' && i_Character <= '9';
}

std::string_view WithoutSign(std::string_view i_Text)
{
    if (i_Text.size() > 1 && (i_Text[0] == '-' || i_Text[0] == '+'))
        i_Text.remove_prefix(1);
    return i_Text;
}

bool IsMissingWord(std::string_view i_Text)
{
    const std::string_view word = WithoutSign(i_Text);
    return std::any_of(MissingWords.begin(), MissingWords.end(),
                       [&](std::string_view i_Known) { return EqualsAnyCase(word, i_Known); });
}

// Whether a number that does not fit its type is too small for it, not too large.
bool IsTiny(std::string_view i_Number)
{
    i_Number = WithoutSign(i_Number);
    const std::size_t exponent = i_Number.find_first_of("eE");
    if (exponent != std::string_view::npos)
        return exponent + 1 < i_Number.size() && i_Number[exponent + 1] == '-';
    return i_Number.find_first_not_of('0') == i_Number.find('.');
}

// "0,5" becomes "0.5" in the buffer; anything that is not a number with one decimal comma stays as it is.
std::string_view WithDecimalPoint(std::string_view i_Cell, std::span<char> i_Buffer)
{
    const std::size_t comma = i_Cell.find(',');
    const bool bDecimal = comma != std::string_view::npos && comma + 1 < i_Cell.size() && IsDigit(i_Cell[comma + 1]) &&
                          i_Cell.find_first_of(",.", comma + 1) == std::string_view::npos &&
                          i_Cell.substr(0, comma).find('.') == std::string_view::npos &&
                          i_Cell.size() <= i_Buffer.size();
    if (!bDecimal)
        return i_Cell;
    std::copy(i_Cell.begin(), i_Cell.end(), i_Buffer.begin());
    i_Buffer[comma] = '.';
    return {i_Buffer.data(), i_Cell.size()};
}

std::string_view WithoutQuotes(std::string_view i_Cell)
{
    if (i_Cell.size() >= 2 && i_Cell.front() == '"' && i_Cell.back() == '"')
        return TrimBlanks(i_Cell.substr(1, i_Cell.size() - 2));
    return i_Cell;
}

template <typename TNumber>
ECell ReadNumberAs(std::string_view i_Cell, bool i_bDecimalComma, TNumber& o_rValue)
{
    o_rValue = std::numeric_limits<TNumber>::quiet_NaN();
    std::string_view cell = WithoutQuotes(TrimBlanks(i_Cell));
    if (cell.empty())
        return ECell::Missing;
    if (cell.size() > LongestNumber)
        return ECell::Text;
    std::array<char, 64> buffer;
    if (i_bDecimalComma)
        cell = WithDecimalPoint(cell, buffer);
    if (cell.size() > 1 && cell[0] == '+' && (IsDigit(cell[1]) || cell[1] == '.'))
        cell.remove_prefix(1);
    TNumber value{};
    const std::from_chars_result result = std::from_chars(cell.data(), cell.data() + cell.size(), value);
    if (result.ec != std::errc::invalid_argument && result.ptr == cell.data() + cell.size())
    {
        if (result.ec == std::errc::result_out_of_range && !IsTiny(cell))
            return ECell::TooLarge;
        if (result.ec != std::errc::result_out_of_range && !std::isfinite(value))
            return std::isnan(value) ? ECell::Missing : ECell::TooLarge;
        o_rValue = result.ec == std::errc::result_out_of_range ? TNumber{0} : value;
        return ECell::Number;
    }
    if (EqualsAnyCase(WithoutSign(cell), "1.#inf"))
        return ECell::TooLarge;
    return IsMissingWord(cell) ? ECell::Missing : ECell::Text;
}

// Where a cell that begins with a quote ends: behind the quote that is not doubled.
std::size_t EndOfQuoted(std::string_view i_Text)
{
    for (std::size_t i = 1; i < i_Text.size(); ++i)
    {
        if (i_Text[i] != '"')
            continue;
        if (i + 1 == i_Text.size() || i_Text[i + 1] != '"')
            return i + 1;
        ++i;
    }
    return std::string_view::npos;
}

} // namespace

std::string_view TextOfBytes(std::span<const std::byte> i_File)
{
    std::string_view text(reinterpret_cast<const char*>(i_File.data()), i_File.size());
    if (text.starts_with("\xEF\xBB\xBF"))
        text.remove_prefix(3);
    return text;
}

bool IsWideText(std::string_view i_Text)
{
    if (i_Text.starts_with("\xFF\xFE") || i_Text.starts_with("\xFE\xFF"))
        return true;
    return i_Text.size() >= 4 && (i_Text[0] == '\0') != (i_Text[1] == '\0') &&
           (i_Text[2] == '\0') != (i_Text[3] == '\0');
}

bool VLineScanner::Next(std::string_view& o_rLine)
{
    if (m_Offset >= m_Text.size())
        return false;
    const char* pText = m_Text.data();
    if (!m_bFeed || m_Feed < m_Offset)
    {
        const void* pFeed = std::memchr(pText + m_Offset, '\n', m_Text.size() - m_Offset);
        m_Feed = pFeed ? static_cast<std::size_t>(static_cast<const char*>(pFeed) - pText) : m_Text.size();
        m_bFeed = true;
    }
    const void* pReturn = std::memchr(pText + m_Offset, '\r', m_Feed - m_Offset);
    const std::size_t end = pReturn ? static_cast<std::size_t>(static_cast<const char*>(pReturn) - pText) : m_Feed;
    o_rLine = m_Text.substr(m_Offset, end - m_Offset);
    const bool bBoth = pReturn && end + 1 < m_Text.size() && pText[end + 1] == '\n';
    m_Offset = end + (bBoth ? 2 : 1);
    ++m_Lines;
    return true;
}

bool IsBlank(char i_Character)
{
    return i_Character == ' ' || i_Character == '\t';
}

bool IsRemark(std::string_view i_Line)
{
    return i_Line.starts_with('%') || (i_Line.starts_with('#') && !i_Line.starts_with("#N"));
}

std::string_view TrimBlanks(std::string_view i_Text)
{
    while (!i_Text.empty() && IsBlank(i_Text.front()))
        i_Text.remove_prefix(1);
    while (!i_Text.empty() && IsBlank(i_Text.back()))
        i_Text.remove_suffix(1);
    return i_Text;
}

bool EqualsAnyCase(std::string_view i_Left, std::string_view i_Right)
{
    return std::equal(i_Left.begin(), i_Left.end(), i_Right.begin(), i_Right.end(),
                      [](char i_A, char i_B) { return Small(i_A) == Small(i_B); });
}

std::string SmallLetters(std::string_view i_Text)
{
    std::string text(i_Text);
    std::transform(text.begin(), text.end(), text.begin(), Small);
    return text;
}

bool NextCell(std::string_view& io_rRest, bool& io_rbMore, char i_Separator, std::string_view& o_rCell)
{
    const bool bBlanks = i_Separator == ' ';
    while (!io_rRest.empty() && (io_rRest.front() == ' ' || (io_rRest.front() == '\t' && i_Separator != '\t')))
        io_rRest.remove_prefix(1);
    if (!io_rbMore || (bBlanks && io_rRest.empty()))
        return io_rbMore = false;
    std::size_t from = 0;
    if (io_rRest.starts_with('"'))
        from = EndOfQuoted(io_rRest);
    if (from == std::string_view::npos)
        from = 0; // a quote that never ends is a character like others
    const std::size_t end = bBlanks ? io_rRest.find_first_of(" \t", from) : io_rRest.find(i_Separator, from);
    o_rCell = TrimBlanks(io_rRest.substr(0, end));
    io_rbMore = end != std::string_view::npos;
    io_rRest.remove_prefix(io_rbMore ? end + 1 : io_rRest.size());
    return true;
}

std::vector<std::string_view> SplitCells(std::string_view i_Line, char i_Separator)
{
    std::vector<std::string_view> cells;
    std::string_view cell;
    for (bool bMore = true; cells.size() < MostCells && NextCell(i_Line, bMore, i_Separator, cell);)
        cells.push_back(cell);
    while (!cells.empty() && cells.back().empty())
        cells.pop_back();
    return cells;
}

char TabOrBlank(std::string_view i_Line)
{
    return i_Line.find('\t') == std::string_view::npos ? ' ' : '\t';
}

std::string CellText(std::string_view i_Cell)
{
    std::string_view cell = TrimBlanks(i_Cell);
    std::string text;
    if (cell.size() >= 2 && cell.front() == '"' && cell.back() == '"')
    {
        cell = cell.substr(1, cell.size() - 2);
        for (std::size_t i = 0; i < cell.size(); ++i)
        {
            text += cell[i];
            if (cell[i] == '"' && i + 1 < cell.size() && cell[i + 1] == '"')
                ++i;
        }
        cell = text;
    }
    return C3dText(std::as_bytes(std::span(cell)));
}

bool NextWord(std::string_view& io_rText, std::string_view& o_rWord)
{
    constexpr std::string_view space = " \t\r\n\v\f";
    io_rText.remove_prefix(std::min(io_rText.find_first_not_of(space), io_rText.size()));
    o_rWord = io_rText.substr(0, io_rText.find_first_of(space));
    io_rText.remove_prefix(o_rWord.size());
    return !o_rWord.empty();
}

ECell ReadNumber(std::string_view i_Cell, bool i_bDecimalComma, float& o_rValue)
{
    return ReadNumberAs(i_Cell, i_bDecimalComma, o_rValue);
}

ECell ReadNumber(std::string_view i_Cell, bool i_bDecimalComma, double& o_rValue)
{
    return ReadNumberAs(i_Cell, i_bDecimalComma, o_rValue);
}

bool ReadCount(std::string_view i_Cell, std::uint64_t& o_rValue)
{
    const std::string_view cell = TrimBlanks(i_Cell);
    const std::from_chars_result result = std::from_chars(cell.data(), cell.data() + cell.size(), o_rValue);
    if (result.ec == std::errc::invalid_argument || result.ptr != cell.data() + cell.size())
        return false;
    if (result.ec == std::errc::result_out_of_range)
        o_rValue = std::numeric_limits<std::uint64_t>::max();
    return true;
}

Decimals CountDecimals(std::string_view i_Cell)
{
    constexpr int most = 400;
    int written = 0;
    int significant = 0;
    int power = 0;
    bool bPoint = false;
    for (std::size_t i = 0; i < i_Cell.size(); ++i)
    {
        const char character = i_Cell[i];
        if (character == '.' || character == ',')
            bPoint = true;
        else if (bPoint && IsDigit(character) && written < most)
        {
            ++written;
            significant = character == '0' ? significant : written;
        }
        else if (character == 'e' || character == 'E')
        {
            const bool bPlus = i + 1 < i_Cell.size() && i_Cell[i + 1] == '+';
            std::from_chars(i_Cell.data() + i + (bPlus ? 2 : 1), i_Cell.data() + i_Cell.size(), power);
            power = std::clamp(power, -most, most);
            break;
        }
    }
    return {std::max(0, written - power), std::max(0, significant - power)};
}

int DecimalsOf(std::string_view i_Cell)
{
    return CountDecimals(i_Cell).Written;
}

std::string NumberText(double i_Value)
{
    char digits[64];
    const std::to_chars_result end =
        std::to_chars(std::begin(digits), std::end(digits), i_Value, std::chars_format::general, 9);
    return {digits, end.ptr};
}

} // namespace Recordings
