#pragma once

#include "ChannelSystem/IChannelBlock.h"
#include "Channels/Samples/VSampleRows.h"
#include "Channels/Samples/VSummaryPyramid.h"

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <mutex>
#include <shared_mutex>
#include <span>
#include <vector>

namespace Channels
{

/// The samples of one channel on a fixed grid of ticks, rows x components, missing ones NaN, with summary levels once
/// somebody asked for them. Thread-safe: one writer at a time and any number of readers. Appending does not wait for
/// readers (it writes behind the end that they see and then moves the end); only a new chunk of memory, trimming by a
/// whole chunk, prepending and replacing do. What it costs to read does not depend on how much is held.
class VSampleStore : public ChannelSystem::IChannelStore
{
public:
    /// Samples stand at i_FirstTick + n x i_Period; the first one appended at i_FirstTick. i_Period and i_Components
    /// are above 0.
    VSampleStore(std::int64_t i_Period, std::int64_t i_FirstTick, std::uint32_t i_Components);

    std::int64_t Period() const { return m_Period; }
    std::int64_t GridOffset() const { return m_Offset; } ///< at least 0, below the period
    std::uint32_t Components() const { return m_Components; }

    // Writing. Rows are interleaved; i_Stride is the distance of rows in i_Values, 0 for rows that follow each other.
    void Append(std::span<const float> i_Values, std::size_t i_Stride = 0);
    void AppendMissing(std::int64_t i_Rows);
    /// Before the first row that is held.
    void Prepend(std::span<const float> i_Values);
    /// Forgets the samples before a tick. Memory is given back by the chunk of 1024 rows, fewer where rows are wide.
    void TrimBefore(std::int64_t i_Tick);
    /// New contents, new lease token. The tick is on the grid, else InvalidArgument.
    TQL::IResult ReplaceAll(std::int64_t i_FirstTick, std::span<const float> i_Values);
    /// The same with samples that i_pOwner keeps alive and nobody changes. An append copies them first.
    TQL::IResult ReplaceShared(std::int64_t i_FirstTick, std::shared_ptr<const void> i_pOwner,
                               std::span<const float> i_Values);
    /// A store without samples begins at another tick of its grid; the contents count as the same.
    void StartAt(std::int64_t i_Tick);
    /// Keeps the summary levels from now on, building them for what is held.
    void EnableSummaries();

    // Reading, from any thread. i_FloorTick hides what lies before it; the rules are those of IChannelBlock.
    TQL::TickRange GetRange() const;
    bool IsEmpty() const;
    TQL::IResult ReadSamples(const TQL::TickRange& i_rRange, std::span<float> o_Samples) const;
    TQL::IResult ReadComponent(const TQL::TickRange& i_rRange, std::span<float> o_Samples,
                               std::uint32_t i_Component) const;
    /// Levels above 0 need EnableSummaries.
    std::size_t ReadSummary(const TQL::TickRange& i_rRange, std::uint32_t i_Level, std::span<LodRecord> o_Records,
                            std::int64_t i_FloorTick) const;
    /// What exists of the range; InvalidArgument unless the span holds one record a component.
    TQL::IResult Summarise(const TQL::TickRange& i_rRange, std::span<LodRecord> o_Records,
                           std::int64_t i_FloorTick) const;

    /// Names the contents: unlike that of any other store and any other contents of this one.
    std::uint64_t GetToken() const { return m_Token.load(std::memory_order_acquire); }
    std::size_t ByteCount() const; ///< memory of its own

    // IChannelStore
    std::uint64_t AcquireLease(std::int64_t i_Tick) override;
    void ReleaseLease(std::uint64_t i_Token) override;

private:
    struct Rows
    {
        std::int64_t First;
        std::int64_t End;
    };

    std::int64_t RowAtOrAfter(std::int64_t i_Tick) const;
    std::int64_t TickOf(std::int64_t i_Row) const { return m_Offset + i_Row * m_Period; }
    bool IsOnGrid(std::int64_t i_Tick) const { return (i_Tick - m_Offset) % m_Period == 0; }
    bool FindRows(const TQL::TickRange& i_rRange, std::size_t i_RowWidth, std::size_t i_SpanSize, Rows& o_rRows) const;
    Rows HeldRows(std::int64_t i_FloorTick) const;
    void MakeRoom(std::int64_t i_From, std::int64_t i_To, std::int64_t i_First, std::int64_t i_End, bool i_bMissing);
    template <typename TWrite>
    void AppendRows(std::int64_t i_Rows, bool i_bMissing, const TWrite& i_rWrite);
    void GatherRows(std::int64_t i_From, std::int64_t i_To, std::span<LodRecord> o_Records) const;
    void ReadWholeBins(std::uint32_t i_Level, std::int64_t i_First, std::int64_t i_End, LodRecord* o_pRecords) const;
    void Reset(std::int64_t i_FirstRow);
    void BuildAll(std::int64_t i_End);
    static std::uint64_t NewToken();

    const std::int64_t m_Period;
    const std::int64_t m_Offset;
    const std::uint32_t m_Components;

    std::mutex m_WriterMutex;                    // held by every writing operation; taken before m_TableMutex
    mutable std::shared_mutex m_TableMutex;      // shared: reading; alone: the chunk tables change or the contents move
    VSampleRows m_Rows;                          // guarded by m_TableMutex, rows from m_End on by m_WriterMutex
    std::unique_ptr<VSummaryPyramid> m_pPyramid; // the same; null until the summaries are asked for
    std::atomic<std::int64_t> m_First;
    std::atomic<std::int64_t> m_End;
    std::atomic<std::uint64_t> m_Token;
};

} // namespace Channels
