#pragma once

#include "Channels/Samples/PackedRecords.h"
#include "Channels/Samples/Summary.h"
#include "Channels/Samples/VRowChunks.h"
#include "Channels/Samples/VSampleRows.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

namespace Channels
{

/// The summary records above the samples of a store. Level k has one record a component for 2^(k+1) rows, its bins
/// counted from row 0. The levels from 16 rows a bin on are kept, which costs two fifths of the memory of the samples;
/// those of fewer rows are made from the samples when they are read. Only bins whose rows all exist are kept, so a
/// record never changes once it is written; bins at the borders are gathered when they are read, from at most two
/// records of each level. Not thread-safe; the store guards it.
class VSummaryPyramid
{
public:
    static constexpr std::uint32_t LevelCount = 24;
    static constexpr std::uint32_t FirstLevel = 3; ///< the first that is kept; those below are made from the samples

    explicit VSummaryPyramid(std::uint32_t i_Components);

    /// Whether there is room for the records that rows [i_From, i_To) complete when [i_First, i_End) exist.
    bool Covers(std::int64_t i_From, std::int64_t i_To, std::int64_t i_First, std::int64_t i_End) const;
    void Ensure(std::int64_t i_From, std::int64_t i_To, std::int64_t i_First, std::int64_t i_End);

    /// Writes the records that the new rows [i_From, i_To) complete. Rows [i_First, i_End) exist, the new ones
    /// included.
    void Build(const VSampleRows& i_rRows, std::int64_t i_From, std::int64_t i_To, std::int64_t i_First,
               std::int64_t i_End);

    bool CanFreeBefore(std::int64_t i_Row) const;
    void FreeBefore(std::int64_t i_Row);
    void Clear();

    /// Complete bins [i_First, i_End) of a level from FirstLevel on.
    void Read(std::uint32_t i_Level, std::int64_t i_First, std::int64_t i_End, LodRecord* o_pRecords) const;

    /// Adds the existing rows [i_From, i_To) of components i_Component and on to the accumulators.
    void Gather(const VSampleRows& i_rRows, std::int64_t i_From, std::int64_t i_To, std::size_t i_Component,
                std::span<Accumulator> o_Accumulators) const;

    std::size_t ByteCount() const;

private:
    /// One level, in chunks of as many bins as a chunk of samples completes on the first.
    class Level
    {
    public:
        static constexpr std::int64_t ChunkBins = VSampleRows::Chunks::ChunkRows / 16;

        Level(std::uint32_t i_Level, std::size_t i_Components);

        bool Covers(std::int64_t i_First, std::int64_t i_End) const { return m_Records.Covers(i_First, i_End); }
        void Ensure(std::int64_t i_First, std::int64_t i_End);
        bool CanFreeBefore(std::int64_t i_Bin) const { return m_Records.CanFreeBefore(i_Bin); }
        void FreeBefore(std::int64_t i_Bin);
        /// The records of a bin; those of the next RunLength(bin) - 1 bins follow.
        PackedRun Run(std::int64_t i_Bin) { return {m_Records.Row(i_Bin), m_Counts.Row(i_Bin)}; }
        ConstPackedRun Run(std::int64_t i_Bin) const { return {m_Records.Row(i_Bin), m_Counts.Row(i_Bin)}; }
        static std::int64_t RunLength(std::int64_t i_Bin) { return ChunkBins - (i_Bin & (ChunkBins - 1)); }
        std::size_t ByteCount() const { return m_Records.ByteCount() + m_Counts.ByteCount(); }

    private:
        VRowChunks<PackedRecord, ChunkBins> m_Records;
        VRowChunks<std::uint8_t, ChunkBins> m_Counts; // CountBytesOf the level each
    };

    struct Bins
    {
        std::int64_t First;
        std::int64_t End;
    };
    static std::size_t PlaceOf(std::uint32_t i_Level) { return i_Level - FirstLevel; }
    static Bins CompletedBins(std::uint32_t i_Level, std::int64_t i_From, std::int64_t i_To, std::int64_t i_First,
                              std::int64_t i_End);
    void GatherBin(std::uint32_t i_Level, std::int64_t i_Bin, std::size_t i_Component,
                   std::span<Accumulator> o_Accumulators) const;
    void BuildLevel(const VSampleRows& i_rRows, std::uint32_t i_Level, Bins i_Bins);

    std::size_t m_Components;
    std::vector<Level> m_Levels; // those that have records, from FirstLevel on
};

} // namespace Channels
