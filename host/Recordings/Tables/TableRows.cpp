#include "Recordings/Tables/TableRows.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <limits>
#include <system_error>
#include <utility>

namespace Recordings
{

namespace
{

constexpr std::size_t FreeCells = 1 << 16; // a small table may have that many empty cells

// The number at the start of a text that is all of its cell, without any of what makes a cell hard to read; o_rpEnd is
// then the separator or the end of the line.
template <typename TNumber>
bool ReadPlainNumber(const char* i_pText, const char* i_pEnd, char i_Separator, TNumber& o_rValue, const char*& o_rpEnd)
{
    while (i_pText != i_pEnd && *i_pText == ' ')
        ++i_pText;
    const std::from_chars_result result = std::from_chars(i_pText, i_pEnd, o_rValue);
    o_rpEnd = result.ptr;
    if (result.ec != std::errc() || !std::isfinite(o_rValue))
        return false;
    if (i_Separator != ' ')
        while (o_rpEnd != i_pEnd && *o_rpEnd == ' ')
            ++o_rpEnd;
    return o_rpEnd == i_pEnd || *o_rpEnd == i_Separator;
}

// The same for numbers with a decimal comma, through a copy.
bool ReadCommaNumber(const char* i_pText, const char* i_pEnd, char i_Separator, float& o_rValue, const char*& o_rpEnd)
{
    char copy[48];
    char* pCopy = copy;
    const char* pText = i_pText;
    for (; pText != i_pEnd && *pText != i_Separator; ++pText)
    {
        if (pCopy == std::end(copy))
            return false;
        *pCopy++ = *pText == ',' ? '.' : *pText;
    }
    const char* pRead = nullptr;
    o_rpEnd = pText;
    return pCopy != copy && ReadPlainNumber(copy, pCopy, i_Separator, o_rValue, pRead) && pRead == pCopy &&
           std::count(copy, pCopy, '.') < 2;
}

/// Fills the channels. Lives while the rows are read.
class VRowReader
{
public:
    VRowReader(const TableBody& i_rBody, std::vector<RecordedChannel>& io_rChannels, TableTimes& io_rTimes,
               TableFindings& io_rFindings)
        : m_rBody(i_rBody), m_rTimes(io_rTimes), m_rFindings(io_rFindings)
    {
        for (const TableColumn& rColumn : i_rBody.Columns)
        {
            if (rColumn.Channel == TableColumn::Nothing)
            {
                m_Targets.push_back({nullptr, 0, 1});
                continue;
            }
            RecordedChannel& rChannel = io_rChannels[rColumn.Channel];
            m_Targets.push_back(
                {rChannel.Samples.data() + rColumn.Component, rChannel.ComponentCount(), rColumn.Parts});
            m_bParts |= rColumn.Parts > 1;
        }
    }

    void Read(std::string_view i_Line, std::size_t i_LineNumber)
    {
        m_Line = i_LineNumber;
        m_Rest = i_Line;
        m_bMore = true;
        for (std::size_t column = 0; column < m_Targets.size(); ++column)
        {
            if (column == m_rBody.TimeColumn ? ReadPlainTime() : !m_bParts && ReadPlainCell(m_Targets[column]))
                continue;
            if (!ReadHardCell(column))
            {
                Note(m_rFindings.ShortRows, m_rFindings.ShortLine);
                break;
            }
        }
        CheckRest();
        if (m_rTimes.Seconds.size() == m_rFindings.Rows)
            m_rTimes.Seconds.push_back(std::numeric_limits<double>::quiet_NaN());
        ++m_rFindings.Rows;
    }

private:
    struct Target
    {
        float* pFirst = nullptr; ///< of row 0; null where the column feeds nothing
        std::size_t Stride = 0;
        std::size_t Parts = 1;
    };

    void Note(std::size_t& io_rCount, std::size_t& o_rLine) const
    {
        if (io_rCount++ == 0)
            o_rLine = m_Line;
    }

