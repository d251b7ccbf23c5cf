#include "Bench.h"
#include "Channels/Blocks/VSampleBlock.h"
#include "Channels/Samples/VSampleStore.h"
#include "GraphPlotSystem/Traces/TraceRingFill.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>
#include <memory>
#include <random>
#include <stdexcept>
#include <string>

namespace Bench
{
namespace
{

using GraphPlotUI::TraceTexelRing;
using TQL::TickRange;

constexpr std::uint32_t s_Components = 3;
constexpr std::int64_t s_Period = 1'125'000; // 120 samples a second
constexpr std::int64_t s_RowsPerHour = 120 * 3600;
constexpr int s_Repeats = 400;
constexpr int s_ColdRepeats = 200;

/// Half an hour of a wave on each component, out of sight for half a second now and then, as often as markers are.
std::vector<float> MakeSamples()
{
    constexpr std::int64_t rows = s_RowsPerHour / 2;
    std::vector<float> samples(static_cast<std::size_t>(rows) * s_Components);
    std::minstd_rand random(7);
    std::int64_t hidden = 0;
    for (std::int64_t row = 0; row < rows; ++row)
    {
        if (hidden == 0 && random() % 3000 == 0)
            hidden = 60;
        for (std::uint32_t c = 0; c < s_Components; ++c)
            samples[static_cast<std::size_t>(row) * s_Components + c] =
                hidden > 0 ? std::numeric_limits<float>::quiet_NaN()
                           : std::sin(0.013f * static_cast<float>(row) + static_cast<float>(c));
        hidden = std::max<std::int64_t>(0, hidden - 1);
    }
    return samples;
}

/// A recording of so many hours, all of it in memory.
class Recording
{
public:
    Recording(const std::vector<float>& i_rHalfHour, int i_Hours)
        : m_pStore(std::make_shared<Channels::VSampleStore>(s_Period, 0, s_Components))
        , m_Block(m_pStore, Channels::VSummaryPyramid::LevelCount)
    {
        m_pStore->EnableSummaries();
        for (int half = 0; half < 2 * i_Hours; ++half)
            m_pStore->Append(i_rHalfHour);
        m_Block.GetRange(m_Range);
    }

    std::int64_t RowsAt(std::uint8_t i_Level) const { return (m_Range.Last / s_Period) >> i_Level; }

