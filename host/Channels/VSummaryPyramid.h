#pragma once

#include "Channels/Summary.h"
#include "Channels/VRowChunks.h"
#include "Channels/VSampleRows.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

namespace Channels
{

/// The summary records above the samples of a store. Level k has one record a component for 2^(k+1) rows, its bins
/// counted from row 0. Only bins whose rows all exist are kept, so a record never changes once it is written; bins at
/// the borders are gathered when they are read, from at most two records of each level. Level 0 is not kept either: it
/// is as quick to make from the samples. Appending costs one record a sample on the whole. Not thread-safe; the store
/// guards it.
class VSummaryPyramid
{
public:
    static constexpr std::uint32_t LevelCount = 24;

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

    /// Complete bins [i_First, i_End) of a level above 0.
    void Read(std::uint32_t i_Level, std::int64_t i_First, std::int64_t i_End, LodRecord* o_pRecords) const;

    /// Adds the existing rows [i_From, i_To) of components i_Component and on to the accumulators.
    void Gather(const VSampleRows& i_rRows, std::int64_t i_From, std::int64_t i_To, std::size_t i_Component,
                std::span<Accumulator> o_Accumulators) const;

    std::size_t ByteCount() const;

private:
    using Chunks = VRowChunks<PackedRecord, 128>;

    struct Bins
    {
        std::int64_t First;
        std::int64_t End;
    };
    static Bins CompletedBins(std::uint32_t i_Level, std::int64_t i_From, std::int64_t i_To, std::int64_t i_First,
                              std::int64_t i_End);
    void GatherBin(std::uint32_t i_Level, std::int64_t i_Bin, std::size_t i_Component,
                   std::span<Accumulator> o_Accumulators) const;
    void BuildLevel(const VSampleRows& i_rRows, std::uint32_t i_Level, Bins i_Bins);

    std::size_t m_Components;
    std::vector<Chunks> m_Levels; // as many as have records; m_Levels[0] stays empty
};

} // namespace Channels