    // The way of nearly all cells.
    bool ReadPlainCell(const Target& i_rTarget)
    {
        const char separator = m_rBody.Rules.Separator;
        const char* const pEnd = m_Rest.data() + m_Rest.size();
        if (!m_bMore || i_rTarget.pFirst == nullptr)
            return false;
        if (!m_Rest.empty() && m_Rest.front() == separator && separator != ' ')
        {
            m_Rest.remove_prefix(1); // an empty cell; the sample is missing already
            return true;
        }
        float value = 0.0f;
        const char* pRead = nullptr;
        const bool bRead = m_rBody.Rules.bDecimalComma ? ReadCommaNumber(m_Rest.data(), pEnd, separator, value, pRead)
                                                       : ReadPlainNumber(m_Rest.data(), pEnd, separator, value, pRead);
        if (!bRead)
            return false;
        i_rTarget.pFirst[m_rFindings.Rows * i_rTarget.Stride] = value;
        StepBehind(pRead);
        return true;
    }

    void StepBehind(const char* i_pCellEnd)
    {
        const char* const pEnd = m_Rest.data() + m_Rest.size();
        m_bMore = i_pCellEnd != pEnd;
        m_Rest = m_bMore ? std::string_view(i_pCellEnd + 1, static_cast<std::size_t>(pEnd - i_pCellEnd - 1))
                         : std::string_view();
    }

    // False when the line has no such cell.
    bool ReadHardCell(std::size_t i_Column)
    {
        std::string_view cell;
        if (!NextCell(m_Rest, m_bMore, m_rBody.Rules.Separator, cell))
            return false;
        if (i_Column == m_rBody.TimeColumn)
            ReadTime(cell);
        const Target& rTarget = m_Targets[i_Column];
        if (rTarget.pFirst == nullptr)
            return true;
        float* pValue = rTarget.pFirst + m_rFindings.Rows * rTarget.Stride;
        if (rTarget.Parts == 1)
            *pValue = ReadValue(cell, i_Column);
        else
            ReadParts(cell, i_Column, std::span(pValue, rTarget.Parts));
        return true;
    }

    float ReadValue(std::string_view i_Cell, std::size_t i_Column)
    {
        float value = 0.0f;
        const ECell kind = ReadNumber(i_Cell, m_rBody.Rules.bDecimalComma, value);
        if (kind == ECell::TooLarge)
            Note(m_rFindings.LargeCells, m_rFindings.LargeLine);
        if (kind == ECell::Text)
        {
            Note(m_rFindings.TextCells, m_rFindings.TextLine);
            m_rFindings.TextInColumn[i_Column] = true;
        }
        return value;
    }

    void ReadParts(std::string_view i_Cell, std::size_t i_Column, std::span<float> o_Values)
    {
        constexpr std::string_view around = "~()[]\"";
        while (!i_Cell.empty() && around.find(i_Cell.front()) != std::string_view::npos)
            i_Cell.remove_prefix(1);
        while (!i_Cell.empty() && around.find(i_Cell.back()) != std::string_view::npos)
            i_Cell.remove_suffix(1);
        bool bMore = true;
        std::string_view part;
        std::size_t count = 0;
        while (NextCell(i_Cell, bMore, ',', part))
        {
            const float value = ReadValue(part, i_Column);
            if (count < o_Values.size())
                o_Values[count] = value;
            ++count;
        }
        if (count != o_Values.size() && count > 1)
            Note(m_rFindings.TextCells, m_rFindings.TextLine);
    }

    bool ReadPlainTime()
    {
        double time = 0.0;
        const char* pEnd = nullptr;
        if (!m_bMore ||
            !ReadPlainNumber(m_Rest.data(), m_Rest.data() + m_Rest.size(), m_rBody.Rules.Separator, time, pEnd))
            return false;
        AddTime(time, m_Rest.substr(0, static_cast<std::size_t>(pEnd - m_Rest.data())));
        StepBehind(pEnd);
        return true;
    }