    /// A ring made anew from i_Rows rows that begin at row i_First.
    void Refill(TraceTexelRing& i_rRing, std::uint8_t i_Level, std::int64_t i_First, std::int64_t i_Rows) const
    {
        const std::int64_t stride = s_Period << i_Level;
        const TickRange ticks = {i_First * stride, (i_First + i_Rows) * stride};
        i_rRing.Extent.RowCount = 0;
        if (!GraphPlotUI::FillRing(i_rRing, m_Scratch, m_Block, m_Range, ticks, ticks, i_Level) ||
            i_rRing.Extent.RowCount != static_cast<std::uint32_t>(i_Rows))
            throw std::runtime_error("a refill did not give the rows that it was asked for");
        Keep(i_rRing.Texels);
    }

private:
    std::shared_ptr<Channels::VSampleStore> m_pStore;
    Channels::VSampleBlock m_Block;
    mutable GraphPlotUI::RingScratch m_Scratch;
    TickRange m_Range;
};

/// Copies so many rows of texels.
class TexelCopy
{
public:
    void Run(std::int64_t i_Rows)
    {
        std::memcpy(m_To.data(), m_From.data(),
                    static_cast<std::size_t>(i_Rows) * s_Components * sizeof(GraphPlotUI::TraceTexel));
        Keep(m_To);
    }

private:
    std::vector<GraphPlotUI::TraceTexel> m_From{std::size_t{TraceTexelRing::Capacity} * s_Components};
    std::vector<GraphPlotUI::TraceTexel> m_To{std::size_t{TraceTexelRing::Capacity} * s_Components};
};

void AddFigure(Table& o_rTable, std::string i_Name, double i_Seconds, std::string i_Yardstick,
               double i_YardstickSeconds, EGoal i_Goal, double i_Target)
{
    o_rTable.push_back({std::move(i_Name), i_Seconds * 1e6, "us", std::move(i_Yardstick), i_YardstickSeconds * 1e6,
                        i_Seconds / i_YardstickSeconds, i_Goal, i_Target});
}

/// As many rows as the shorter recording has, at most a full ring, from the middle of both.
void CompareLengths(Table& o_rTable, const Recording& i_rLong, const std::string& i_rName, const Recording& i_rShort,
                    std::uint8_t i_Level)
{
    const std::int64_t rows = std::min<std::int64_t>(TraceTexelRing::Capacity, i_rShort.RowsAt(i_Level));
    TraceTexelRing longRing;
    TraceTexelRing shortRing;
    const auto [longSeconds, shortSeconds] = BestSecondsPaired(
        s_Repeats, [&] { i_rLong.Refill(longRing, i_Level, (i_rLong.RowsAt(i_Level) - rows) / 2, rows); },
        [&] { i_rShort.Refill(shortRing, i_Level, (i_rShort.RowsAt(i_Level) - rows) / 2, rows); });
    AddFigure(o_rTable,
              "refill " + std::to_string(rows) + " x 3 at level " + std::to_string(i_Level) + " from " + i_rName,
              longSeconds, "the same from 1 h", shortSeconds, EGoal::AtMost, 1.5);
}

void CompareWithCopy(Table& o_rTable, const Recording& i_rRecording, const std::string& i_rName, std::uint8_t i_Level)
{
    const std::int64_t rows = std::min<std::int64_t>(TraceTexelRing::Capacity, i_rRecording.RowsAt(i_Level));
    const std::string name =
        "refill " + std::to_string(rows) + " x 3 at level " + std::to_string(i_Level) + " from " + i_rName;
    TraceTexelRing ring;
    TexelCopy copy;
    const auto [refill, copied] = BestSecondsPaired(
        s_Repeats, [&] { i_rRecording.Refill(ring, i_Level, (i_rRecording.RowsAt(i_Level) - rows) / 2, rows); },
        [&] { copy.Run(rows); });
    // Where a recording is too short for a full ring at that level, the figure is only told.
    const EGoal goal = rows == TraceTexelRing::Capacity ? EGoal::AtMost : EGoal::Report;
    AddFigure(o_rTable, name + ", against a copy", refill, "copying as many texels", copied, goal, 4.0);
}

/// The mean over places that are in no cache: what a jump across a long recording costs.
void ReportJumps(Table& o_rTable, const Recording& i_rRecording, const std::string& i_rName, std::uint8_t i_Level)
{
    constexpr std::int64_t rows = TraceTexelRing::Capacity;
    TraceTexelRing ring;
    TexelCopy copy;
    std::minstd_rand random(3);
    std::uniform_int_distribution<std::int64_t> place(0, i_rRecording.RowsAt(i_Level) - rows);
    const double jumps = BestSeconds(1,
                                     [&]
                                     {
                                         for (int i = 0; i < s_ColdRepeats; ++i)
                                             i_rRecording.Refill(ring, i_Level, place(random), rows);
                                     });
    const double copied = BestSeconds(s_Repeats, [&] { copy.Run(rows); });
    AddFigure(o_rTable,
              "refill 4096 x 3 at level " + std::to_string(i_Level) + " at random places of " + i_rName + ", mean",
              jumps / s_ColdRepeats, "copying as many texels", copied, EGoal::Report, 0.0);
}

} // namespace

/// Needs 4 GB of memory for the longest recording.
void RunRefill(Table& o_rTable)
{
    const std::vector<float> samples = MakeSamples();
    const Recording hour(samples, 1);
    const Recording day(samples, 24);
    const Recording tenDays(samples, 240);
    for (const std::uint8_t level : {0, 1, 3, 4, 5, 8, 9, 12})
    {
        CompareLengths(o_rTable, day, "24 h", hour, level);
        CompareLengths(o_rTable, tenDays, "240 h", hour, level);
        CompareWithCopy(o_rTable, hour, "1 h", level);
        CompareWithCopy(o_rTable, day, "24 h", level);
        CompareWithCopy(o_rTable, tenDays, "240 h", level);
    }
    for (const std::uint8_t level : {0, 4})
        ReportJumps(o_rTable, tenDays, "240 h", level);
}

} // namespace Bench
