#include "Recordings/Tables/TrcReader.h"

#include "Recordings/Tables/TableRecording.h"
#include "Recordings/Tables/TableRows.h"
#include "Recordings/Text/C3dText.h"
#include "Recordings/Text/TextScan.h"

#include <algorithm>
#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Recordings
{

namespace
{

constexpr std::size_t MostHeadLines = 200;
constexpr std::size_t ComponentsOfMarker = 3;

/// The head of a file, line by line; views into the text.
struct TrcHead
{
    std::string_view Keys;       ///< DataRate, CameraRate, ...
    std::string_view Values;     ///< below the keys
    std::string_view Labels;     ///< Frame#, Time, the markers
    std::string_view Components; ///< X1, Y1, Z1, ...; empty where there is no such line
    std::string_view FirstRow;   ///< empty where the file ends with its head
    std::size_t BodyOffset = 0;
    std::size_t BodyLine = 1;
};

std::string_view FirstWord(std::string_view i_Line)
{
    std::string_view word;
    NextWord(i_Line, word);
    return word;
}

bool IsComponentWord(std::string_view i_Word)
{
    return !i_Word.empty() && std::string_view("XYZxyz").find(i_Word.front()) != std::string_view::npos;
}

bool IsLabelLine(std::string_view i_Line)
{
    const std::string_view word = FirstWord(i_Line);
    return EqualsAnyCase(word, "Frame#") || EqualsAnyCase(word, "Frame");
}

bool FindHead(std::string_view i_Text, TrcHead& o_rHead)
{
    VLineScanner lines(i_Text);
    std::string_view line;
    while (o_rHead.Labels.empty() && lines.GetLineCount() < MostHeadLines && lines.Next(line))
    {
        if (EqualsAnyCase(FirstWord(line), "DataRate") && lines.Next(o_rHead.Values))
            o_rHead.Keys = line;
        else if (IsLabelLine(line))
            o_rHead.Labels = line;
    }
    while (o_rHead.FirstRow.empty() && !o_rHead.Labels.empty())
    {
        o_rHead.BodyOffset = lines.GetOffset();
        o_rHead.BodyLine = lines.GetLineCount() + 1;
        if (!lines.Next(line))
            break;
        if (o_rHead.Components.empty() && IsComponentWord(FirstWord(line)))
            o_rHead.Components = line;
        else if (!FirstWord(line).empty())
            o_rHead.FirstRow = line;
    }
    return !o_rHead.Labels.empty();
}

/// What the line of values says.
struct TrcFacts
{
    double Rate = 0.0;
    std::string Units;
    std::uint64_t Frames = 0;
    std::uint64_t Markers = 0;
    bool bFrames = false;
    bool bMarkers = false;
};

TrcFacts ReadFacts(const TrcHead& i_rHead)
{
    const std::vector<std::string_view> keys = SplitCells(i_rHead.Keys, TabOrBlank(i_rHead.Keys));
    const std::vector<std::string_view> values = SplitCells(i_rHead.Values, TabOrBlank(i_rHead.Values));
    TrcFacts facts;
    for (std::size_t i = 0; i < std::min(keys.size(), values.size()); ++i)
    {
        if (EqualsAnyCase(keys[i], "DataRate") && ReadNumber(values[i], true, facts.Rate) != ECell::Number)
            facts.Rate = 0.0;
        if (EqualsAnyCase(keys[i], "Units"))
            facts.Units = CellText(values[i]);
        if (EqualsAnyCase(keys[i], "NumFrames"))
            facts.bFrames = ReadCount(values[i], facts.Frames);
        if (EqualsAnyCase(keys[i], "NumMarkers"))
            facts.bMarkers = ReadCount(values[i], facts.Markers);
    }
    if (!IsUsableRate(facts.Rate))
        facts.Rate = 0.0;
    return facts;
}

// Labels stand above the first of their three columns. Where the cells do not show that, they count in their order.
std::vector<std::string> PlaceLabels(const std::vector<std::string_view>& i_rCells, std::size_t i_First)
{
    const bool bAbove =
        std::all_of(i_rCells.begin(), i_rCells.end(),
                    [&](const std::string_view& i_rCell)
                    {
                        const auto at = static_cast<std::size_t>(&i_rCell - i_rCells.data());
                        return at < i_First || i_rCell.empty() || (at - i_First) % ComponentsOfMarker == 0;
                    });
    std::vector<std::string> labels;
    for (std::size_t i = i_First; i < i_rCells.size(); ++i)
        if (bAbove ? (i - i_First) % ComponentsOfMarker == 0 : !i_rCells[i].empty())
            labels.push_back(CellText(i_rCells[i]));
    return labels;
}

/// The columns of the table.
struct TrcColumns
{
    std::vector<std::string> Labels; ///< of the markers
    std::size_t First = 1;           ///< column of the first marker
    bool bTime = false;              ///< whether column 1 is the time
    char Separator = '\t';           ///< of the rows
};

TrcColumns FindColumns(const TrcHead& i_rHead)
{
    TrcColumns columns;
    const char separator = TabOrBlank(i_rHead.Labels);
    const std::vector<std::string_view> cells = SplitCells(i_rHead.Labels, separator);
    columns.bTime = cells.size() > 1 && EqualsAnyCase(cells[1], "Time");
    columns.First = columns.bTime ? 2 : 1;
    columns.Labels = PlaceLabels(cells, columns.First);
    if (separator == ' ') // nothing shows which column a label stands above
        columns.Labels.resize(cells.size() - std::min(cells.size(), columns.First));
    for (std::size_t i = 0; separator == ' ' && i < columns.Labels.size(); ++i)
        columns.Labels[i] = CellText(cells[columns.First + i]);

    columns.Separator = TabOrBlank(i_rHead.FirstRow);
    const std::size_t components = SplitCells(i_rHead.Components, ' ').size();
    const std::size_t held = SplitCells(i_rHead.FirstRow, columns.Separator).size();
    const std::size_t markers =
        std::max(components / ComponentsOfMarker, (held - std::min(held, columns.First) + 2) / ComponentsOfMarker);
    columns.Labels.resize(std::max(markers, columns.Labels.size()));
    return columns;
}

void AddMarkers(const TrcColumns& i_rColumns, const std::string& i_rUnits, TableBody& io_rBody,
                VRecording& io_rRecording)
{
    io_rBody.Columns.resize(i_rColumns.First);
    for (std::string& rLabel : UniqueLabels(i_rColumns.Labels, i_rColumns.Labels.size(), "Marker"))
    {
        for (std::size_t i = 0; i < ComponentsOfMarker; ++i)
            io_rBody.Columns.push_back({io_rRecording.Channels.size(), i, 1});
        RecordedChannel channel;
        channel.Kind = EChannelKind::Marker;
        channel.Subject = SubjectOfLabel(rLabel);
        channel.Name = std::move(rLabel);
        channel.ComponentNames = {"X", "Y", "Z"};
        channel.Units = i_rUnits;
        io_rRecording.Channels.push_back(std::move(channel));
    }
}

TableBody DescribeBody(std::string_view i_Text, const TrcHead& i_rHead, const TrcColumns& i_rColumns,
                       const TrcFacts& i_rFacts, std::vector<std::string>& io_rWarnings)
{
    TableBody body;
    body.Rows = i_Text.substr(i_rHead.BodyOffset);
    body.FirstLine = i_rHead.BodyLine;
    body.Rules = {i_rColumns.Separator, i_rHead.FirstRow.find(',') != std::string_view::npos};
    body.HintRate = i_rFacts.Rate;
    const std::vector<std::string_view> cells = SplitCells(i_rHead.FirstRow, i_rColumns.Separator);
    double time = 0.0;
    const bool bTime =
        i_rColumns.bTime && cells.size() > 1 && ReadNumber(cells[1], body.Rules.bDecimalComma, time) == ECell::Number;
    body.TimeKind = bTime ? ETimeKind::Seconds : ETimeKind::Frames;
    body.TimeColumn = bTime ? 1 : 0;
    if (!bTime)
        io_rWarnings.push_back("The rows have no times; they are laid by their frame numbers at " +
                               NumberText(i_rFacts.Rate > 0.0 ? i_rFacts.Rate : AssumedRate) + " Hz.");
    return body;
}

TQL::IResult ReadTrcText(std::string_view i_Text, const ReadOptions& i_rOptions, VRecording& io_rRecording,
                         std::string& o_rError)
{
    io_rRecording.Format = "TRC";
    TrcHead head;
    if (!FindHead(i_Text, head))
        return RefuseFormat("this is not a TRC file: the line of marker names that begins with \"Frame#\" is missing. "
                            "Export the file again from the program that made it.",
                            o_rError);
    if (head.FirstRow.empty())
        return RefuseFormat("the file holds no frame behind its head. Export it again from the program that made it.",
                            o_rError);
    const TrcFacts facts = ReadFacts(head);
    const TrcColumns columns = FindColumns(head);
    if (columns.Labels.empty() || columns.Labels.size() > MostColumns)
        return RefuseFormat("the file has " + std::to_string(columns.Labels.size()) + " markers, but 1 to " +
                                std::to_string(MostColumns) + " can be opened. Export fewer markers.",
                            o_rError);
    TableBody body = DescribeBody(i_Text, head, columns, facts, io_rRecording.Warnings);
    AddMarkers(columns, facts.Units, body, io_rRecording);
    TableTimes times;
    TableFindings findings;
    if (const TQL::IResult result =
            ReadTableRows(body, i_rOptions.pProgress, io_rRecording.Channels, times, findings, o_rError);
        result.IsError())
        return result;
    if (facts.bMarkers)
        TellCount("markers", facts.Markers, columns.Labels.size(), io_rRecording.Warnings);
    if (facts.bFrames)
        TellCount("frames", facts.Frames, findings.Rows, io_rRecording.Warnings);
    TellFindings(findings, io_rRecording.Warnings);
    LayTable(times, i_rOptions, false, std::nullopt, io_rRecording);
    return TQL::Result::Ok;
}

} // namespace

bool LooksLikeTrc(std::span<const std::byte> i_File)
{
    VLineScanner lines(TextOfBytes(i_File.first(std::min<std::size_t>(i_File.size(), 4096))));
    std::string_view line;
    return lines.Next(line) && EqualsAnyCase(FirstWord(line), "PathFileType");
}

TQL::IResult ReadTrc(std::span<const std::byte> i_File, const ReadOptions& i_rOptions, VRecording& o_rRecording,
                     std::string& o_rError)
{
    const auto read = [&](std::string_view i_Text, VRecording& io_rRecording, std::string& o_rReason)
    {
        return ReadTrcText(i_Text, i_rOptions, io_rRecording, o_rReason);
    };
    return ReadTextFile(i_File, read, o_rRecording, o_rError);
}

} // namespace Recordings
