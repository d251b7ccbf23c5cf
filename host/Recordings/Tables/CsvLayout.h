#pragma once

#include "Recordings/Tables/ColumnNames.h"
#include "Recordings/Text/TextScan.h"

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace Recordings
{

/// How a table of text is written, as its first lines show it.
struct CsvLayout
{
    CellRules Rules;
    std::vector<ColumnHead> Heads;  ///< one a column; "Column 3" where the file has no name
    std::vector<bool> bNamed;       ///< whether the file names the column
    std::vector<double> FirstTimes; ///< first cells of the first rows, as long as they are numbers
    bool bNames = false;            ///< whether there is a row of names
    double HintRate = 0.0;          ///< samples a second as the lines above say it, or 0
    std::size_t BodyOffset = 0;
    std::size_t BodyLine = 1;
};

/// Looks at the first lines of a text; false when none of them is a row of numbers. The separator is the one that gives
/// most numbers; the rows begin with the longest run of lines of numbers, the names stand in the line above, or in the
/// one above a row of units. Bounded: at most some 200 lines are looked at.
bool FindCsvLayout(std::string_view i_Text, CsvLayout& o_rLayout);

} // namespace Recordings
