#pragma once

#include "ChannelSystem/LodRecord.h"

#include <cstddef>
#include <cstdint>
#include <limits>

/// Summary records as they are kept in memory: 12 bytes for the values and, apart from them, the count in as few bytes
/// as the level needs. A level stands for bins of 2^(level + 1) rows. Pure functions; no thread, no allocation.
namespace Channels
{

using ChannelSystem::LodRecord;

struct PackedRecord
{
    float Mean = 0.0f;
    float Maximum = -std::numeric_limits<float>::infinity();
    float Minimum = std::numeric_limits<float>::infinity();
};

static_assert(sizeof(PackedRecord) == 12);

/// Of the count of one record.
constexpr std::size_t CountBytesOf(std::uint32_t i_Level)
{
    return i_Level < 7 ? 1 : i_Level < 15 ? 2 : 4;
}

/// Records that follow each other, with their counts. Four bytes behind the last record can be read.
struct PackedRun
{
    PackedRecord* pRecords;
    std::uint8_t* pCounts;
};
struct ConstPackedRun
{
    const PackedRecord* pRecords;
    const std::uint8_t* pCounts;
};

/// Rows of interleaved components to records of level 3, 16 rows each: one record a component and 16 rows.
void SummariseSixteens(const float* i_pRows, std::size_t i_Components, std::size_t i_Records, const PackedRun& o_rRun);

/// Records of i_Level from two of the level below each. i_Records counts bins, each with a record a component.
void CombinePairs(const ConstPackedRun& i_rBelow, std::uint32_t i_Level, std::size_t i_Components,
                  std::size_t i_Records, const PackedRun& o_rRun);

/// From the form in memory to the form for readers. i_Count counts records.
void Unpack(const ConstPackedRun& i_rRun, std::uint32_t i_Level, std::size_t i_Count, LodRecord* o_pRecords);

} // namespace Channels
