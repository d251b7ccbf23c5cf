#include "GraphPlotUI/Traces/TracePassFrame.h"

#include "CoreGraphics/RenderContext.h"
#include "GraphPlotSystem/Traces/ITraceDataProvider.h"

#include <QtGui/QVector4D>

#include <limits>

namespace GraphPlotUI
{

namespace
{

// How far outside the plot a row can stand and still be seen: half a point, or a thick line, with room for rounding.
constexpr float ReachInPixels = 8.0f;

CoreGraphics::SamplerState TraceSamplerState()
{
    CoreGraphics::SamplerState state;
    state.MinifyingFilter = CoreGraphics::SamplerState::Nearest;
    state.bLinearMagnification = false;
    state.bClampS = true;
    state.bClampT = false; // the ring of rows wraps along T
    return state;
}

int LongestStep(const TraceDraw& i_rDraw)
{
    const std::vector<std::uint32_t>& rSteps = i_rDraw.pChannel->Info.LongestSteps;
    const std::uint8_t component = i_rDraw.pTrace->Component();
    const std::uint32_t step = component < rSteps.size() ? rSteps[component] : 0;
    return step == 0 ? std::numeric_limits<int>::max() : static_cast<int>(step);
}

} // namespace

float VTracePasses::Frame::RowDistance(const TraceDraw& i_rDraw) const
{
    const ChannelDraw& rChannel = *i_rDraw.pChannel;
    return rChannel.LodScale / rChannel.AxisLength * static_cast<float>(rContext.Viewport().width());
}

RowRange VTracePasses::Frame::Rows(const TraceDraw& i_rDraw) const
{
    if (!rSettings.bSkipInvisible)
        return {0, static_cast<int>(i_rDraw.pChannel->Info.SampleCount)};
    return VisibleRows(*i_rDraw.pChannel, static_cast<float>(rContext.Viewport().width()), ReachInPixels);
}

RowRange VTracePasses::Frame::Segments(const TraceDraw& i_rDraw, int i_LongestStep) const
{
    return VisibleSegments(Rows(i_rDraw), static_cast<int>(i_rDraw.pChannel->Info.SampleCount), i_LongestStep);
}

RowRange VTracePasses::Frame::GapSegments(const TraceDraw& i_rDraw) const
{
    const int longestStep = LongestStep(i_rDraw);
    if (rSettings.bSkipInvisible && (longestStep == 1 || rSettings.GapOpacity <= 0.0f))
        return {};
    return Segments(i_rDraw, longestStep);
}

RowRange VTracePasses::Frame::Strips(const TraceDraw& i_rDraw, const StripLayout& i_rLayout) const
{
    if (!rSettings.bSkipInvisible)
        return {0, i_rLayout.Count};
    const float width = static_cast<float>(rContext.Viewport().width());
    return VisibleStrips(i_rLayout, *i_rDraw.pChannel, width, ReachInPixels);
}

bool VTracePasses::Frame::Begin(const Program& i_rpProgram, CoreGraphics::VertexBuffer& i_rBuffer)
{
    if (pProgram && pProgram == i_rpProgram)
        return true;
    pProgram.reset();
    if (!rContext.UseProgram(i_rpProgram))
        return false;
    pProgram = i_rpProgram;
    rContext.ApplyRenderState(GraphRenderState());
    rContext.BindVertexBuffer(i_rBuffer);
    Uniforms.emplace(i_rpProgram);
    Set(ETraceUniform::Trace, 0);
    Set(ETraceUniform::AxisRangeY,
        QVector2D(static_cast<float>(rSettings.Y.Minimum), static_cast<float>(rSettings.Y.Length())));
    Set(ETraceUniform::GapOpacity, rSettings.GapOpacity);
    return true;
}

bool VTracePasses::Frame::BeginTrace(const TraceDraw& i_rDraw)
{
    TQL::IResult result;
    rProvider.BindTraceTexture(result, i_rDraw.pTrace->Channel(), rContext, 0);
    if (result.IsError())
        return false;
    const ChannelDraw& rChannel = *i_rDraw.pChannel;
    LastColour = i_rDraw.Colour.value_or(LastColour);
    Set(ETraceUniform::TraceColour, QVector4D(LastColour[0], LastColour[1], LastColour[2], LastColour[3]));
    Set(ETraceUniform::AxisRangeX, QVector2D(rChannel.AxisStart, rChannel.AxisLength));
    Set(ETraceUniform::LodScale, rChannel.LodScale);
    Set(ETraceUniform::CircleBufferStart, static_cast<int>(rChannel.Info.CircularStart));
    Set(ETraceUniform::CircleBufferCapacity, static_cast<int>(rChannel.Info.CircularCapacity));
    Set(ETraceUniform::ComponentIndex, int{i_rDraw.pTrace->Component()});
    Set(ETraceUniform::RowCount, static_cast<int>(rChannel.Info.SampleCount));
    Set(ETraceUniform::LineThickness, i_rDraw.Thickness);
    rContext.ApplySamplerState(TraceSamplerState());
    return true;
}

void VTracePasses::Frame::DrawInstances(GLenum i_Mode, int i_VertexCount, const RowRange& i_rInstances)
{
    if (i_rInstances.Count <= 0)
        return;
    Set(ETraceUniform::FirstInstance, i_rInstances.First);
    rContext.DrawInstanced(i_Mode, i_VertexCount, i_rInstances.Count);
}

} // namespace GraphPlotUI
