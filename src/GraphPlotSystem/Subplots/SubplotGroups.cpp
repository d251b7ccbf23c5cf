#include "GraphPlotSystem/Subplots/SubplotGroups.h"

#include "GraphPlotSystem/Subplots/SubplotRules.h"
#include "GraphPlotSystem/Subplots/SubplotToolTip.h"
#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "GraphPlotSystem/Texts/IChannelTextProvider.h"

#include <utility>

namespace GraphPlotUI
{

using TQL::IChannelTextProvider;
using TQL::ITraceId;

namespace
{

/// Calls i_rFunction(trace, subtype) for the traces whose component is switched on, and notes them as placed.
template <typename TFunction>
void PlaceTraces(std::span<const ITraceId> i_Traces, const IChannelTextProvider& i_rTexts,
                 const TQL::IChannelComponentControls& i_rControls, std::vector<PlacedTrace>& o_rPlaced,
                 const TFunction& i_rFunction)
{
    for (const ITraceId& rTrace : i_Traces)
    {
        const std::uint64_t subType = i_rTexts.GetSubTypeId(rTrace.Channel());
        if (!i_rControls.IsComponentEnabled(subType, rTrace.Component()))
            continue;
        o_rPlaced.push_back({rTrace, i_rTexts.GetComponentCount(subType)});
        i_rFunction(rTrace, subType);
    }
}

QString OrderKeyOf(const SubplotGroup& i_rGroup, const IChannelTextProvider& i_rTexts)
{
    const ITraceId& rFirst = i_rGroup.Traces.front();
    const std::uint64_t subType = i_rTexts.GetSubTypeId(rFirst.Channel());
    const QString name = i_rGroup.Traces.size() == 1 ? i_rTexts.GetChannelDisplayName(rFirst.Channel())
                                                     : i_rTexts.GetSubTypeDisplayName(subType);
    return SubplotOrderKey(name, i_rTexts.GetSubTypeUnits(subType), rFirst.Component());
}

std::vector<std::uint64_t> OrderGroups(const std::map<std::uint64_t, SubplotGroup>& i_rGroups,
                                       const IChannelTextProvider& i_rTexts)
{
    std::map<QString, std::uint64_t> ordered;
    for (const auto& [id, rGroup] : i_rGroups)
        ordered.insert_or_assign(OrderKeyOf(rGroup, i_rTexts), id);
    std::vector<std::uint64_t> order;
    order.reserve(ordered.size());
    for (const auto& [rKey, id] : ordered)
        order.push_back(id);
    return order;
}

} // namespace

SubplotGrouping GroupTracesByType(std::span<const ITraceId> i_Traces, const IChannelTextProvider& i_rTexts,
                                  const TQL::IChannelComponentControls& i_rControls, bool i_bShowDataContexts)
{
    SubplotGrouping grouping;
    const auto place = [&](const ITraceId& i_rTrace, std::uint64_t i_SubType)
    {
        const std::uint8_t component = i_rTrace.Component();
        const auto [it, bNew] = grouping.Groups.try_emplace(SubplotIdOf(i_SubType, component));
        SubplotGroup& rGroup = it->second;
        if (bNew)
        {
            rGroup.Label = SubplotLabel(i_rTexts.GetSubTypeDisplayName(i_SubType),
                                        i_rTexts.GetComponentName(i_SubType, component));
            rGroup.Units = i_rTexts.GetComponentUnits(i_SubType, component, true);
        }
        rGroup.Traces.push_back(i_rTrace);
        rGroup.TraceNames.push_back(i_rTexts.GetChannelDisplayName(i_rTrace.Channel()));
    };
    PlaceTraces(i_Traces, i_rTexts, i_rControls, grouping.Placed, place);
    for (auto& [id, rGroup] : grouping.Groups)
        rGroup.ToolTip = SubplotToolTip(rGroup.Traces, i_rTexts, i_bShowDataContexts);
    grouping.Order = OrderGroups(grouping.Groups, i_rTexts);
    return grouping;
}

SubplotGrouping GroupTracesTogether(std::span<const ITraceId> i_Traces, const IChannelTextProvider& i_rTexts,
                                    const TQL::IChannelComponentControls& i_rControls)
{
    SubplotGrouping grouping;
    SubplotGroup group;
    const auto place = [&](const ITraceId& i_rTrace, std::uint64_t)
    {
        group.Traces.push_back(i_rTrace);
        group.TraceNames.push_back(i_rTexts.GetChannelDisplayName(i_rTrace.Channel()) + QLatin1String(" : ") +
                                   i_rTexts.GetComponentName(i_rTrace.Channel(), i_rTrace.Component()));
    };
    PlaceTraces(i_Traces, i_rTexts, i_rControls, grouping.Placed, place);
    if (group.Traces.empty())
        return grouping;
    grouping.Groups.emplace(SingleSubplotId, std::move(group));
    grouping.Order.push_back(SingleSubplotId);
    return grouping;
}

} // namespace GraphPlotUI
