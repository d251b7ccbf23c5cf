#include "Recordings/Tables/CsvReader.h"

#include "Recordings/Tables/CsvLayout.h"
#include "Recordings/Tables/TableRecording.h"
#include "Recordings/Tables/TableRows.h"
#include "Recordings/Text/TextScan.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace Recordings
{

namespace
{

// A first column without a name that rises by one is counted; one that rises evenly is the time.
TimeColumn GuessTimeColumn(const CsvLayout& i_rLayout, std::vector<std::string>& io_rWarnings)
{
    const std::vector<double>& rTimes = i_rLayout.FirstTimes;
    if (rTimes.size() < 3 || i_rLayout.Heads.size() < 2 || i_rLayout.bNamed.front())
        return {};
    const double step = rTimes[1] - rTimes[0];
    for (std::size_t i = 1; i < rTimes.size(); ++i)
        if (!(step > 0.0) || std::abs(rTimes[i] - rTimes[i - 1] - step) > 0.15 * step)
            return {};
    const bool bCount = step == 1.0 && rTimes[0] == std::floor(rTimes[0]);
    io_rWarnings.push_back(bCount
                               ? "The first column has no name and counts; it is taken as frame numbers."
                               : "The first column has no name and rises evenly; it is taken as the time in seconds.");
    return {0, bCount ? ETimeKind::Frames : ETimeKind::Seconds, 1.0, true};
}

// Clocks of computers count in whole milliseconds or less since 1970; such numbers are no seconds.
void GuessTimeUnit(const CsvLayout& i_rLayout, TimeColumn& io_rTime, std::vector<std::string>& io_rWarnings)
{
    if (io_rTime.Kind != ETimeKind::Seconds || io_rTime.bUnitSaid || io_rTime.Column != 0 ||
        i_rLayout.FirstTimes.empty() || i_rLayout.FirstTimes.front() < 1e11)
        return;
    const double first = i_rLayout.FirstTimes.front();
    io_rTime.Unit = first < 1e14 ? 1e-3 : first < 1e17 ? 1e-6 : 1e-9;
    const char* const pUnit = first < 1e14 ? "milliseconds" : first < 1e17 ? "microseconds" : "nanoseconds";
    io_rWarnings.push_back(std::string("The times say no unit; numbers that large are taken as ") + pUnit + ".");
}

TimeColumn ChooseTimeColumn(const CsvLayout& i_rLayout, std::vector<std::string>& io_rWarnings)
{
    TimeColumn time = FindTimeColumn(i_rLayout.Heads);
    if (time.Kind == ETimeKind::None)
        time = GuessTimeColumn(i_rLayout, io_rWarnings);
    GuessTimeUnit(i_rLayout, time, io_rWarnings);
    if (time.Kind == ETimeKind::Frames && !(i_rLayout.HintRate > 0.0))
        io_rWarnings.push_back("The file says no rate; its frame numbers are laid at " + NumberText(AssumedRate) +
                               " Hz.");
    return time;
}

bool HasNumbers(const RecordedChannel& i_rChannel)
{
    return std::any_of(i_rChannel.Samples.begin(), i_rChannel.Samples.end(),
                       [](float i_Value) { return !std::isnan(i_Value); });
}

// Columns of words are no channels, nor are those without name and number that programs leave at the end of lines.
void DropEmptyColumns(const CsvLayout& i_rLayout, const TableBody& i_rBody, const TableFindings& i_rFindings,
                      VRecording& io_rRecording)
{
    std::vector<bool> drop(io_rRecording.Channels.size(), false);
    for (std::size_t i = 0; i < i_rBody.Columns.size(); ++i)
    {
        const TableColumn& rColumn = i_rBody.Columns[i];
        if (rColumn.Channel == TableColumn::Nothing || io_rRecording.Channels[rColumn.Channel].ComponentCount() > 1 ||
            HasNumbers(io_rRecording.Channels[rColumn.Channel]))
            continue;
        const bool bText = i_rFindings.TextInColumn[i];
        drop[rColumn.Channel] = bText || !i_rLayout.bNamed[i];
        if (bText)
            io_rRecording.Warnings.push_back("Column \"" + io_rRecording.Channels[rColumn.Channel].Name +
                                             "\" holds no numbers and is left out.");
    }
    std::size_t kept = 0;
    for (std::size_t i = 0; i < drop.size(); ++i)
        if (!drop[i] && kept++ != i)
            io_rRecording.Channels[kept - 1] = std::move(io_rRecording.Channels[i]);
    io_rRecording.Channels.resize(kept);
}

TableBody DescribeBody(std::string_view i_Text, const CsvLayout& i_rLayout, const TimeColumn& i_rTime)
{
    TableBody body;
    body.Rows = i_Text.substr(i_rLayout.BodyOffset);
    body.FirstLine = i_rLayout.BodyLine;
    body.Rules = i_rLayout.Rules;
    body.TimeKind = i_rTime.Kind;
    body.TimeColumn = i_rTime.Kind == ETimeKind::None ? TableColumn::Nothing : i_rTime.Column;
    body.TimeUnit = i_rTime.Unit;
    body.HintRate = i_rLayout.HintRate;
    body.bRemarks = true;
    return body;
}

std::optional<RecordedChannel> MakeTimeChannel(const CsvLayout& i_rLayout, const TimeColumn& i_rTime)
{
    if (i_rTime.Kind != ETimeKind::Seconds || !i_rLayout.bNamed[i_rTime.Column])
        return std::nullopt;
    RecordedChannel channel;
    channel.bCountsRows = true;
    channel.Name = i_rLayout.Heads[i_rTime.Column].Name;
    channel.Units = i_rLayout.Heads[i_rTime.Column].Units;
    return channel;
}

TQL::IResult ReadCsvText(std::string_view i_Text, const ReadOptions& i_rOptions, VRecording& io_rRecording,
                         std::string& o_rError)
{
    io_rRecording.Format = "CSV";
    CsvLayout layout;
    if (!FindCsvLayout(i_Text, layout))
        return RefuseFormat("no row of numbers was found in its first lines. Choose a table with a row for each sample "
                            "and a column for each value.",
                            o_rError);
    if (layout.Heads.size() > MostColumns)
        return RefuseFormat("the table has more than " + std::to_string(MostColumns) +
                                " columns, which is more than can be opened. Export fewer columns.",
                            o_rError);
    std::vector<std::string>& rWarnings = io_rRecording.Warnings;
    if (!layout.bNames)
        rWarnings.push_back("The table has no row of names; its columns are numbered.");
    const TimeColumn time = ChooseTimeColumn(layout, rWarnings);
    TableBody body = DescribeBody(i_Text, layout, time);
    GroupColumns(layout.Heads, body.TimeColumn, body.Columns, io_rRecording.Channels);
    TableTimes times;
    TableFindings findings;
    if (const TQL::IResult result =
            ReadTableRows(body, i_rOptions.pProgress, io_rRecording.Channels, times, findings, o_rError);
        result.IsError())
        return result;
    TellFindings(findings, rWarnings);
    DropEmptyColumns(layout, body, findings, io_rRecording);
    if (io_rRecording.Channels.empty())
        return RefuseFormat("the table has no column of numbers beside its times. Choose a table with one.", o_rError);
    LayTable(times, i_rOptions, true, MakeTimeChannel(layout, time), io_rRecording);
    return TQL::Result::Ok;
}

} // namespace

bool LooksLikeCsv(std::span<const std::byte> i_File)
{
    CsvLayout layout;
    const std::string_view text = TextOfBytes(i_File);
    return text.substr(0, 4096).find('\0') == std::string_view::npos && FindCsvLayout(text, layout);
}

TQL::IResult ReadCsv(std::span<const std::byte> i_File, const ReadOptions& i_rOptions, VRecording& o_rRecording,
                     std::string& o_rError)
{
    const auto read = [&](std::string_view i_Text, VRecording& io_rRecording, std::string& o_rReason)
    {
        return ReadCsvText(i_Text, i_rOptions, io_rRecording, o_rReason);
    };
    return ReadTextFile(i_File, read, o_rRecording, o_rError);
}

} // namespace Recordings
