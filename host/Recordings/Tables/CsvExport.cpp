#include "Recordings/Tables/CsvExport.h"

#include "Recordings/Common/FileMessage.h"
#include "Recordings/Common/FrameNumbers.h"
#include "Recordings/Common/NamePattern.h"
#include "Recordings/Common/VFileReplacement.h"
#include "TQL/ITick.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <limits>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace Recordings
{

namespace
{

constexpr std::size_t WriteBytes = 1 << 20; // text is handed to the file in pieces of about this size
constexpr std::int64_t NoTick = std::numeric_limits<std::int64_t>::max();

/// The common place of all channels whose rows stand at the same times.
struct Grid
{
    std::int64_t FirstTick = 0;
    std::int64_t Period = 0;
    std::size_t Rows = 0;
    std::size_t NextRow = 0;
    bool bInRow = false; ///< whether the row that is being written is one of this grid

    std::int64_t NextTick() const
    {
        return NextRow < Rows ? FirstTick + static_cast<std::int64_t>(NextRow) * Period : NoTick;
    }
};

struct Column
{
    const RecordedChannel* pChannel = nullptr;
    std::size_t GridIndex = 0;
};

void AppendQuoted(std::string_view i_Text, std::string& io_rLine)
{
    if (i_Text.find_first_of(",\"\r\n") == std::string_view::npos)
    {
        io_rLine += i_Text;
        return;
    }
    io_rLine += '"';
    for (const char character : i_Text)
        io_rLine.append(character == '"' ? 2 : 1, character);
    io_rLine += '"';
}

// The fewest digits that give the same number back.
template <typename Number>
void AppendNumber(Number i_Value, std::string& io_rLine)
{
    char digits[64];
    const std::to_chars_result end = std::to_chars(std::begin(digits), std::end(digits), i_Value);
    io_rLine.append(digits, end.ptr);
}

/// The chosen channels and the times at which they have samples.
class VTable
{
public:
    explicit VTable(std::int64_t i_FramePeriod) : m_FramePeriod(i_FramePeriod) {}

    void Add(const RecordedChannel& i_rChannel)
    {
        const auto found = std::find_if(m_Grids.begin(), m_Grids.end(),
                                        [&](const Grid& i_rGrid)
                                        {
                                            return i_rGrid.FirstTick == i_rChannel.FirstTick &&
                                                   i_rGrid.Period == i_rChannel.SamplePeriod &&
                                                   i_rGrid.Rows == i_rChannel.RowCount();
                                        });
        m_Columns.push_back({&i_rChannel, static_cast<std::size_t>(found - m_Grids.begin())});
        if (found == m_Grids.end())
            m_Grids.push_back({i_rChannel.FirstTick, i_rChannel.SamplePeriod, i_rChannel.RowCount()});
    }

    bool IsEmpty() const { return m_Columns.empty(); }

    void AppendHead(std::string& io_rText) const
    {
        io_rText += "frame,time";
        for (const Column& rColumn : m_Columns)
            for (const std::string& rComponent : rColumn.pChannel->ComponentNames)
            {
                const bool bBare = rColumn.pChannel->ComponentCount() == 1 && rComponent.empty();
                io_rText += ',';
                AppendQuoted(bBare ? rColumn.pChannel->Name : rColumn.pChannel->Name + "." + rComponent, io_rText);
            }
        io_rText += '\n';
    }

    /// The row of the next time; false behind the last.
    bool AppendNextRow(std::string& io_rText)
    {
        std::int64_t tick = NoTick;
        for (const Grid& rGrid : m_Grids)
            tick = std::min(tick, rGrid.NextTick());
        if (tick == NoTick)
            return false;
        for (Grid& rGrid : m_Grids)
            rGrid.bInRow = rGrid.NextTick() == tick;
        AppendNumber(FrameAt(tick, m_FramePeriod), io_rText);
        io_rText += ',';
        AppendNumber(TQL::ITick{tick}.Seconds(), io_rText);
        for (const Column& rColumn : m_Columns)
            AppendCells(rColumn, io_rText);
        io_rText += '\n';
        for (Grid& rGrid : m_Grids)
            rGrid.NextRow += rGrid.bInRow ? 1 : 0;
        return true;
    }

private:
    void AppendCells(const Column& i_rColumn, std::string& io_rText) const
    {
        const Grid& rGrid = m_Grids[i_rColumn.GridIndex];
        const std::size_t components = i_rColumn.pChannel->ComponentCount();
        if (!rGrid.bInRow)
        {
            io_rText.append(components, ',');
            return;
        }
        for (std::size_t i = 0; i < components; ++i)
        {
            const float value = i_rColumn.pChannel->Samples[rGrid.NextRow * components + i];
            io_rText += ',';
            if (!std::isnan(value))
                AppendNumber(value, io_rText);
        }
    }

    const std::int64_t m_FramePeriod;
    std::vector<Column> m_Columns;
    std::vector<Grid> m_Grids;
};

// The table of the channels that fit one of the patterns, in the order of the recording; nothing when a pattern fits
// none.
std::optional<VTable> ChooseChannels(const VRecording& i_rRecording, std::span<const std::string> i_Patterns,
                                     std::string& o_rError)
{
    std::vector<bool> used(i_Patterns.size(), false);
    VTable table(std::max<std::int64_t>(1, i_rRecording.FramePeriod));
    for (const RecordedChannel& rChannel : i_rRecording.Channels)
    {
        bool bChosen = i_Patterns.empty();
        for (std::size_t i = 0; i < i_Patterns.size(); ++i)
            if (MatchesPattern(rChannel.Name, i_Patterns[i]))
                bChosen = used[i] = true;
        if (bChosen)
            table.Add(rChannel);
    }
    const auto unused = std::find(used.begin(), used.end(), false);
    if (unused == used.end())
        return table;
    o_rError = "no channel is named like \"" + i_Patterns[static_cast<std::size_t>(unused - used.begin())] +
               "\". Capitals count; look the names up in the list of channels.";
    return std::nullopt;
}

} // namespace

TQL::IResult ExportCsv(const VRecording& i_rRecording, const std::filesystem::path& i_rPath,
                       std::span<const std::string> i_Patterns, std::string& o_rError)
{
    std::optional<VTable> table = ChooseChannels(i_rRecording, i_Patterns, o_rError);
    if (!table)
        return TQL::Result::NotFound;
    if (table->IsEmpty())
    {
        o_rError = "the recording holds no channels, so there is nothing to export.";
        return TQL::Result::NotAvailable;
    }
    VFileReplacement file(i_rPath);
    if (const TQL::IResult result = file.Open(o_rError); result.IsError())
        return result;
    std::string text;
    table->AppendHead(text);
    while (table->AppendNextRow(text))
    {
        if (text.size() < WriteBytes)
            continue;
        if (const TQL::IResult result = file.Write(text, o_rError); result.IsError())
            return result;
        text.clear();
    }
    if (const TQL::IResult result = file.Write(text, o_rError); result.IsError())
        return result;
    return file.Commit(o_rError);
}

} // namespace Recordings
