#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace Recordings
{

// Reading of text files that are in memory as a whole: lines, cells, words and numbers, whatever the locale. Nothing is
// copied; every view points into the text. All functions take time in proportion to what they step over.

/// The text of a file without the mark of its byte order.
std::string_view TextOfBytes(std::span<const std::byte> i_File);

/// Whether the text is one of 16-bit characters, told by its mark or by zero bytes at its start.
bool IsWideText(std::string_view i_Text);

/// Steps through the lines of a text. Lines end with LF, CRLF or a lone CR, also mixed; the end is not part of a line.
class VLineScanner
{
public:
    explicit VLineScanner(std::string_view i_Text) : m_Text(i_Text) {}

    /// The next line; false behind the last. A line end at the end of the text opens no further line.
    bool Next(std::string_view& o_rLine);

    std::size_t GetOffset() const { return m_Offset; }     ///< bytes before the line that comes next
    std::size_t GetLineCount() const { return m_Lines; }   ///< lines given so far
    void SkipTo(std::size_t i_Offset, std::size_t i_Lines) ///< goes on there, as if that many lines had been given
    {
        m_Offset = i_Offset;
        m_Lines = i_Lines;
    }

private:
    std::string_view m_Text;
    std::size_t m_Offset = 0;
    std::size_t m_Lines = 0;
    std::size_t m_Feed = 0; ///< place of the first LF at or behind m_Offset once m_bFeed; the size of the text if none
    bool m_bFeed = false;
};

/// How the cells of a table are told apart and how its numbers are written.
struct CellRules
{
    char Separator = ',';       ///< a blank stands for runs of blanks and tabs
    bool bDecimalComma = false; ///< "0,5" is a half; "0.5" still is, too
};

enum class ECell
{
    Number,
    Missing,  ///< empty, or a word that says so: NaN, n/a, -1.#IND
    TooLarge, ///< a number that does not fit, or an infinite one
    Text
};

bool IsBlank(char i_Character); ///< a blank or a tab

/// Whether a line begins with the mark of a remark, '#' or '%'; "#N/A" is none.
bool IsRemark(std::string_view i_Line);

/// Without the blanks and tabs at both ends.
std::string_view TrimBlanks(std::string_view i_Text);

/// Equal but for the capitals of ASCII letters.
bool EqualsAnyCase(std::string_view i_Left, std::string_view i_Right);

/// The ASCII letters of a text as small letters.
std::string SmallLetters(std::string_view i_Text);

/// Takes the next cell off a line, trimmed, quotes and all; separators between quotes belong to the cell.
/// False when the line is used up; io_rbMore tells whether a cell is left and starts as true.
bool NextCell(std::string_view& io_rRest, bool& io_rbMore, char i_Separator, std::string_view& o_rCell);

/// The cells of a line, as NextCell gives them, without the empty ones at its end; at most MostCells.
inline constexpr std::size_t MostCells = 1 << 19;
std::vector<std::string_view> SplitCells(std::string_view i_Line, char i_Separator);

/// What stands between the cells of a line that may hold tabs: tabs if there is one, else runs of blanks.
char TabOrBlank(std::string_view i_Line);

/// What a cell says, as a readable name: without quotes, doubled quotes as one, control characters as blanks, UTF-8.
std::string CellText(std::string_view i_Cell);

/// Takes the next word off a text: what stands between blanks, tabs and line ends. False when there is none.
bool NextWord(std::string_view& io_rText, std::string_view& o_rWord);

/// Reads a cell or word as a number: ".5", "+1", "1e-3", with a decimal comma if so told, quoted or not. A number too
/// small for the type is 0. The value is NaN for all but ECell::Number.
ECell ReadNumber(std::string_view i_Cell, bool i_bDecimalComma, float& o_rValue);
ECell ReadNumber(std::string_view i_Cell, bool i_bDecimalComma, double& o_rValue);

/// Reads a whole number without sign; false for anything else. Numbers beyond 2^64 - 1 are cut there.
bool ReadCount(std::string_view i_Cell, std::uint64_t& o_rValue);

/// Digits behind the decimal point of a written number, its exponent included: 4 for "0.0017", 5 for "1.25e-3"; with or
/// without zeros at the end.
struct Decimals
{
    int Written = 0;
    int Significant = 0;
};
Decimals CountDecimals(std::string_view i_Cell);
int DecimalsOf(std::string_view i_Cell); ///< those that are written

/// A number as people write it: the fewest digits up to six that say it.
std::string NumberText(double i_Value);

} // namespace Recordings
