#pragma once

#include "ChannelSystem/LodRecord.h"
#include "GraphPlotSystem/Traces/TraceTexelRing.h"
#include "TQL/ITick.h"

#include <cstdint>
#include <vector>

namespace ChannelSystem
{
class IChannelBlock;
}

namespace GraphPlotUI
{

/// Where rows are read to before they are written. One for all rings of a provider: it is large, and hot in the cache
/// when one ring follows another.
struct RingScratch
{
    std::vector<float> Samples;
    std::vector<ChannelSystem::LodRecord> Records;
};

/// Brings a ring to the part of i_rRequested that the block has and i_rLimit allows, at level i_Level. Rows that are
/// held already stay; each side is read once, at most 4096 rows, summaries by pieces. What a longer request lacks comes
/// with the calls that follow, until the newest 4096 rows are held. Rows outside the limit or no longer in the block
/// are dropped. A ring of another level, shape or series starts anew. False when nothing is to be had: no such ticks, a
/// level that the block lacks, or a failed read, which leaves the rows held as they are. i_rAvailable is what the
/// block's GetRange gave.
bool FillRing(TraceTexelRing& i_rRing, RingScratch& i_rScratch, const ChannelSystem::IChannelBlock& i_rBlock,
              const TQL::TickRange& i_rAvailable, const TQL::TickRange& i_rRequested, const TQL::TickRange& i_rLimit,
              std::uint8_t i_Level);

/// FillRing, and then once more with the rows that are still free spent on the side where the request reaches beyond
/// the data held, so that small pans find their rows in the ring. Ticks outside the limit are left out of both.
void UpdateRing(TraceTexelRing& i_rRing, RingScratch& i_rScratch, const ChannelSystem::IChannelBlock& i_rBlock,
                const TQL::TickRange& i_rAvailable, const TQL::TickRange& i_rRequested, const TQL::TickRange& i_rLimit,
                std::uint8_t i_Level);

} // namespace GraphPlotUI
