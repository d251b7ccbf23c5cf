#include "GraphPlotSystem/Traces/TraceRingFill.h"

#include "ChannelSystem/IChannelBlock.h"

#include <algorithm>
#include <memory>
#include <span>
#include <utility>
#include <vector>

namespace GraphPlotUI
{

using ChannelSystem::IChannelBlock;
using TQL::AlignDown;
using TQL::AlignUp;
using TQL::TickRange;

namespace
{

constexpr std::int64_t Capacity = TraceTexelRing::Capacity;

/// Summary records are read and written by pieces that stay in the nearest cache between the two.
constexpr std::int64_t PieceRows = 256;

/// Holds a lease on the series behind a block while it is read.
class StoreLease
{
public:
    StoreLease(std::shared_ptr<ChannelSystem::IChannelStore> i_pStore, std::int64_t i_Tick)
        : m_pStore(std::move(i_pStore)), m_Token(m_pStore ? m_pStore->AcquireLease(i_Tick) : 0)
    {
    }
    ~StoreLease()
    {
        if (m_pStore)
            m_pStore->ReleaseLease(m_Token);
    }
    StoreLease(const StoreLease&) = delete;
    StoreLease& operator=(const StoreLease&) = delete;

    std::uint64_t Token() const { return m_Token; }

private:
    std::shared_ptr<ChannelSystem::IChannelStore> m_pStore;
    std::uint64_t m_Token;
};

/// No rows yet, the first to come at i_Tick.
RingExtent EmptyAt(std::int64_t i_Tick)
{
    return {0, 0, i_Tick, i_Tick, i_Tick, i_Tick, i_Tick};
}

TickRange Intersect(const TickRange& i_rA, const TickRange& i_rB)
{
    return {std::max(i_rA.First, i_rB.First), std::min(i_rA.Last, i_rB.Last)};
}

/// One fill: what the ring is brought to, and from what.
struct FillJob
{
    const IChannelBlock& rBlock;
    RingScratch& rScratch;
    TickRange Allowed; ///< what the block has and the limit allows
    TickRange Wanted;  ///< the request inside that
    TickRange Block;   ///< what the block has
    std::int64_t GridOffset;
    std::int64_t Stride;

    std::int64_t RowsOf(std::int64_t i_First, std::int64_t i_Last) const
    {
        return (i_Last - i_First - 1 + Stride) / Stride;
    }

