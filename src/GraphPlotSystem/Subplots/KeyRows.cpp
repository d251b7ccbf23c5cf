#include "GraphPlotSystem/Subplots/KeyRows.h"

#include "ChannelSystem/IChannel.h"
#include "TQL/HashMix.h"

#include <algorithm>
#include <utility>

namespace GraphPlotUI
{

std::vector<TQL::ITraceId> ListKeyTraces(std::span<const std::shared_ptr<TQL::IChannel>> i_Channels)
{
    constexpr std::size_t mostComponents = 256; // what the id of a trace can tell apart
    std::vector<TQL::ITraceId> traces;
    for (const auto& rpChannel : i_Channels)
    {
        const std::shared_ptr<TQL::IChannelOutput> pOutput = rpChannel->GetOutput();
        const std::size_t count = pOutput ? std::min(pOutput->GetDescription().Groups.size(), mostComponents) : 1;
        for (std::size_t component = 0; component < count; ++component)
            traces.emplace_back(rpChannel->GetInstanceId(), static_cast<std::uint8_t>(component));
    }
    return traces;
}

std::uint64_t HashKeyTraces(std::span<const TQL::ITraceId> i_Traces)
{
    std::uint64_t hash = 0;
    for (const TQL::ITraceId& rTrace : i_Traces)
        hash = TQL::HashMix(hash, rTrace.Hash());
    return hash;
}

KeyComponents DescribeKeyComponents(std::uint64_t i_Component, std::uint64_t i_ComponentCount,
                                    std::vector<std::uint64_t> i_Disabled)
{
    std::ranges::sort(i_Disabled);
    KeyComponents components;
    components.Disabled = std::move(i_Disabled);
    const std::uint64_t count = std::max<std::uint64_t>(i_ComponentCount, 1);
    components.EnabledCount = static_cast<int>(count - std::min<std::uint64_t>(count, components.Disabled.size()));
    const auto isEnabled = [&](std::uint64_t i_Index)
    {
        return !std::ranges::binary_search(components.Disabled, i_Index);
    };
    components.bFirstEnabled = isEnabled(i_Component);
    for (std::uint64_t index = 0; index < i_Component; ++index)
        components.bFirstEnabled = components.bFirstEnabled && !isEnabled(index);
    components.bLastEnabled = true;
    for (std::uint64_t index = i_Component + 1; index < count; ++index)
        components.bLastEnabled = components.bLastEnabled && !isEnabled(index);
    return components;
}

std::vector<RowRun> FindChangedRows(std::span<const TQL::ITraceId> i_Old, std::span<const TQL::ITraceId> i_New)
{
    std::vector<RowRun> runs;
    for (std::size_t row = 0; row < std::min(i_Old.size(), i_New.size()); ++row)
    {
        if (i_Old[row] == i_New[row])
            continue;
        if (!runs.empty() && runs.back().Last + 1 == row)
            runs.back().Last = row;
        else
            runs.push_back({row, row});
    }
    return runs;
}

} // namespace GraphPlotUI
