#include "Channels/Samples/VSummaryPyramid.h"

#include <algorithm>
#include <utility>

namespace Channels
{

namespace
{

std::int64_t CeilShift(std::int64_t i_Value, std::uint32_t i_Shift)
{
    return (i_Value + (std::int64_t{1} << i_Shift) - 1) >> i_Shift;
}

} // namespace

VSummaryPyramid::Level::Level(std::uint32_t i_Level, std::size_t i_Components)
    : m_Records(i_Components), m_Counts(i_Components * CountBytesOf(i_Level))
{
}

void VSummaryPyramid::Level::Ensure(std::int64_t i_First, std::int64_t i_End)
{
    m_Records.Ensure(i_First, i_End);
    m_Counts.Ensure(i_First, i_End);
}

void VSummaryPyramid::Level::FreeBefore(std::int64_t i_Bin)
{
    m_Records.FreeBefore(i_Bin);
    m_Counts.FreeBefore(i_Bin);
}

VSummaryPyramid::VSummaryPyramid(std::uint32_t i_Components) : m_Components(i_Components) {}

VSummaryPyramid::Bins VSummaryPyramid::CompletedBins(std::uint32_t i_Level, std::int64_t i_From, std::int64_t i_To,
                                                     std::int64_t i_First, std::int64_t i_End)
{
    const std::uint32_t shift = i_Level + 1;
    return {std::max(i_From >> shift, CeilShift(i_First, shift)), std::min(CeilShift(i_To, shift), i_End >> shift)};
}

bool VSummaryPyramid::Covers(std::int64_t i_From, std::int64_t i_To, std::int64_t i_First, std::int64_t i_End) const
{
    for (std::uint32_t level = FirstLevel; level < LevelCount; ++level)
    {
        const Bins bins = CompletedBins(level, i_From, i_To, i_First, i_End);
        if (bins.First >= bins.End) // nor any above: a complete bin is made of complete bins
            return true;
        if (PlaceOf(level) >= m_Levels.size() || !m_Levels[PlaceOf(level)].Covers(bins.First, bins.End))
            return false;
    }
    return true;
}

void VSummaryPyramid::Ensure(std::int64_t i_From, std::int64_t i_To, std::int64_t i_First, std::int64_t i_End)
{
    for (std::uint32_t level = FirstLevel; level < LevelCount; ++level)
    {
        const Bins bins = CompletedBins(level, i_From, i_To, i_First, i_End);
        if (bins.First >= bins.End)
            return;
        while (PlaceOf(level) >= m_Levels.size())
            m_Levels.emplace_back(FirstLevel + static_cast<std::uint32_t>(m_Levels.size()), m_Components);
        m_Levels[PlaceOf(level)].Ensure(bins.First, bins.End);
    }
}

void VSummaryPyramid::Build(const VSampleRows& i_rRows, std::int64_t i_From, std::int64_t i_To, std::int64_t i_First,
                            std::int64_t i_End)
{
    for (std::uint32_t level = FirstLevel; level < LevelCount; ++level)
    {
        const Bins bins = CompletedBins(level, i_From, i_To, i_First, i_End);
        if (bins.First >= bins.End)
            return;
        BuildLevel(i_rRows, level, bins);
    }
}

void VSummaryPyramid::BuildLevel(const VSampleRows& i_rRows, std::uint32_t i_Level, Bins i_Bins)
{
    Level& rTarget = m_Levels[PlaceOf(i_Level)];
    while (i_Bins.First < i_Bins.End)
    {
        std::int64_t run = std::min(Level::RunLength(i_Bins.First), i_Bins.End - i_Bins.First);
        run = std::min(run, i_Level > FirstLevel ? Level::RunLength(2 * i_Bins.First) / 2
                                                 : i_rRows.RunLength(16 * i_Bins.First) / 16);
        const auto bins = static_cast<std::size_t>(run);
        if (i_Level == FirstLevel)
            SummariseSixteens(i_rRows.Row(16 * i_Bins.First), m_Components, bins, rTarget.Run(i_Bins.First));
        else
            CombinePairs(std::as_const(m_Levels[PlaceOf(i_Level) - 1]).Run(2 * i_Bins.First), i_Level, m_Components,
                         bins, rTarget.Run(i_Bins.First));
        i_Bins.First += run;
    }
}

bool VSummaryPyramid::CanFreeBefore(std::int64_t i_Row) const
{
    for (std::size_t place = 0; place < m_Levels.size(); ++place)
        if (m_Levels[place].CanFreeBefore(i_Row >> (FirstLevel + 1 + place)))
            return true;
    return false;
}

void VSummaryPyramid::FreeBefore(std::int64_t i_Row)
{
    for (std::size_t place = 0; place < m_Levels.size(); ++place)
        m_Levels[place].FreeBefore(i_Row >> (FirstLevel + 1 + place));
}

void VSummaryPyramid::Clear()
{
    m_Levels.clear();
}

void VSummaryPyramid::Read(std::uint32_t i_Level, std::int64_t i_First, std::int64_t i_End, LodRecord* o_pRecords) const
{
    const Level& rLevel = m_Levels[PlaceOf(i_Level)];
    while (i_First < i_End)
    {
        const std::int64_t run = std::min(Level::RunLength(i_First), i_End - i_First);
        const std::size_t count = static_cast<std::size_t>(run) * m_Components;
        Unpack(rLevel.Run(i_First), i_Level, count, o_pRecords);
        o_pRecords += count;
        i_First += run;
    }
}

void VSummaryPyramid::GatherBin(std::uint32_t i_Level, std::int64_t i_Bin, std::size_t i_Component,
                                std::span<Accumulator> o_Accumulators) const
{
    const ConstPackedRun run = m_Levels[PlaceOf(i_Level)].Run(i_Bin);
    for (std::size_t c = 0; c < o_Accumulators.size(); ++c)
    {
        const std::size_t record = i_Component + c;
        LodRecord unpacked;
        Unpack({run.pRecords + record, run.pCounts + record * CountBytesOf(i_Level)}, i_Level, 1, &unpacked);
        o_Accumulators[c].Add(unpacked);
    }
}

void VSummaryPyramid::Gather(const VSampleRows& i_rRows, std::int64_t i_From, std::int64_t i_To,
                             std::size_t i_Component, std::span<Accumulator> o_Accumulators) const
{
    const auto gatherRows = [&](std::int64_t i_First, std::int64_t i_End)
    {
        i_rRows.ForEachRun(
            i_First, i_End,
            [&](const float* i_pRows, std::int64_t, std::int64_t i_Count)
            { Reduce(i_pRows + i_Component, static_cast<std::size_t>(i_Count), m_Components, o_Accumulators); });
    };
    Bins bins{CeilShift(i_From, FirstLevel + 1), i_To >> (FirstLevel + 1)};
    if (bins.First >= bins.End)
        return gatherRows(i_From, i_To);
    gatherRows(i_From, bins.First << (FirstLevel + 1));
    gatherRows(bins.End << (FirstLevel + 1), i_To);
    for (std::uint32_t level = FirstLevel; bins.First < bins.End; ++level)
    {
        const bool bLast = level == LevelCount - 1;
        while (bins.First < bins.End && (bLast || (bins.First & 1) != 0))
            GatherBin(level, bins.First++, i_Component, o_Accumulators);
        if (bins.First < bins.End && (bins.End & 1) != 0)
            GatherBin(level, --bins.End, i_Component, o_Accumulators);
        bins = {bins.First >> 1, bins.End >> 1};
    }
}

std::size_t VSummaryPyramid::ByteCount() const
{
    std::size_t bytes = 0;
    for (const Level& rLevel : m_Levels)
        bytes += rLevel.ByteCount();
    return bytes;
}

} // namespace Channels
