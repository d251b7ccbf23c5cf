#pragma once

#include "ChannelSystem/LodRecord.h"

#include <cstdint>
#include <limits>
#include <span>
#include <vector>

namespace GraphPlotUI
{

/// One sample of one component as the trace shaders read it.
struct alignas(16) TraceTexel
{
    float Value = 0.0f;    ///< the sample, or the mean of what the row summarises
    float Maximum = 0.0f;  ///< -infinity where there are no data: the mark of a missing row
    float Minimum = 0.0f;  ///< +infinity where there are no data
    float Distance = 0.0f; ///< rows back to the last row with data; on a row with data above 1 means: a gap before it
};

static_assert(sizeof(TraceTexel) == 16);

/// Texture rows that have changed since they were last uploaded: [First, End), empty when both are equal.
struct DirtyRows
{
    std::uint32_t First = 0;
    std::uint32_t End = 0;

    bool IsEmpty() const { return First == End; }
};

/// Which rows a ring holds and which ticks they cover.
struct RingExtent
{
    std::uint32_t Start = 0;         ///< texture row of the first row, below the ring's size
    std::uint32_t RowCount = 0;      ///< at most 4096
    std::int64_t FirstTick = 0;      ///< of row 0, on the grid of the level
    std::int64_t EndTick = 0;        ///< exclusive; inside the last row while that row is incomplete
    std::int64_t ValidFirstTick = 0; ///< the part without a gap at its ends
    std::int64_t ValidEndTick = 0;
    std::int64_t HeadTick = 0; ///< what row 0 holds begins here: FirstTick, or where the block began inside that row

    friend bool operator==(const RingExtent&, const RingExtent&) = default;
};

/// What the rows are made from. A ring whose source has changed starts anew.
struct RingSource
{
    std::uint32_t ComponentCount = 0;
    std::uint32_t FormatTag = 0;
    std::int64_t SamplePeriod = 0; ///< ticks, at level 0
    std::uint64_t LeaseToken = 0;  ///< of the series behind the block
    std::uint8_t Level = 0;        ///< one row stands for 2^Level samples

    std::int64_t Stride() const { return SamplePeriod << Level; } ///< ticks of one row

    friend bool operator==(const RingSource&, const RingSource&) = default;
};

/// What is counted of one component while rows are written. Rows count from the first written one.
struct RingColumn
{
    static constexpr std::uint32_t NoRow = 0xffffffffu;

    float Distance = 1.0f;           ///< of the next row
    std::uint32_t FirstData = NoRow; ///< first row with data
    std::uint32_t LastGap = 0;       ///< last row that ends a gap, plus 1; 0 for none
    std::uint32_t LongestStep = 1;   ///< largest distance of a row with data to data that the ring holds
};

/// The gaps between rows with data of one component. Remembered until the last of them has left the ring.
struct RingGaps
{
    std::int64_t LastTick = std::numeric_limits<std::int64_t>::min(); ///< of the newest row that ends a gap
    std::uint32_t LongestStep = 1;                                    ///< rows from data to data
};

/// The plotted rows of one channel: a ring with one texel a component, in the memory layout of the float texture that
/// the shaders read (row-major, width = components, height = size). It grows to what the rows need, at most 4096 of
/// them. Rows are consecutive in time and join at either end only. Plain data: FillRing and the functions below are the
/// rules. Owned by the trace data provider, used under its mutex; knows nothing of OpenGL.
struct TraceTexelRing
{
    static constexpr std::uint32_t Capacity = 4096; ///< the most rows

    std::uint32_t Size = 0; ///< rows that there is room for: a power of two, 0 before the first row

    RingExtent Extent;
    RingSource Source;
    DirtyRows Dirty;
    DirtyRows
        DirtyHead; ///< of rows put before others: apart, so that both ends of a live ring can change at little cost
    std::vector<TraceTexel> Texels;
    std::vector<RingGaps> Gaps; ///< one a component

    std::vector<RingColumn> Columns; ///< one a component

    /// Texture row of the i-th row.
    std::uint32_t TextureRow(std::uint32_t i_Row) const { return (Extent.Start + i_Row) & (Size - 1); }
    std::int64_t RowTick(std::uint32_t i_Row) const
    {
        return Extent.FirstTick + static_cast<std::int64_t>(i_Row) * Source.Stride();
    }
    const TraceTexel& At(std::uint32_t i_Row, std::uint32_t i_Component) const
    {
        return Texels[std::size_t{TextureRow(i_Row)} * Source.ComponentCount + i_Component];
    }
    TraceTexel& At(std::uint32_t i_Row, std::uint32_t i_Component)
    {
        return Texels[std::size_t{TextureRow(i_Row)} * Source.ComponentCount + i_Component];
    }
};

/// Makes room for so many rows, at most 4096, without losing those that are held. Every row is dirty and the first
/// stands in texture row 0 when the ring had to grow.
void Reserve(TraceTexelRing& i_rRing, std::uint32_t i_Rows);

/// Writes rows x components of interleaved samples as rows i_RowOffset and following, for which there is room, and
/// counts them to the ring. Offset 0 puts them before the rows that the ring holds: the caller has moved the ring's
/// start and first tick back by as many rows. NaN and infinite samples are rows without data.
void WriteRows(TraceTexelRing& i_rRing, std::span<const float> i_Samples, std::uint32_t i_RowOffset);

/// The same with one summary record a row and component.
void WriteRows(TraceTexelRing& i_rRing, std::span<const ChannelSystem::LodRecord> i_Records, std::uint32_t i_RowOffset);

/// Adds texture rows [i_First, i_First + i_Count) to the dirty ones; a run that passes the end of a ring of i_Size rows
/// makes every row dirty. i_First is below i_Size.
void MarkDirty(DirtyRows& i_rDirty, std::uint32_t i_First, std::uint32_t i_Count, std::uint32_t i_Size);

/// Every row has to be uploaded, to a texture that has none.
void MarkAllDirty(TraceTexelRing& i_rRing);

/// The most rows that a line of the component may span, 1 where it has no gaps. May be too large, never too small.
std::uint32_t LongestStep(const TraceTexelRing& i_rRing, std::uint32_t i_Component);

} // namespace GraphPlotUI
