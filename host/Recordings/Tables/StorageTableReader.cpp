#include "Recordings/Tables/StorageTableReader.h"

#include "Recordings/Tables/ColumnNames.h"
#include "Recordings/Tables/TableRecording.h"
#include "Recordings/Tables/TableRows.h"
#include "Recordings/Text/C3dText.h"
#include "Recordings/Text/TextScan.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace Recordings
{

namespace
{

constexpr std::size_t MostHeadLines = 10'000;
constexpr std::size_t RowsToLookAt = 32;
constexpr std::size_t MostParts = 1024;

/// The head of a file and what it says.
struct StorageHead
{
    std::vector<std::string_view> Labels;
    char Separator = '\t'; ///< of the labels
    bool bDegrees = false;
    bool bAngleUnits = false; ///< whether the head says how angles are given
    bool bVectors = false;    ///< whether it says that cells hold several numbers
    std::uint64_t Rows = 0;
    std::uint64_t Columns = 0;
    bool bRows = false;
    bool bColumns = false;
    std::size_t BodyOffset = 0;
    std::size_t BodyLine = 1;
};

// A line of the head without what spreadsheets fill up its row with.
std::string_view TrimPadding(std::string_view i_Line)
{
    while (!i_Line.empty() && std::string_view(" \t,;").find(i_Line.back()) != std::string_view::npos)
        i_Line.remove_suffix(1);
    return TrimBlanks(i_Line);
}

bool IsHeadEnd(std::string_view i_Line)
{
    return EqualsAnyCase(TrimPadding(i_Line), "endheader");
}

// What stands between the names: tabs, else semicolons or commas as spreadsheets write them, else runs of blanks.
char LabelSeparator(std::string_view i_Line)
{
    if (i_Line.find('\t') != std::string_view::npos)
        return '\t';
    const std::size_t words = SplitCells(i_Line, ' ').size();
    for (const char separator : {';', ','})
        if (const std::size_t cells = SplitCells(i_Line, separator).size(); cells > 1 && cells >= words)
            return separator;
    return ' ';
}

// "key=value", "key value", "key: value" and "key,value" alike.
void ReadFact(std::string_view i_Line, StorageHead& io_rHead)
{
    const std::string_view line = TrimPadding(i_Line);
    const std::size_t end = std::min(line.find_first_of("=: \t,;"), line.size());
    const std::string_view key = line.substr(0, end);
    std::string_view value = line.substr(end);
    while (!value.empty() && std::string_view("=: \t,;").find(value.front()) != std::string_view::npos)
        value.remove_prefix(1);
    if (EqualsAnyCase(key, "nRows") || EqualsAnyCase(key, "datarows"))
        io_rHead.bRows = ReadCount(value, io_rHead.Rows);
    if (EqualsAnyCase(key, "nColumns") || EqualsAnyCase(key, "datacolumns"))
        io_rHead.bColumns = ReadCount(value, io_rHead.Columns);
    if (EqualsAnyCase(key, "DataType"))
        io_rHead.bVectors = !value.empty() && !EqualsAnyCase(value, "double");
    if (EqualsAnyCase(key, "inDegrees"))
    {
        io_rHead.bAngleUnits = true;
        io_rHead.bDegrees = EqualsAnyCase(value, "yes") || EqualsAnyCase(value, "true") || value == "1";
    }
}

// False where no line of names was found.
bool ReadHead(std::string_view i_Text, StorageHead& o_rHead)
{
    VLineScanner lines(i_Text);
    std::string_view line;
    bool bEnded = false;
    while (lines.GetLineCount() < MostHeadLines && lines.Next(line))
    {
        const std::vector<std::string_view> cells =
            SplitCells(line.substr(0, 4096), LabelSeparator(line.substr(0, 4096)));
        const bool bNames = cells.size() > 1 && EqualsAnyCase(cells.front(), "time");
        if (IsHeadEnd(line))
            bEnded = true;
        else if (bNames || (bEnded && !cells.empty()))
        {
            o_rHead.Separator = LabelSeparator(line);
            o_rHead.Labels = SplitCells(line, o_rHead.Separator);
            o_rHead.BodyOffset = lines.GetOffset();
            o_rHead.BodyLine = lines.GetLineCount() + 1;
            return true;
        }
        else
            ReadFact(line, o_rHead);
    }
    return false;
}

std::size_t PartsOf(std::string_view i_Cell)
{
    return static_cast<std::size_t>(std::count(i_Cell.begin(), i_Cell.end(), ',')) + 1;
}

/// How the rows are written, as their first ones show it.
struct RowLook
{
    char Separator = '\t';
    bool bDecimalComma = false;
    std::vector<std::size_t> Parts; ///< numbers in the cells of each column
    bool bRows = false;
};

char RowSeparator(std::string_view i_Row, const StorageHead& i_rHead)
{
    if (i_rHead.Separator == ',' || i_rHead.Separator == ';')
        return i_rHead.Separator;
    if (i_Row.find('\t') == std::string_view::npos)
        return ' ';
    const bool bTabs = SplitCells(i_Row, '\t').size() == i_rHead.Labels.size() ||
                       SplitCells(i_Row, ' ').size() != i_rHead.Labels.size();
    return bTabs ? '\t' : ' ';
}

RowLook LookAtRows(std::string_view i_Rows, const StorageHead& i_rHead)
{
    RowLook look;
    VLineScanner lines(i_Rows);
    std::string_view line;
    for (std::size_t row = 0; row < RowsToLookAt && lines.Next(line);)
    {
        if (TrimBlanks(line).empty())
            continue;
        look.Separator = row++ == 0 ? RowSeparator(line, i_rHead) : look.Separator;
        look.bRows = true;
        const std::vector<std::string_view> cells = SplitCells(line, look.Separator);
        look.Parts.resize(std::max(look.Parts.size(), cells.size()), 1);
        for (std::size_t i = 0; i < cells.size(); ++i)
            look.Parts[i] = std::max(look.Parts[i], std::min(PartsOf(cells[i]), MostParts));
    }
    const std::size_t most = look.Parts.empty() ? 1 : *std::max_element(look.Parts.begin(), look.Parts.end());
    look.bDecimalComma = most == 2 && !i_rHead.bVectors; // "0,5" in all columns, not a vector of two
    if (look.bDecimalComma)
        std::fill(look.Parts.begin(), look.Parts.end(), 1);
    return look;
}

std::vector<std::string> NamesOfParts(std::size_t i_Parts)
{
    if (i_Parts == 1)
        return {""};
    if (i_Parts == 3)
        return {"X", "Y", "Z"};
    if (i_Parts == 4)
        return {"W", "X", "Y", "Z"};
    std::vector<std::string> names;
    for (std::size_t i = 1; i <= i_Parts; ++i)
        names.push_back(std::to_string(i));
    return names;
}

void AddColumns(const StorageHead& i_rHead, const RowLook& i_rLook, TableBody& io_rBody, VRecording& io_rRecording)
{
    const std::size_t count = std::max(i_rHead.Labels.size(), i_rLook.Parts.size());
    std::vector<std::string> names;
    for (const std::string_view label : i_rHead.Labels)
        names.push_back(CellText(label));
    names = UniqueLabels(std::move(names), count, "Column");
    for (std::size_t i = 0; i < count; ++i)
    {
        if (io_rBody.TimeKind == ETimeKind::None && EqualsAnyCase(names[i], "time"))
        {
            io_rBody.TimeKind = ETimeKind::Seconds;
            io_rBody.TimeColumn = i;
            io_rBody.Columns.push_back({});
            continue;
        }
        const std::size_t parts = i < i_rLook.Parts.size() ? i_rLook.Parts[i] : 1;
        io_rBody.Columns.push_back({io_rRecording.Channels.size(), 0, parts});
        RecordedChannel channel;
        channel.ComponentNames = NamesOfParts(parts);
        if (i_rHead.bAngleUnits && parts == 1)
            channel.Units = UnitsOfAngle(names[i], i_rHead.bDegrees);
        channel.bCountsRows = CountsRows({names[i], {}});
        channel.Name = std::move(names[i]);
        io_rRecording.Channels.push_back(std::move(channel));
    }
}

TQL::IResult ReadStorageText(std::string_view i_Text, const ReadOptions& i_rOptions, VRecording& io_rRecording,
                             std::string& o_rError)
{
    io_rRecording.Format = "STO";
    StorageHead head;
    if (!ReadHead(i_Text, head))
        return RefuseFormat("this is not a MOT or STO file: neither \"endheader\" nor a line of column names that "
                            "begins with \"time\" was found. Export the file again from the program that made it.",
                            o_rError);
    const std::string_view rows = i_Text.substr(std::min(head.BodyOffset, i_Text.size()));
    const RowLook look = LookAtRows(rows, head);
    if (!look.bRows)
        return RefuseFormat("the file holds no row behind its head. Export it again from the program that made it.",
                            o_rError);
    if (std::max(head.Labels.size(), look.Parts.size()) > MostColumns)
        return RefuseFormat("the table has more than " + std::to_string(MostColumns) +
                                " columns, which is more than can be opened. Export fewer columns.",
                            o_rError);
    TableBody body;
    body.Rows = rows;
    body.FirstLine = head.BodyLine;
    body.Rules = {look.Separator, look.bDecimalComma};
    AddColumns(head, look, body, io_rRecording);
    TableTimes times;
    TableFindings findings;
    if (const TQL::IResult result =
            ReadTableRows(body, i_rOptions.pProgress, io_rRecording.Channels, times, findings, o_rError);
        result.IsError())
        return result;
    if (head.bRows)
        TellCount("rows", head.Rows, findings.Rows, io_rRecording.Warnings);
    if (head.bColumns)
        TellCount("columns", head.Columns, body.Columns.size(), io_rRecording.Warnings);
    TellFindings(findings, io_rRecording.Warnings);
    LayTable(times, i_rOptions, false, std::nullopt, io_rRecording);
    return TQL::Result::Ok;
}

} // namespace

std::string UnitsOfAngle(const std::string& i_rColumn, bool i_bDegrees)
{
    constexpr std::array angles{"angle",   "flexion",   "extension",  "adduction", "abduction", "rotation",
                                "_tilt",   "_list",     "bending",    "obliquity", "inversion", "eversion",
                                "pro_sup", "pronation", "supination", "deviation"};
    constexpr std::array others{"force",     "moment",     "torque", "power",     "work",  "accel",
                                "/forceset", "activation", "length", "_reaction", "muscle"};
    const std::string name = SmallLetters(i_rColumn);
    const auto isIn = [&](const char* i_pWord)
    {
        return name.find(i_pWord) != std::string::npos;
    };
    if (std::none_of(angles.begin(), angles.end(), isIn) || std::any_of(others.begin(), others.end(), isIn))
        return {};
    const bool bSpeed = name.ends_with("/speed") || name.ends_with("_u") || name.find("veloc") != std::string::npos;
    return std::string(i_bDegrees ? "deg" : "rad") + (bSpeed ? "/s" : "");
}

bool LooksLikeStorageTable(std::span<const std::byte> i_File)
{
    VLineScanner lines(TextOfBytes(i_File.first(std::min<std::size_t>(i_File.size(), 1 << 16))));
    for (std::string_view line; lines.Next(line);)
        if (IsHeadEnd(line))
            return true;
    return false;
}

TQL::IResult ReadStorageTable(std::span<const std::byte> i_File, const ReadOptions& i_rOptions,
                              VRecording& o_rRecording, std::string& o_rError)
{
    const auto read = [&](std::string_view i_Text, VRecording& io_rRecording, std::string& o_rReason)
    {
        return ReadStorageText(i_Text, i_rOptions, io_rRecording, o_rReason);
    };
    return ReadTextFile(i_File, read, o_rRecording, o_rError);
}

} // namespace Recordings
