#include "Channels/VSummaryPyramid.h"

#include <algorithm>

namespace Channels
{

namespace
{

std::int64_t CeilShift(std::int64_t i_Value, std::uint32_t i_Shift)
{
    return (i_Value + (std::int64_t{1} << i_Shift) - 1) >> i_Shift;
}

} // namespace

VSummaryPyramid::VSummaryPyramid(std::uint32_t i_Components) : m_Components(i_Components) {}

VSummaryPyramid::Bins VSummaryPyramid::CompletedBins(std::uint32_t i_Level, std::int64_t i_From, std::int64_t i_To,
                                                     std::int64_t i_First, std::int64_t i_End)
{
    const std::uint32_t shift = i_Level + 1;
    return {std::max(i_From >> shift, CeilShift(i_First, shift)), std::min(CeilShift(i_To, shift), i_End >> shift)};
}

bool VSummaryPyramid::Covers(std::int64_t i_From, std::int64_t i_To, std::int64_t i_First, std::int64_t i_End) const
{
    for (std::uint32_t level = FirstLevel; level < LevelCount; level += 2)
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
    for (std::uint32_t level = FirstLevel; level < LevelCount; level += 2)
    {
        const Bins bins = CompletedBins(level, i_From, i_To, i_First, i_End);
        if (bins.First >= bins.End)
            return;
        while (PlaceOf(level) >= m_Levels.size())
            m_Levels.emplace_back(m_Components);
        m_Levels[PlaceOf(level)].Ensure(bins.First, bins.End);
    }
}

void VSummaryPyramid::Build(const VSampleRows& i_rRows, std::int64_t i_From, std::int64_t i_To, std::int64_t i_First,
                            std::int64_t i_End)
{
    for (std::uint32_t level = FirstLevel; level < LevelCount; level += 2)
    {
        const Bins bins = CompletedBins(level, i_From, i_To, i_First, i_End);
        if (bins.First >= bins.End)
            return;
        BuildLevel(i_rRows, level, bins);
    }
}

void VSummaryPyramid::BuildLevel(const VSampleRows& i_rRows, std::uint32_t i_Level, Bins i_Bins)
{
    Chunks& rTarget = m_Levels[PlaceOf(i_Level)];
    while (i_Bins.First < i_Bins.End)
    {
        std::int64_t run = std::min(Chunks::RunLength(i_Bins.First), i_Bins.End - i_Bins.First);
        if (i_Level > FirstLevel)
            run = std::min(run, Chunks::RunLength(4 * i_Bins.First) / 4);
        const auto records = static_cast<std::size_t>(run);
        PackedRecord* pTarget = rTarget.Row(i_Bins.First);
        if (i_Level == FirstLevel)
            SummariseSixteens(i_rRows.Row(16 * i_Bins.First), m_Components, records, pTarget);
        else
            CombineFours(m_Levels[PlaceOf(i_Level) - 1].Row(4 * i_Bins.First), m_Components, records, pTarget);
        i_Bins.First += run;
    }
}

bool VSummaryPyramid::CanFreeBefore(std::int64_t i_Row) const
{
    for (std::size_t place = 0; place < m_Levels.size(); ++place)
        if (m_Levels[place].CanFreeBefore(i_Row >> (FirstLevel + 1 + 2 * place)))
            return true;
    return false;
}

void VSummaryPyramid::FreeBefore(std::int64_t i_Row)
{
    for (std::size_t place = 0; place < m_Levels.size(); ++place)
        m_Levels[place].FreeBefore(i_Row >> (FirstLevel + 1 + 2 * place));
}

void VSummaryPyramid::Clear()
{
    m_Levels.clear();
}

void VSummaryPyramid::Read(std::uint32_t i_Level, std::int64_t i_First, std::int64_t i_End, LodRecord* o_pRecords) const
{
    const std::int64_t share = (i_Level - FirstLevel) % 2 == 0 ? 1 : 2; // kept records a bin
    const Chunks& rLevel = m_Levels[PlaceOf(i_Level)];
    while (i_First < i_End)
    {
        const std::int64_t run = std::min(Chunks::RunLength(share * i_First) / share, i_End - i_First);
        const std::size_t count = static_cast<std::size_t>(run) * m_Components;
        const PackedRecord* pRecords = rLevel.Row(share * i_First);
        if (share == 1)
            Unpack(pRecords, count, o_pRecords);
        else
            CombinePairs(pRecords, m_Components, static_cast<std::size_t>(run), o_pRecords);
        o_pRecords += count;
        i_First += run;
    }
}

void VSummaryPyramid::GatherBin(std::size_t i_Place, std::int64_t i_Bin, std::size_t i_Component,
                                std::span<Accumulator> o_Accumulators) const
{
    const PackedRecord* pRecords = m_Levels[i_Place].Row(i_Bin) + i_Component;
    for (std::size_t c = 0; c < o_Accumulators.size(); ++c)
        o_Accumulators[c].Add(pRecords[c]);
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
    for (std::size_t place = 0; bins.First < bins.End; ++place)
    {
        const bool bLast = place == PlaceOf(LevelCount - 1);
        while (bins.First < bins.End && (bLast || (bins.First & 3) != 0))
            GatherBin(place, bins.First++, i_Component, o_Accumulators);
        while (bins.First < bins.End && (bins.End & 3) != 0)
            GatherBin(place, --bins.End, i_Component, o_Accumulators);
        bins = {bins.First >> 2, bins.End >> 2};
    }
}

std::size_t VSummaryPyramid::ByteCount() const
{
    std::size_t bytes = 0;
    for (const Chunks& rLevel : m_Levels)
        bytes += rLevel.ByteCount();
    return bytes;
}

} // namespace Channels
