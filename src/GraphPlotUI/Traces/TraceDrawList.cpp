#include "GraphPlotUI/Traces/TraceDrawList.h"

#include "GraphPlotSystem/Traces/ITraceDataProvider.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <utility>

namespace GraphPlotUI
{

namespace
{

constexpr float NormalThickness = 1.5f;
constexpr float FocusThickness = 2.5f;

// The visible range in ticks.
struct TickView
{
    double Left;
    double Width;
    std::int64_t TicksPerFrame;
};

Colour4f Dimmed(const Colour4f& i_rColour)
{
    const auto dim = [](float i_Value)
    {
        return i_Value * 0.3f + 0.35f;
    };
    return {dim(i_rColour[0]), dim(i_rColour[1]), dim(i_rColour[2]), i_rColour[3]};
}

bool QueryChannel(const TQL::ITraceDataProvider& i_rProvider, const TQL::IChannelInstanceId& i_rChannel,
                  const TickView& i_rView, ChannelDraw& o_rDraw)
{
    TQL::IResult result;
    i_rProvider.GetTraceRenderInfo(result, i_rChannel, o_rDraw.Info);
    const std::int64_t ticksPerSample = o_rDraw.Info.TicksPerSample;
    if (result.IsError() || ticksPerSample == 0)
        return false;
    const double samplePeriod = static_cast<double>(ticksPerSample);
    o_rDraw.LodScale = std::pow(2.0f, static_cast<float>(o_rDraw.Info.Level));
    o_rDraw.AxisLength = static_cast<float>(i_rView.Width / samplePeriod);
    // The trace is shifted by one frame: the latest sample of a live context stands at the right edge.
    o_rDraw.AxisStart =
        static_cast<float>((i_rView.Left - static_cast<double>(o_rDraw.Info.OriginTick)) / samplePeriod) -
        static_cast<float>(i_rView.TicksPerFrame / ticksPerSample);
    return true;
}

TraceDraw MakeDraw(const TQL::ITraceId& i_rTrace, const ChannelDraw& i_rChannel)
{
    TraceDraw draw;
    draw.pTrace = &i_rTrace;
    draw.pChannel = &i_rChannel;
    if (i_rTrace.Component() < i_rChannel.Info.Colours.size())
        draw.Colour = i_rChannel.Info.Colours[i_rTrace.Component()];
    draw.Thickness = NormalThickness;
    return draw;
}

void ApplyFocus(std::vector<TraceDraw>& io_rDraws, const TQL::ITraceId& i_rFocusTrace)
{
    for (TraceDraw& rDraw : io_rDraws)
    {
        if (*rDraw.pTrace == i_rFocusTrace)
            rDraw.Thickness = FocusThickness;
        else if (rDraw.Colour)
            rDraw.Colour = Dimmed(*rDraw.Colour);
    }
}

} // namespace

bool TraceFocus::Matches(const TQL::ITraceId& i_rTrace) const
{
    return (Channel && TQL::IsSameChannel(*Channel, i_rTrace.Channel())) || (Trace && *Trace == i_rTrace);
}

TraceDrawList BuildTraceDrawList(const TQL::ITraceDataProvider& i_rProvider, std::span<const TQL::ITraceId> i_Traces,
                                 const TraceFocus& i_rFocus, const AxisRange& i_rX, double i_Offset)
{
    TickView view{};
    i_rProvider.GetTicksPerFrame(view.TicksPerFrame);
    view.Left = (i_rX.Minimum + i_Offset) * static_cast<double>(view.TicksPerFrame);
    view.Width = i_rX.Length() * static_cast<double>(view.TicksPerFrame);

    TraceDrawList list;
    std::optional<TraceDraw> focus;
    for (const TQL::ITraceId& rTrace : i_Traces)
    {
        auto entry = list.Channels.find(&rTrace.Channel());
        if (entry == list.Channels.end())
        {
            ChannelDraw channel;
            if (!QueryChannel(i_rProvider, rTrace.Channel(), view, channel))
                continue;
            entry = list.Channels.emplace(&rTrace.Channel(), std::move(channel)).first;
        }
        const TraceDraw draw = MakeDraw(rTrace, entry->second);
        if (!focus && i_rFocus.Matches(rTrace))
            focus = draw;
        else
            list.Draws.push_back(draw);
    }
    if (focus)
    {
        list.Draws.push_back(*focus);
        ApplyFocus(list.Draws, *focus->pTrace);
    }
    return list;
}

RowRange VisibleRows(const ChannelDraw& i_rChannel, float i_Width, float i_Reach)
{
    const int count = static_cast<int>(i_rChannel.Info.SampleCount);
    const double start = i_rChannel.AxisStart;
    const double length = i_rChannel.AxisLength;
    if (!(length > 0.0) || !std::isfinite(length) || !std::isfinite(start) || !(i_Width > 0.0f))
        return {0, count};

    const double scale = i_rChannel.LodScale;
    const double rounding =
        4.0 * double{std::numeric_limits<float>::epsilon()} * (std::abs(start) + length + count * scale);
    const double margin = static_cast<double>(i_Reach) * length / static_cast<double>(i_Width) + rounding;
    const double first = std::ceil((start - margin) / scale);
    const double end = std::floor((start + length + margin) / scale) + 1.0;
    const int firstRow = static_cast<int>(std::clamp(first, 0.0, static_cast<double>(count)));
    const int endRow = static_cast<int>(std::clamp(end, static_cast<double>(firstRow), static_cast<double>(count)));
    return {firstRow, endRow - firstRow};
}

RowRange VisibleSegments(const RowRange& i_rVisible, int i_RowCount, int i_LongestStep)
{
    // Later rows from the first visible one to the longest step beyond the last one.
    const int endRow = i_rVisible.First + i_rVisible.Count;
    const int firstLater = std::max(i_rVisible.First, 1);
    const int lastLater = static_cast<int>(
        std::min<std::int64_t>(std::int64_t{endRow} - 1 + i_LongestStep, std::int64_t{i_RowCount} - 1));
    return {firstLater - 1, std::max(lastLater - firstLater + 1, 0)};
}

} // namespace GraphPlotUI
