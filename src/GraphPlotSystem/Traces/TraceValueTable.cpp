#include "GraphPlotSystem/Traces/TraceValueTable.h"

#include "ChannelSystem/IChannelBlock.h"
#include "TQL/IChannelInstanceId.h"

#include <algorithm>
#include <cmath>
#include <string_view>

namespace GraphPlotUI
{

using ChannelSystem::LodRecord;

namespace
{

constexpr std::string_view FixedRangeType = "Monitor";
constexpr std::size_t MostComponents = 256; // the index of a component is a byte

/// Puts what the block holds now into the scratch. False when the block could not tell.
bool Summarise(TraceValueTable& i_rTable, const TQL::IChannelInstanceId& i_rChannel,
               const ChannelSystem::IChannelBlock& i_rBlock, const TQL::TickRange& i_rAvailable)
{
    if (i_rChannel.TypeName == FixedRangeType)
    {
        i_rTable.Scratch.assign(1, LodRecord{0.5f, 1.0f, 0.0f, 0, 1});
        return true;
    }
    const ChannelSystem::ChannelBlockShape& rShape = i_rBlock.GetShape();
    if (rShape.SummaryPeriods.empty() || !rShape.pLayout)
        return true;
    i_rTable.Scratch.resize(rShape.pLayout->ComponentCount);
    return i_rBlock.Summarise(i_rAvailable, i_rTable.Scratch).IsSuccess();
}

/// Sets the current values. True when one of them is another now.
bool StoreValues(TraceValueRange& i_rRange, const LodRecord& i_rRecord)
{
    const float minimum = i_rRecord.Count == 0 ? FLT_MAX : i_rRecord.Minimum;
    const float maximum = i_rRecord.Count == 0 ? -FLT_MAX : i_rRecord.Maximum;
    const bool bChanged = minimum != i_rRange.Minimum || maximum != i_rRange.Maximum;
    i_rRange.Minimum = minimum;
    i_rRange.Maximum = maximum;
    i_rRange.AllTimeMinimum = std::min(i_rRange.AllTimeMinimum, minimum);
    i_rRange.AllTimeMaximum = std::max(i_rRange.AllTimeMaximum, maximum);
    return bChanged;
}

} // namespace

ValueChange UpdateValueTable(TraceValueTable& i_rTable, const TQL::IChannelInstanceId& i_rChannel,
                             const ChannelSystem::IChannelBlock& i_rBlock, const TQL::TickRange& i_rAvailable)
{
    ValueChange change;
    if (i_rAvailable == i_rTable.BlockRange || !Summarise(i_rTable, i_rChannel, i_rBlock, i_rAvailable))
        return change;
    i_rTable.BlockRange = i_rAvailable;
    const std::size_t count = std::min(i_rTable.Scratch.size(), MostComponents);
    if (i_rTable.Components.size() < count)
    {
        i_rTable.Components.resize(count);
        change.bComponentAdded = true;
    }
    for (std::size_t c = 0; c < count; ++c)
        change.bRangeChanged = StoreValues(i_rTable.Components[c], i_rTable.Scratch[c]) || change.bRangeChanged;
    return change;
}

void CombineRanges(TraceValueRange& i_rSum, const TraceValueRange& i_rRange)
{
    i_rSum.Minimum = std::min(i_rSum.Minimum, i_rRange.Minimum);
    i_rSum.Maximum = std::max(i_rSum.Maximum, i_rRange.Maximum);
    i_rSum.AllTimeMinimum = std::min(i_rSum.AllTimeMinimum, i_rRange.AllTimeMinimum);
    i_rSum.AllTimeMaximum = std::max(i_rSum.AllTimeMaximum, i_rRange.AllTimeMaximum);
}

ValueRange PadRange(const TraceValueRange& i_rRange)
{
    const bool bCurrent = i_rRange.Minimum < FLT_MAX && i_rRange.Maximum > -FLT_MAX;
    const float lowest = bCurrent ? i_rRange.Minimum : i_rRange.AllTimeMinimum;
    const float highest = bCurrent ? i_rRange.Maximum : i_rRange.AllTimeMaximum;
    if (!std::isfinite(lowest) || !std::isfinite(highest) || lowest == FLT_MAX || highest == -FLT_MAX)
        return {0.0, 1.0};
    const double low = lowest;
    const double high = highest;
    if (low == high)
        return low == 0.0 ? ValueRange{-1.0, 1.0} : ValueRange{low - std::abs(low), low + std::abs(low)};
    const double padding = 0.05 * (high - low);
    return {low - padding, high + padding};
}

} // namespace GraphPlotUI
