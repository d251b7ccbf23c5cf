#pragma once

#include "ChannelSystem/LodRecord.h"
#include "GraphPlotSystem/Traces/TraceRenderInfo.h"
#include "TQL/ITick.h"

#include <cfloat>
#include <span>
#include <vector>

namespace ChannelSystem
{
class IChannelBlock;
}
namespace TQL
{
struct IChannelInstanceId;
}

namespace GraphPlotUI
{

/// The lowest and highest value of one component: of all that was ever seen, and of what the block holds now.
/// A range without values has FLT_MAX below -FLT_MAX.
struct TraceValueRange
{
    float AllTimeMinimum = FLT_MAX;
    float AllTimeMaximum = -FLT_MAX;
    float Minimum = FLT_MAX;
    float Maximum = -FLT_MAX;
};

/// The value ranges of one channel, by component. Owned by the trace data provider, used under its mutex.
struct TraceValueTable
{
    std::vector<TraceValueRange> Components; ///< at most 256; a component once seen stays
    TQL::TickRange BlockRange;               ///< the ticks of the block for which the current values were computed
    std::vector<ChannelSystem::LodRecord> Scratch;
};

/// What an update of a table found.
struct ValueChange
{
    bool bComponentAdded = false;
    bool bRangeChanged = false;
};

/// Brings a table to the block, whose GetRange gave i_rAvailable. Does nothing while that range is the one known.
/// Channels of the type "Monitor" have the fixed range 0..1. A block without summary levels adds nothing.
ValueChange UpdateValueTable(TraceValueTable& i_rTable, const TQL::IChannelInstanceId& i_rChannel,
                             const ChannelSystem::IChannelBlock& i_rBlock, const TQL::TickRange& i_rAvailable);

/// Widens i_rSum by the values of i_rRange, the current and the all-time ones apart.
void CombineRanges(TraceValueRange& i_rSum, const TraceValueRange& i_rRange);

/// The range of an axis for the given values: the current ones, else those of all time, with 5 % of their span added on
/// either side. One constant value v gives v - |v| to v + |v|, the constant 0 gives -1 to 1, no values 0 to 1.
ValueRange PadRange(const TraceValueRange& i_rRange);

} // namespace GraphPlotUI