    void ReadTime(std::string_view i_Cell)
    {
        double time = 0.0;
        const bool bTime = ReadNumber(i_Cell, m_rBody.Rules.bDecimalComma, time) == ECell::Number;
        AddTime(time, bTime ? i_Cell : std::string_view());
    }

    void AddTime(double i_Time, std::string_view i_Written)
    {
        const Decimals digits = CountDecimals(i_Written);
        m_rTimes.Digits.Written = std::max(m_rTimes.Digits.Written, digits.Written);
        m_rTimes.Digits.Significant = std::max(m_rTimes.Digits.Significant, digits.Significant);
        m_rTimes.Seconds.push_back(i_Time * m_rBody.TimeUnit);
    }

    // Cells behind the last column count when they hold something.
    void CheckRest()
    {
        std::string_view cell;
        while (m_bMore && NextCell(m_Rest, m_bMore, m_rBody.Rules.Separator, cell))
            if (!cell.empty())
            {
                Note(m_rFindings.LongRows, m_rFindings.LongLine);
                return;
            }
    }

    const TableBody& m_rBody;
    TableTimes& m_rTimes;
    TableFindings& m_rFindings;
    std::vector<Target> m_Targets;
    bool m_bParts = false;
    std::size_t m_Line = 0;
    std::string_view m_Rest; // of the line that is being read
    bool m_bMore = true;
};

bool IsRow(const TableBody& i_rBody, std::string_view i_Line)
{
    if (i_Line.empty() || (IsBlank(i_Line.front()) && TrimBlanks(i_Line).empty()))
        return false;
    return !i_rBody.bRemarks || !IsRemark(i_Line);
}

// Without the rows at the end that hold nothing, which spreadsheets leave where something stood once.
std::string_view WithoutEmptyEnd(std::string_view i_Rows, char i_Separator)
{
    const std::string nothing = std::string(" \t\r\n\"") + i_Separator;
    const std::size_t last = i_Rows.find_last_not_of(nothing);
    return last == std::string_view::npos ? i_Rows : i_Rows.substr(0, i_Rows.find_first_of("\r\n", last));
}

// Calls a function with each row and the number of its line. The share of the whole that is done rises from i_Before to
// i_After. False when the progress says stop.
template <typename TFunction>
bool ForEachRow(const TableBody& i_rBody, VReadProgress* i_pProgress, double i_Before, double i_After,
                const TFunction& i_rFunction)
{
    constexpr std::size_t pieceBytes = 1 << 16;
    constexpr std::size_t whole = std::size_t{1} << 30;
    const auto tell = [&](std::size_t i_Offset)
    {
        const double size = static_cast<double>(std::max<std::size_t>(1, i_rBody.Rows.size()));
        const double done = i_Before + (i_After - i_Before) * static_cast<double>(i_Offset) / size;
        return TellProgress(i_pProgress, static_cast<std::size_t>(done * static_cast<double>(whole)), whole);
    };
    std::size_t nextTold = 0;
    VLineScanner lines(WithoutEmptyEnd(i_rBody.Rows, i_rBody.Rules.Separator));
    for (std::string_view line; lines.Next(line);)
    {
        if (lines.GetOffset() >= nextTold)
        {
            if (!tell(lines.GetOffset()))
                return false;
            nextTold = lines.GetOffset() + pieceBytes;
        }
        if (IsRow(i_rBody, line))
            i_rFunction(line, i_rBody.FirstLine + lines.GetLineCount() - 1);
    }
    return tell(i_rBody.Rows.size());
}

constexpr double ShareOfCounting = 0.1;

// Frames count from 1, or from 0 where the file has a frame 0.
void TurnFramesIntoTimes(const TableBody& i_rBody, TableTimes& io_rTimes)
{
    const bool bFromZero =
        std::find(io_rTimes.Seconds.begin(), io_rTimes.Seconds.end(), 0.0) != io_rTimes.Seconds.end();
    if (!IsUsableRate(io_rTimes.HintRate))
        io_rTimes.HintRate = AssumedRate;
    for (double& rTime : io_rTimes.Seconds)
        rTime = (rTime / i_rBody.TimeUnit - (bFromZero ? 0.0 : 1.0)) / io_rTimes.HintRate;
    io_rTimes.Unit = 0.0;
}

void Tell(std::size_t i_Count, const char* i_pOne, const char* i_pMany, std::size_t i_Line,
          std::vector<std::string>& io_rWarnings)
{
    if (i_Count == 0)
        return;
    io_rWarnings.push_back(std::to_string(i_Count) + " " + (i_Count == 1 ? i_pOne : i_pMany) +
                           (i_Count == 1 ? ", in line " : ", the first in line ") + std::to_string(i_Line) + ".");
}

} // namespace

TQL::IResult ReadTableRows(const TableBody& i_rBody, VReadProgress* i_pProgress,
                           std::vector<RecordedChannel>& io_rChannels, TableTimes& o_rTimes, TableFindings& o_rFindings,
                           std::string& o_rError)
{
    std::size_t rows = 0;
    if (!ForEachRow(i_rBody, i_pProgress, 0.0, ShareOfCounting, [&](std::string_view, std::size_t) { ++rows; }))
        return StoppedReading(o_rError);
    std::size_t components = 0;
    for (const RecordedChannel& rChannel : io_rChannels)
        components += rChannel.ComponentCount();
    // A cell takes a character at least, if only for what stands between it and the next.
    if (components != 0 && rows > std::max(i_rBody.Rows.size() + rows, FreeCells) / components)
    {
        o_rError = "the head of the table names " + std::to_string(components) +
                   " columns, but most of its rows are much shorter. Repair the head or the rows.";
        return TQL::Result::InvalidFormat;
    }
    for (RecordedChannel& rChannel : io_rChannels)
        rChannel.Samples.assign(rows * rChannel.ComponentCount(), std::numeric_limits<float>::quiet_NaN());
    o_rTimes.Seconds.clear();
    o_rTimes.Seconds.reserve(rows);
    o_rTimes.Unit = i_rBody.TimeUnit;
    o_rTimes.HintRate = i_rBody.HintRate;
    o_rFindings.TextInColumn.assign(i_rBody.Columns.size(), false);

    VRowReader reader(i_rBody, io_rChannels, o_rTimes, o_rFindings);
    const auto read = [&](std::string_view i_Line, std::size_t i_LineNumber)
    {
        reader.Read(i_Line, i_LineNumber);
    };
    if (!ForEachRow(i_rBody, i_pProgress, ShareOfCounting, 1.0, read))
        return StoppedReading(o_rError);
    if (i_rBody.TimeKind == ETimeKind::Frames)
        TurnFramesIntoTimes(i_rBody, o_rTimes);
    return TQL::Result::Ok;
}

void TellFindings(const TableFindings& i_rFindings, std::vector<std::string>& io_rWarnings)
{
    Tell(i_rFindings.TextCells, "cell is no number and taken as missing", "cells are no numbers and taken as missing",
         i_rFindings.TextLine, io_rWarnings);
    Tell(i_rFindings.LargeCells, "number is too large or infinite and taken as missing",
         "numbers are too large or infinite and taken as missing", i_rFindings.LargeLine, io_rWarnings);
    Tell(i_rFindings.ShortRows, "row has fewer cells than there are columns; the rest is missing",
         "rows have fewer cells than there are columns; the rest is missing", i_rFindings.ShortLine, io_rWarnings);
    Tell(i_rFindings.LongRows, "row has more cells than there are columns; the rest is left out",
         "rows have more cells than there are columns; the rest is left out", i_rFindings.LongLine, io_rWarnings);
}

} // namespace Recordings
