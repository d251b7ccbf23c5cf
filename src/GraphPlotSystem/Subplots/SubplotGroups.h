#pragma once

#include "TQL/ITraceId.h"

#include <QtCore/QString>

#include <cstdint>
#include <map>
#include <span>
#include <vector>

namespace TQL
{
class IChannelComponentControls;
class IChannelTextProvider;
} // namespace TQL

namespace GraphPlotUI
{

/// The traces of one subplot and its texts.
struct SubplotGroup
{
    QString Label;   ///< empty, as the two below, for the one subplot of all traces
    QString Units;   ///< rich text without brackets; empty for a number without unit
    QString ToolTip; ///< rich text
    std::vector<TQL::ITraceId> Traces;
    std::vector<QString> TraceNames; ///< one a trace
};

/// A trace that has a subplot, in the order in which colours are given out.
struct PlacedTrace
{
    TQL::ITraceId Trace;
    std::uint64_t ComponentCount = 0; ///< of its channel's subtype
};

/// How traces are shared out over subplots.
struct SubplotGrouping
{
    std::map<std::uint64_t, SubplotGroup> Groups; ///< by subplot id
    std::vector<std::uint64_t> Order;             ///< subplot ids from top to bottom; may lack some of the groups
    std::vector<PlacedTrace> Placed;
};

/// One subplot for each component of each subtype; the traces of a component that is switched off have none. Two
/// subplots of the same name, units and component leave one, the later, in the order.
SubplotGrouping GroupTracesByType(std::span<const TQL::ITraceId> i_Traces, const TQL::IChannelTextProvider& i_rTexts,
                                  const TQL::IChannelComponentControls& i_rControls, bool i_bShowDataContexts);

/// All traces of components that are switched on in one subplot; none without such a trace.
SubplotGrouping GroupTracesTogether(std::span<const TQL::ITraceId> i_Traces, const TQL::IChannelTextProvider& i_rTexts,
                                    const TQL::IChannelComponentControls& i_rControls);

} // namespace GraphPlotUI
