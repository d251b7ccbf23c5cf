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
    for (std::uint32_t level = 1; level < LevelCount; ++level)
    {
        const Bins bins = CompletedBins(level, i_From, i_To, i_First, i_End);
        if (bins.First >= bins.End) // nor any above: a complete bin is made of complete bins
            return true;
        if (level >= m_Levels.size() || !m_Levels[level].Covers(bins.First, bins.End))
            return false;
    }
    return true;
}

void VSummaryPyramid::Ensure(std::int64_t i_From, std::int64_t i_To, std::int64_t i_First, std::int64_t i_End)
{
    for (std::uint32_t level = 1; level < LevelCount; ++level)
    {
        const Bins bins = CompletedBins(level, i_From, i_To, i_First, i_End);
        if (bins.First >= bins.End)
            return;
        while (level >= m_Levels.size())
            m_Levels.emplace_back(m_Components);
        m_Levels[level].Ensure(bins.First, bins.End);
    }
}

void VSummaryPyramid::Build(const VSampleRows& i_rRows, std::int64_t i_From, std::int64_t i_To, std::int64_t i_First,
                            std::int64_t i_End)
{
    for (std::uint32_t level = 1; level < LevelCount; ++level)
    {
        const Bins bins = CompletedBins(level, i_From, i_To, i_First, i_End);
        if (bins.First >= bins.End)
            return;
        BuildLevel(i_rRows, level, bins);
    }
}

void VSummaryPyramid::BuildLevel(const VSampleRows& i_rRows, std::uint32_t i_Level, Bins i_Bins)
{
    Chunks& rTarget = m_Levels[i_Level];
    while (i_Bins.First < i_Bins.End)
    {
        std::int64_t run = std::min(Chunks::RunLength(i_Bins.First), i_Bins.End - i_Bins.First);
        if (i_Level > 1)
            run = std::min(run, Chunks::RunLength(2 * i_Bins.First) / 2);
        const auto records = static_cast<std::size_t>(run);
        PackedRecord* pTarget = rTarget.Row(i_Bins.First);
        if (i_Level == 1)
            SummariseFours(i_rRows.Row(4 * i_Bins.First), m_Components, records, pTarget);
        else
            CombinePairs(m_Levels[i_Level - 1].Row(2 * i_Bins.First), m_Components, records, pTarget);
        i_Bins.First += run;
    }
}

bool VSummaryPyramid::CanFreeBefore(std::int64_t i_Row) const
{
    for (std::uint32_t level = 1; level < m_Levels.size(); ++level)
        if (m_Levels[level].CanFreeBefore(i_Row >> (level + 1)))
            return true;
    return false;
}

void VSummaryPyramid::FreeBefore(std::int64_t i_Row)
{
    for (std::uint32_t level = 1; level < m_Levels.size(); ++level)
        m_Levels[level].FreeBefore(i_Row >> (level + 1));
}

void VSummaryPyramid::Clear()
{
    m_Levels.clear();
}

void VSummaryPyramid::Read(std::uint32_t i_Level, std::int64_t i_First, std::int64_t i_End, LodRecord* o_pRecords) const
{
    while (i_First < i_End)
    {
        const std::int64_t run = std::min(Chunks::RunLength(i_First), i_End - i_First);
        const std::size_t count = static_cast<std::size_t>(run) * m_Components;
        Unpack(m_Levels[i_Level].Row(i_First), count, o_pRecords);
        o_pRecords += count;
        i_First += run;
    }
}

void VSummaryPyramid::GatherBin(std::uint32_t i_Level, std::int64_t i_Bin, std::size_t i_Component,
                                std::span<Accumulator> o_Accumulators) const
{
    const PackedRecord* pRecords = m_Levels[i_Level].Row(i_Bin) + i_Component;
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
    Bins bins{CeilShift(i_From, 2), i_To >> 2};
    if (bins.First >= bins.End)
        return gatherRows(i_From, i_To);
    gatherRows(i_From, 4 * bins.First);
    gatherRows(4 * bins.End, i_To);
    for (std::uint32_t level = 1; bins.First < bins.End; ++level)
    {
        if (level + 1 == LevelCount)
        {
            for (; bins.First < bins.End; ++bins.First)
                GatherBin(level, bins.First, i_Component, o_Accumulators);
            return;
        }
        if ((bins.First & 1) != 0)
            GatherBin(level, bins.First++, i_Component, o_Accumulators);
        if ((bins.End & 1) != 0)
            GatherBin(level, --bins.End, i_Component, o_Accumulators);
        bins = {bins.First >> 1, bins.End >> 1};
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
