#include "GraphPlotSystem/Traces/TraceTexelRing.h"

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstring>
#include <type_traits>
#include <utility>

namespace GraphPlotUI
{

using ChannelSystem::LodRecord;

namespace
{

constexpr float Infinity = std::numeric_limits<float>::infinity();

using Floats = float __attribute__((vector_size(16)));
using Words = std::int32_t __attribute__((vector_size(16)));

constexpr Words ExponentBits = {0x7f800000, 0x7f800000, 0x7f800000, 0x7f800000};
constexpr Words ValueLanes = {-1, -1, -1, 0};
constexpr Words DistanceOne = {0, 0, 0, 0x3f800000};

Floats Load(const void* i_pFloats)
{
    Floats values;
    std::memcpy(&values, i_pFloats, sizeof(values));
    return values;
}

void Store(TraceTexel& o_rTexel, Floats i_Values)
{
    o_rTexel = std::bit_cast<TraceTexel>(i_Values);
}

/// Lanes that are NaN or infinite are all ones.
Words NotFinite(Floats i_Values)
{
    return (std::bit_cast<Words>(i_Values) & ExponentBits) == ExponentBits;
}

/// Value, maximum and minimum as they are, the distance 1.
void StoreNext(TraceTexel& o_rTexel, Floats i_Values)
{
    Store(o_rTexel, std::bit_cast<Floats>((std::bit_cast<Words>(i_Values) & ValueLanes) | DistanceOne));
}

template <int Lane>
Floats Broadcast(Floats i_Values)
{
    return Floats{i_Values[Lane], i_Values[Lane], i_Values[Lane], i_Values[Lane]};
}

/// NaN or infinite, without a call.
bool IsMissing(float i_Value)
{
    return (std::bit_cast<std::uint32_t>(i_Value) & 0x7f800000u) == 0x7f800000u;
}

bool IsMissing(const TraceTexel& i_rTexel)
{
    return IsMissing(i_rTexel.Maximum);
}

/// A record with the distance 1. Lane 1 of the result tells that it has no data.
Words StoreRecord(TraceTexel& o_rTexel, const LodRecord& i_rRecord)
{
    const Floats values = Load(&i_rRecord);
    StoreNext(o_rTexel, values);
    return NotFinite(values);
}

/// Writes texels as if each had data and followed one with data. False when one has none: see WriteGaps.
bool WriteGapless(TraceTexel* o_pTexels, const float* i_pSamples, std::size_t i_Count)
{
    Words missing = {};
    std::size_t i = 0;
    for (; i + 4 <= i_Count; i += 4)
    {
        const Floats samples = Load(i_pSamples + i);
        missing |= NotFinite(samples);
        StoreNext(o_pTexels[i], Broadcast<0>(samples));
        StoreNext(o_pTexels[i + 1], Broadcast<1>(samples));
        StoreNext(o_pTexels[i + 2], Broadcast<2>(samples));
        StoreNext(o_pTexels[i + 3], Broadcast<3>(samples));
    }
    bool bMissing = (missing[0] | missing[1] | missing[2] | missing[3]) != 0;
    for (; i < i_Count; ++i)
    {
        o_pTexels[i] = {i_pSamples[i], i_pSamples[i], i_pSamples[i], 1.0f};
        bMissing = IsMissing(i_pSamples[i]) || bMissing;
    }
    return !bMissing;
}

bool WriteGapless(TraceTexel* o_pTexels, const LodRecord* i_pRecords, std::size_t i_Count)
{
    Words missing = {};
    std::size_t i = 0;
    for (; i + 8 <= i_Count; i += 8) // by eight, so that the loop costs less than what it does
        for (std::size_t k = i; k < i + 8; ++k)
            missing |= StoreRecord(o_pTexels[k], i_pRecords[k]);
    for (; i < i_Count; ++i)
        missing |= StoreRecord(o_pTexels[i], i_pRecords[i]);
    return missing[1] == 0;
}

/// Source rows [FirstRow, EndRow) of all columns, for texture rows that follow each other.
template <typename TSource>
struct RowBlock
{
    TraceTexel* pTexels;
    const TSource* pSource;
    std::uint32_t FirstRow;
    std::uint32_t EndRow;
    std::uint32_t RowsBefore; ///< that the ring holds before source row 0
};

/// Gives a texel the marks of a row without data where it has none. True when it has data.
template <typename TSource>
bool MarkMissing(TraceTexel& i_rTexel)
{
    const bool bMissing = IsMissing(i_rTexel);
    if constexpr (std::is_same_v<TSource, float>) // a summary record comes with them
    {
        i_rTexel.Maximum = bMissing ? -Infinity : i_rTexel.Maximum;
        i_rTexel.Minimum = bMissing ? Infinity : i_rTexel.Minimum;
    }
    return !bMissing;
}

/// Goes over a block that was written as if it had no gaps, with what the columns count on the way.
template <typename TSource>
void WriteGaps(TraceTexelRing& i_rRing, const RowBlock<TSource>& i_rBlock)
{
    const std::size_t columns = i_rRing.Source.ComponentCount;
    const auto firstRow = static_cast<std::int32_t>(i_rBlock.FirstRow);
    const auto endRow = static_cast<std::int32_t>(i_rBlock.EndRow);
    const auto firstHeld = -static_cast<std::int32_t>(i_rBlock.RowsBefore);
    for (std::size_t c = 0; c < columns; ++c)
    {
        RingColumn& rColumn = i_rRing.Columns[c];
        std::int32_t lastData = firstRow - static_cast<std::int32_t>(rColumn.Distance);
        std::int32_t firstData = endRow;
        std::int32_t lastGap = 0;
        std::int32_t longest = 1;
        TraceTexel* pTexel = i_rBlock.pTexels + c;
        for (std::int32_t row = firstRow; row < endRow; ++row, pTexel += columns)
        {
            const std::int32_t distance = row - lastData;
            const bool bData = MarkMissing<TSource>(*pTexel);
            pTexel->Distance = static_cast<float>(distance);
            const std::int32_t step = bData && lastData >= firstHeld ? distance : 1;
            lastGap = step > 1 ? row + 1 : lastGap;
            longest = std::max(longest, step);
            lastData = bData ? row : lastData;
            firstData = std::min(firstData, bData ? row : endRow);
        }
        rColumn.Distance = static_cast<float>(endRow - lastData);
        if (firstData < endRow)
            rColumn.FirstData = std::min(rColumn.FirstData, static_cast<std::uint32_t>(firstData));
        if (lastGap != 0)
            rColumn.LastGap = static_cast<std::uint32_t>(lastGap);
        rColumn.LongestStep = std::max(rColumn.LongestStep, static_cast<std::uint32_t>(longest));
    }
}

/// The first row of a gapless block counts back over what came before; all after it hold 1.
template <typename TSource>
void CloseGapsBefore(TraceTexelRing& i_rRing, const RowBlock<TSource>& i_rBlock)
{
    for (std::size_t c = 0; c < i_rRing.Source.ComponentCount; ++c)
    {
        RingColumn& rColumn = i_rRing.Columns[c];
        i_rBlock.pTexels[c].Distance = rColumn.Distance;
        const auto distance = static_cast<std::uint32_t>(rColumn.Distance);
        if (distance > 1 && distance <= i_rBlock.RowsBefore + i_rBlock.FirstRow)
        {
            rColumn.LastGap = i_rBlock.FirstRow + 1;
            rColumn.LongestStep = std::max(rColumn.LongestStep, distance);
        }
        rColumn.FirstData = std::min(rColumn.FirstData, i_rBlock.FirstRow);
        rColumn.Distance = 1.0f;
    }
}

/// Rows of a block, to texture rows that do not pass the end of the ring. Goes by small blocks: most hold data
/// throughout and take no more than a copy with a check.
template <typename TSource>
void WriteRun(TraceTexelRing& i_rRing, RowBlock<TSource> i_Run)
{
    constexpr std::uint32_t blockRows = 8;
    const std::size_t columns = i_rRing.Source.ComponentCount;
    const std::uint32_t endRow = i_Run.EndRow;
    bool bAfterGapless = false;
    while (i_Run.FirstRow < endRow)
    {
        i_Run.EndRow = std::min(i_Run.FirstRow + blockRows, endRow);
        const std::size_t texels = (i_Run.EndRow - i_Run.FirstRow) * columns;
        const bool bGapless = WriteGapless(i_Run.pTexels, i_Run.pSource, texels);
        if (!bGapless)
            WriteGaps(i_rRing, i_Run);
        else if (!bAfterGapless)
            CloseGapsBefore(i_rRing, i_Run);
        bAfterGapless = bGapless;
        i_Run.pTexels += texels;
        i_Run.pSource += texels;
        i_Run.FirstRow = i_Run.EndRow;
    }
}

/// The distances at which the first new row stands, and room for what the rows will tell.
void PrepareColumns(TraceTexelRing& i_rRing, std::uint32_t i_RowOffset)
{
    const std::uint32_t columns = i_rRing.Source.ComponentCount;
    i_rRing.Columns.assign(columns, RingColumn{});
    if (i_RowOffset == 0)
        return;
    for (std::uint32_t c = 0; c < columns; ++c)
        if (const TraceTexel& rBefore = i_rRing.At(i_RowOffset - 1, c); IsMissing(rBefore))
            i_rRing.Columns[c].Distance = rBefore.Distance + 1.0f;
}

/// Remembers a step of more than one row that ends at i_Row. Older gaps are forgotten once they have all left.
void AddGap(TraceTexelRing& i_rRing, std::uint32_t i_Component, std::uint32_t i_Row, std::uint32_t i_LongestStep)
{
    RingGaps& rGaps = i_rRing.Gaps[i_Component];
    rGaps.LongestStep = std::max(LongestStep(i_rRing, i_Component), i_LongestStep);
    rGaps.LastTick = std::max(rGaps.LastTick, i_rRing.RowTick(i_Row));
}

/// The rows that follow prepended ones count back into these. Returns the first row that was not reached.
std::uint32_t RepairDistances(TraceTexelRing& i_rRing, std::uint32_t i_FirstRow)
{
    std::uint32_t reached = i_FirstRow;
    for (std::uint32_t c = 0; c < i_rRing.Source.ComponentCount; ++c)
    {
        float distance = i_rRing.Columns[c].Distance;
        for (std::uint32_t row = i_FirstRow; row < i_rRing.Extent.RowCount; ++row)
        {
            TraceTexel& rTexel = i_rRing.At(row, c);
            rTexel.Distance = distance;
            reached = std::max(reached, row + 1);
            if (!IsMissing(rTexel))
            {
                if (distance > 1.0f && distance <= static_cast<float>(row))
                    AddGap(i_rRing, c, row, static_cast<std::uint32_t>(distance));
                break;
            }
            distance += 1.0f;
        }
    }
    return reached;
}

/// Moves the ends of the part without outer gaps after i_Count rows were written at i_RowOffset.
void UpdateValidTicks(TraceTexelRing& i_rRing, std::uint32_t i_RowOffset, std::uint32_t i_Count, bool i_bWasEmpty)
{
    RingExtent& rExtent = i_rRing.Extent;
    const std::int64_t stride = i_rRing.Source.Stride();
    if (i_RowOffset == 0)
    {
        const float gap = std::ranges::max(i_rRing.Columns, {}, &RingColumn::Distance).Distance;
        if (gap < static_cast<float>(i_Count))
            rExtent.ValidEndTick =
                (std::int64_t{rExtent.RowCount} - static_cast<std::int64_t>(gap)) * stride + rExtent.FirstTick;
    }
    if (i_RowOffset > 0 || i_bWasEmpty)
    {
        const std::uint32_t first = std::ranges::max(i_rRing.Columns, {}, &RingColumn::FirstData).FirstData;
        if (first != RingColumn::NoRow)
            rExtent.ValidFirstTick = first * stride + rExtent.FirstTick;
    }
}

template <typename TSource>
void WriteSourceRows(TraceTexelRing& i_rRing, std::span<const TSource> i_Source, std::uint32_t i_RowOffset)
{
    const std::uint32_t columns = i_rRing.Source.ComponentCount;
    const auto count = static_cast<std::uint32_t>(i_Source.size() / columns);
    if (count == 0)
        return;
    const bool bWasEmpty = i_rRing.Extent.RowCount == 0;
    if (bWasEmpty)
        i_rRing.Gaps.assign(columns, RingGaps{});
    PrepareColumns(i_rRing, i_RowOffset);
    const std::uint32_t first = i_rRing.TextureRow(i_RowOffset);
    const std::uint32_t untilWrap = std::min(count, i_rRing.Size - first);
    TraceTexel* const pTexels = i_rRing.Texels.data();
    WriteRun<TSource>(i_rRing, {pTexels + std::size_t{first} * columns, i_Source.data(), 0, untilWrap, i_RowOffset});
    WriteRun<TSource>(i_rRing,
                      {pTexels, i_Source.data() + std::size_t{untilWrap} * columns, untilWrap, count, i_RowOffset});
    for (std::uint32_t c = 0; c < columns; ++c)
        if (const RingColumn& rColumn = i_rRing.Columns[c]; rColumn.LastGap != 0)
            AddGap(i_rRing, c, i_RowOffset + rColumn.LastGap - 1, rColumn.LongestStep);

    i_rRing.Extent.RowCount += count;
    UpdateValidTicks(i_rRing, i_RowOffset, count, bWasEmpty);
    if (i_RowOffset == 0 && !bWasEmpty)
        MarkDirty(i_rRing.DirtyHead, first, RepairDistances(i_rRing, count), i_rRing.Size);
    else
        MarkDirty(i_rRing.Dirty, first, count, i_rRing.Size);
}

} // namespace

void Reserve(TraceTexelRing& i_rRing, std::uint32_t i_Rows)
{
    constexpr std::uint32_t smallest = 16;
    const std::size_t columns = i_rRing.Source.ComponentCount;
    const bool bFits = i_rRing.Texels.size() == i_rRing.Size * columns;
    if (bFits && i_Rows <= i_rRing.Size)
        return;
    const std::uint32_t size = std::bit_ceil(std::max(i_Rows, smallest));
    std::vector<TraceTexel> texels(size * columns);
    if (const std::uint32_t rows = bFits ? i_rRing.Extent.RowCount : 0; rows > 0)
    {
        const std::uint32_t untilWrap = std::min(rows, i_rRing.Size - i_rRing.Extent.Start);
        const auto from = i_rRing.Texels.begin() + static_cast<std::ptrdiff_t>(i_rRing.Extent.Start * columns);
        const auto wrapped = std::copy_n(from, untilWrap * columns, texels.begin());
        std::copy_n(i_rRing.Texels.begin(), (rows - untilWrap) * columns, wrapped);
    }
    i_rRing.Texels = std::move(texels);
    i_rRing.Size = size;
    i_rRing.Extent.Start = 0;
    MarkAllDirty(i_rRing);
}

void WriteRows(TraceTexelRing& i_rRing, std::span<const float> i_Samples, std::uint32_t i_RowOffset)
{
    WriteSourceRows(i_rRing, i_Samples, i_RowOffset);
}

void WriteRows(TraceTexelRing& i_rRing, std::span<const LodRecord> i_Records, std::uint32_t i_RowOffset)
{
    WriteSourceRows(i_rRing, i_Records, i_RowOffset);
}

void MarkDirty(DirtyRows& i_rDirty, std::uint32_t i_First, std::uint32_t i_Count, std::uint32_t i_Size)
{
    DirtyRows added{i_First, i_First + i_Count};
    if (i_Count == 0)
        return;
    if (added.End > i_Size)
        added = {0, i_Size};
    i_rDirty = i_rDirty.IsEmpty() ? added
                                  : DirtyRows{std::min(i_rDirty.First, added.First), std::max(i_rDirty.End, added.End)};
}

void MarkAllDirty(TraceTexelRing& i_rRing)
{
    i_rRing.Dirty = {0, i_rRing.Size};
    i_rRing.DirtyHead = {};
}

std::uint32_t LongestStep(const TraceTexelRing& i_rRing, std::uint32_t i_Component)
{
    const RingGaps& rGaps = i_rRing.Gaps[i_Component];
    return rGaps.LastTick >= i_rRing.Extent.FirstTick ? rGaps.LongestStep : 1;
}

} // namespace GraphPlotUI
