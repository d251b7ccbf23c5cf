#pragma once

#include "GraphPlotSystem/Traces/TraceRenderInfo.h"
#include "GraphPlotUI/Geometry/AxisRange.h"
#include "TQL/IChannelInstanceId.h"
#include "TQL/ITraceId.h"

#include <cstdint>
#include <map>
#include <optional>
#include <span>
#include <vector>

namespace TQL
{
class ITraceDataProvider;
}

namespace GraphPlotUI
{

/// What the operator looks at: a channel or one trace, at most one of the two.
struct TraceFocus
{
    std::optional<TQL::IChannelInstanceId> Channel;
    std::optional<TQL::ITraceId> Trace;

    bool Matches(const TQL::ITraceId& i_rTrace) const;
};

/// One channel in one frame. Axis start and length are in samples of level 0, from the ring's first row.
struct ChannelDraw
{
    TraceRenderInfo Info;
    float LodScale = 1.0f;
    float AxisStart = 0.0f;
    float AxisLength = 1.0f;
};

/// One trace in one frame, in the order in which each pass draws.
struct TraceDraw
{
    const TQL::ITraceId* pTrace = nullptr;
    const ChannelDraw* pChannel = nullptr;
    std::optional<Colour4f> Colour; ///< empty for a component beyond the colours: it is drawn in the colour before it
    float Thickness = 0.0f;         ///< half width in pixels
};

struct ChannelOrder
{
    bool operator()(const TQL::IChannelInstanceId* i_pA, const TQL::IChannelInstanceId* i_pB) const
    {
        return *i_pA < *i_pB;
    }
};

/// What one subplot draws in one frame. Points into the trace vector that it was built from.
struct TraceDrawList
{
    std::map<const TQL::IChannelInstanceId*, ChannelDraw, ChannelOrder> Channels;
    std::vector<TraceDraw> Draws;
};

/// Asks for each channel once. A trace whose channel has no data or no sample period is left out. The focus trace, the
/// first one that matches the focus, goes to the end, is thicker, and dims all others. i_rX is in frames; i_Offset is
/// the latest frame of a live context and 0 otherwise.
TraceDrawList BuildTraceDrawList(const TQL::ITraceDataProvider& i_rProvider, std::span<const TQL::ITraceId> i_Traces,
                                 const TraceFocus& i_rFocus, const AxisRange& i_rX, double i_Offset);

/// A run of rows, or of instances that stand for rows.
struct RowRange
{
    int First = 0;
    int Count = 0;

    friend bool operator==(const RowRange&, const RowRange&) = default;
};

/// The rows that stand at most i_Reach pixels outside a plot i_Width pixels wide, on the safe side of what float
/// arithmetic in a shader makes of them.
RowRange VisibleRows(const ChannelDraw& i_rChannel, float i_Width, float i_Reach);

/// The segments, counted by their later row less one, that reach into i_rVisible: those that end at a visible row or
/// begin at one at most i_LongestStep rows before, or pass over it.
RowRange VisibleSegments(const RowRange& i_rVisible, int i_RowCount, int i_LongestStep);

} // namespace GraphPlotUI
