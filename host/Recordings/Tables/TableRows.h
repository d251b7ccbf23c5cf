#pragma once

#include "Recordings/Common/VReadProgress.h"
#include "Recordings/Common/VRecording.h"
#include "Recordings/Text/TextScan.h"
#include "Recordings/Time/TimeGrid.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace Recordings
{

/// What a column of a table feeds: components of a channel, or nothing.
struct TableColumn
{
    static constexpr std::size_t Nothing = static_cast<std::size_t>(-1);

    std::size_t Channel = Nothing;
    std::size_t Component = 0; ///< the first one that a cell feeds
    std::size_t Parts = 1;     ///< numbers in one cell, with commas between them
};

/// What the times of a table are.
enum class ETimeKind
{
    None,    ///< rows without times
    Seconds, ///< times in TableTimes::Unit
    Frames   ///< numbers of frames
};

/// The rows of a table of numbers, with what has to be known to read them.
struct TableBody
{
    std::string_view Rows;     ///< the text from the first row on
    std::size_t FirstLine = 1; ///< number of the first row's line
    CellRules Rules;
    std::vector<TableColumn> Columns;
    std::size_t TimeColumn = TableColumn::Nothing;
    ETimeKind TimeKind = ETimeKind::None;
    double TimeUnit = 1.0; ///< seconds
    double HintRate = 0.0; ///< samples a second as the head of the file says it; 0 when it does not
    bool bRemarks = false; ///< lines that begin with '#' or '%' are none of the rows
};

/// What was met while rows were read.
struct TableFindings
{
    std::size_t Rows = 0;
    std::size_t TextCells = 0;  ///< neither number nor word for a missing one
    std::size_t LargeCells = 0; ///< numbers that do not fit
    std::size_t ShortRows = 0;  ///< with fewer cells than columns
    std::size_t LongRows = 0;   ///< with more
    std::size_t TextLine = 0;   ///< of the first such cell or row
    std::size_t LargeLine = 0;
    std::size_t ShortLine = 0;
    std::size_t LongLine = 0;
    std::vector<bool> TextInColumn;
};

/// Most channels of a table that are opened.
inline constexpr std::size_t MostColumns = 100'000;

/// Reads rows into the samples of channels, row by row from the first sample on; what no cell feeds is NaN. The names
/// and components of the channels stand already. o_rTimes gets a time for each row, in seconds; its hint is set.
/// Blank lines are no rows, nor are rows of empty cells at the end. Memory: a float for each cell that the file holds;
/// an error where the head names so many columns that most would stand empty. i_pProgress may be null; when it says
/// stop the result is Canceled.
[[nodiscard]] TQL::IResult ReadTableRows(const TableBody& i_rBody, VReadProgress* i_pProgress,
                                         std::vector<RecordedChannel>& io_rChannels, TableTimes& o_rTimes,
                                         TableFindings& o_rFindings, std::string& o_rError);

/// The findings in sentences.
void TellFindings(const TableFindings& i_rFindings, std::vector<std::string>& io_rWarnings);

} // namespace Recordings