    /// Where what the block has of the first row begins.
    std::int64_t HeadOf(const RingExtent& i_rExtent) const { return std::max(i_rExtent.FirstTick, Block.First); }
};

/// Room for so many values in a scratch that keeps its size: what is read next overwrites it.
template <typename T>
std::span<T> Room(std::vector<T>& i_rScratch, std::size_t i_Values)
{
    if (i_rScratch.size() < i_Values)
        i_rScratch.resize(i_Values);
    return std::span(i_rScratch).first(i_Values);
}

/// Reads the rows of a range into the scratch of its level. False when the block gives less.
bool ReadRows(TraceTexelRing& i_rRing, const FillJob& i_rJob, const TickRange& i_rRange)
{
    const RingSource& rSource = i_rRing.Source;
    const std::size_t values =
        static_cast<std::size_t>(i_rJob.RowsOf(i_rRange.First, i_rRange.Last)) * rSource.ComponentCount;
    if (rSource.Level == 0)
        return i_rJob.rBlock.ReadSamples(i_rRange, Room(i_rJob.rScratch.Samples, values)).IsSuccess();
    return i_rJob.rBlock.ReadSummary(i_rRange, rSource.Level - 1u, Room(i_rJob.rScratch.Records, values)) >= values;
}

/// Moves the first row by so many texture rows.
void MoveStart(TraceTexelRing& i_rRing, std::int64_t i_Rows)
{
    i_rRing.Extent.Start = (i_rRing.Extent.Start + static_cast<std::uint32_t>(i_Rows)) & (i_rRing.Size - 1);
}

/// Writes the rows that were read last, for which there is room.
void WriteReadRows(TraceTexelRing& i_rRing, const FillJob& i_rJob, std::int64_t i_Rows, std::int64_t i_RowOffset)
{
    const auto values = static_cast<std::size_t>(i_Rows) * i_rRing.Source.ComponentCount;
    const auto offset = static_cast<std::uint32_t>(i_RowOffset);
    if (i_rRing.Source.Level == 0)
        WriteRows(i_rRing, std::span<const float>(i_rJob.rScratch.Samples).first(values), offset);
    else
        WriteRows(i_rRing, std::span<const ChannelSystem::LodRecord>(i_rJob.rScratch.Records).first(values), offset);
}

/// Drops the rows at either end that the block no longer has or the limit forbids.
void TrimRing(TraceTexelRing& i_rRing, const FillJob& i_rJob)
{
    RingExtent& rExtent = i_rRing.Extent;
    const std::int64_t stride = i_rJob.Stride;
    const std::int64_t first = AlignDown(i_rJob.Allowed.First, stride, i_rJob.GridOffset);
    if (rExtent.FirstTick < first)
    {
        const std::int64_t dropped = std::min((first - rExtent.FirstTick) / stride, std::int64_t{rExtent.RowCount});
        MoveStart(i_rRing, dropped);
        rExtent.RowCount -= static_cast<std::uint32_t>(dropped);
        rExtent.FirstTick += dropped * stride;
        rExtent.HeadTick = rExtent.FirstTick;
        rExtent.ValidFirstTick = rExtent.FirstTick;
        rExtent.EndTick = std::max(rExtent.EndTick, rExtent.FirstTick);
    }
    // A row that summarises ticks which the block has lost goes with them; a whole row across the limit stays.
    const std::int64_t last =
        i_rJob.Block.Last < rExtent.EndTick
            ? AlignDown(std::min(i_rJob.Block.Last, i_rJob.Allowed.Last), stride, i_rJob.GridOffset)
            : AlignUp(i_rJob.Allowed.Last, stride, i_rJob.GridOffset);
    if (rExtent.EndTick > last)
    {
        const std::int64_t kept = std::max(std::int64_t{0}, (last - rExtent.FirstTick) / stride);
        rExtent.RowCount = static_cast<std::uint32_t>(std::min(kept, std::int64_t{rExtent.RowCount}));
        rExtent.EndTick = rExtent.FirstTick + rExtent.RowCount * stride;
        rExtent.ValidEndTick = rExtent.EndTick;
    }
}

/// Drops a first row that summarises other samples than the block has of it now: the block began inside that row and
/// has got older samples since, or has lost some of them. Where the request reaches that far it is read again. False
/// when no row is left.
bool DropChangedHead(TraceTexelRing& i_rRing, const FillJob& i_rJob)
{
    RingExtent& rExtent = i_rRing.Extent;
    if (rExtent.RowCount == 0 || rExtent.HeadTick == i_rJob.HeadOf(rExtent))
        return true;
    MoveStart(i_rRing, 1);
    --rExtent.RowCount;
    rExtent.FirstTick += i_rJob.Stride;
    return rExtent.RowCount > 0;
}

enum class EFill
{
    Nothing, ///< the ring has it all
    Done,
    NothingRead, ///< a failed read, the ring is as it was
    PartRead     ///< a failed read behind rows that are there now
};

/// The rows before the ring's first.
EFill Prepend(TraceTexelRing& i_rRing, const FillJob& i_rJob)
{
    RingExtent& rExtent = i_rRing.Extent;
    const std::int64_t stride = i_rJob.Stride;
    const bool bSummary = i_rRing.Source.Level > 0;
    const std::int64_t wanted =
        bSummary ? AlignDown(i_rJob.Wanted.First, stride, i_rJob.GridOffset) : i_rJob.Wanted.First;
    // Rows that the newest 4096 would push out again are not worth their reading.
    const std::int64_t last = bSummary ? AlignUp(i_rJob.Wanted.Last, stride, i_rJob.GridOffset) : i_rJob.Wanted.Last;
    const std::int64_t first = std::max(wanted, last - Capacity * stride);
    if (first >= rExtent.FirstTick)
        return EFill::Nothing;
    if (!ReadRows(i_rRing, i_rJob, {first, rExtent.FirstTick}))
        return EFill::NothingRead;
    const std::int64_t rows = i_rJob.RowsOf(first, rExtent.FirstTick);
    if (rows >= Capacity)
    {
        rExtent = EmptyAt(first);
        rExtent.EndTick = first + Capacity * stride;
    }
    else if (rExtent.RowCount + rows > Capacity)
    {
        rExtent.RowCount = static_cast<std::uint32_t>(Capacity - rows);
        rExtent.EndTick = rExtent.FirstTick + rExtent.RowCount * stride;
        rExtent.ValidEndTick = std::min(rExtent.ValidEndTick, rExtent.EndTick);
    }
    Reserve(i_rRing, rExtent.RowCount + static_cast<std::uint32_t>(rows));
    MoveStart(i_rRing, -rows);
    rExtent.FirstTick = first;
    WriteReadRows(i_rRing, i_rJob, rows, 0);
    return EFill::Done;
}

/// The next rows after the ring's last, from that row on where it is incomplete, at most i_MostRows of them. False when
/// they could not be read, which leaves the ring as it was.
bool AppendPiece(TraceTexelRing& i_rRing, const FillJob& i_rJob, std::int64_t i_MostRows)
{
    RingExtent& rExtent = i_rRing.Extent;
    const std::int64_t stride = i_rJob.Stride;
    const std::int64_t first =
        i_rRing.Source.Level > 0 ? AlignDown(rExtent.EndTick, stride, i_rJob.GridOffset) : rExtent.EndTick;
    const std::int64_t rowsToCome = i_rJob.RowsOf(first, i_rJob.Wanted.Last);
    const std::int64_t rows = std::min(rowsToCome, i_MostRows);
    const std::int64_t last = std::min(i_rJob.Wanted.Last, first + rows * stride);
    if (!ReadRows(i_rRing, i_rJob, {first, last}))
        return false;
    if (rows >= Capacity)
        rExtent = EmptyAt(first);
    if (rExtent.RowCount == 0)
        rExtent.FirstTick = first;
    else if (rExtent.EndTick < rExtent.FirstTick + rExtent.RowCount * stride)
        --rExtent.RowCount;
    Reserve(i_rRing, static_cast<std::uint32_t>(std::min(rExtent.RowCount + rowsToCome, Capacity)));
    const std::int64_t overflow = rExtent.RowCount + rows - Capacity;
    if (overflow > 0)
    {
        MoveStart(i_rRing, overflow);
        rExtent.RowCount -= static_cast<std::uint32_t>(overflow);
        rExtent.FirstTick += overflow * stride;
        rExtent.ValidFirstTick = std::max(rExtent.ValidFirstTick, rExtent.FirstTick);
    }
    rExtent.EndTick = last;
    WriteReadRows(i_rRing, i_rJob, rows, rExtent.RowCount);
    return true;
}

/// The rows after the ring's last, at most 4096 of them.
EFill Append(TraceTexelRing& i_rRing, const FillJob& i_rJob)
{
    const std::int64_t piece = i_rRing.Source.Level > 0 ? PieceRows : Capacity;
    for (std::int64_t read = 0; read < Capacity && i_rRing.Extent.EndTick < i_rJob.Wanted.Last; read += piece)
        if (!AppendPiece(i_rRing, i_rJob, piece))
            return read == 0 ? EFill::NothingRead : EFill::PartRead;
    return EFill::Done;
}

/// Whether the rows held can be kept for the job.
bool IsContinued(const TraceTexelRing& i_rRing, const RingSource& i_rSource, const FillJob& i_rJob)
{
    const RingExtent& rExtent = i_rRing.Extent;
    return rExtent.RowCount > 0 && i_rRing.Source == i_rSource && i_rJob.Wanted.First <= rExtent.EndTick &&
           i_rJob.Wanted.Last >= rExtent.FirstTick;
}

EFill StartAnew(TraceTexelRing& i_rRing, const RingSource& i_rSource, const FillJob& i_rJob)
{
    i_rRing.Source = i_rSource;
    i_rRing.Extent = EmptyAt(i_rJob.Wanted.First);
    return Append(i_rRing, i_rJob);
}

EFill GoOn(TraceTexelRing& i_rRing, const FillJob& i_rJob)
{
    TrimRing(i_rRing, i_rJob);
    if (!DropChangedHead(i_rRing, i_rJob))
        return StartAnew(i_rRing, i_rRing.Source, i_rJob);
    const EFill prepended = Prepend(i_rRing, i_rJob);
    if (prepended == EFill::NothingRead)
        return prepended;
    const EFill appended = Append(i_rRing, i_rJob);
    return appended == EFill::NothingRead && prepended == EFill::Done ? EFill::PartRead : appended;
}

} // namespace

bool FillRing(TraceTexelRing& i_rRing, RingScratch& i_rScratch, const IChannelBlock& i_rBlock,
              const TickRange& i_rAvailable, const TickRange& i_rRequested, const TickRange& i_rLimit,
              std::uint8_t i_Level)
{
    const ChannelSystem::ChannelBlockShape& rShape = i_rBlock.GetShape();
    if (rShape.SamplePeriod <= 0 || !rShape.pLayout || rShape.pLayout->ComponentCount == 0)
        return false;
    const TickRange allowed = Intersect(i_rAvailable, i_rLimit);
    const TickRange wanted = Intersect(i_rRequested, allowed);
    if (wanted.First >= wanted.Last || i_Level > rShape.SummaryPeriods.size())
        return false;

    const StoreLease lease(i_rBlock.GetStore(), allowed.First);
    const RingSource source = {rShape.pLayout->ComponentCount, rShape.FormatTag, rShape.SamplePeriod, lease.Token(),
                               i_Level};
    const FillJob job = {i_rBlock, i_rScratch, allowed, wanted, i_rAvailable, rShape.GridOffset, source.Stride()};
    const RingExtent extentBefore = i_rRing.Extent;
    const RingSource sourceBefore = i_rRing.Source;
    const EFill filled = IsContinued(i_rRing, source, job) ? GoOn(i_rRing, job) : StartAnew(i_rRing, source, job);
    if (filled == EFill::NothingRead)
    {
        i_rRing.Source = sourceBefore;
        i_rRing.Extent = extentBefore;
        return false;
    }
    i_rRing.Extent.HeadTick = job.HeadOf(i_rRing.Extent);
    return filled == EFill::Done;
}

void UpdateRing(TraceTexelRing& i_rRing, RingScratch& i_rScratch, const IChannelBlock& i_rBlock,
                const TickRange& i_rAvailable, const TickRange& i_rRequested, const TickRange& i_rLimit,
                std::uint8_t i_Level)
{
    if (!FillRing(i_rRing, i_rScratch, i_rBlock, i_rAvailable, i_rRequested, i_rLimit, i_Level))
        return;
    const RingExtent& rExtent = i_rRing.Extent;
    const bool bLow = i_rRequested.First < rExtent.ValidFirstTick;
    const bool bHigh = i_rRequested.Last > rExtent.ValidEndTick;
    const std::int64_t free = Capacity - rExtent.RowCount;
    if ((!bLow && !bHigh) || free == 0)
        return;
    const std::int64_t extra = i_rRing.Source.Stride() * (bLow && bHigh ? free / 2 : free);
    const std::int64_t validFirst = std::clamp(rExtent.ValidFirstTick, rExtent.FirstTick, rExtent.EndTick);
    const std::int64_t validLast = std::clamp(rExtent.ValidEndTick, validFirst, rExtent.EndTick);
    const TickRange widened = {validFirst - (bLow ? extra : 0), validLast + (bHigh ? extra : 0)};
    // Mostly there is nothing more to have, which a glance tells without another lease.
    const TickRange wanted = Intersect(Intersect(widened, i_rLimit), i_rAvailable);
    if (wanted.First < rExtent.FirstTick || wanted.Last > rExtent.EndTick)
        (void)FillRing(i_rRing, i_rScratch, i_rBlock, i_rAvailable, widened, i_rLimit, i_Level);
}

} // namespace GraphPlotUI
