#include "GraphPlotUI/VTracePasses.h"

#include "CoreGraphics/RenderContext.h"
#include "CoreGraphics/Resources.h"
#include "GraphPlotSystem/ITraceDataProvider.h"
#include "GraphPlotUI/TraceGeometry.h"
#include "GraphPlotUI/TraceUniformBlock.h"

#include <QtGui/QVector2D>
#include <QtGui/QVector4D>

#include <array>
#include <limits>

namespace GraphPlotUI
{

namespace
{

// How far outside the plot a row can stand and still be seen: half a point, or a thick line, with room for rounding.
constexpr float ReachInPixels = 8.0f;

// Points are transparent up to five pixels between samples; the rest is room for rounding in the shader.
constexpr float PointsAppearAtPixels = 4.999f;

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

CoreGraphics::RenderState GraphRenderState()
{
    CoreGraphics::RenderState state;
    state.BlendMode = CoreGraphics::RenderState::BlendAlpha;
    state.AlphaBlendMode = 0;
    state.CullMode = 0;
    state.BlendConstantValue = 1.0f;
    state.bDepthTest = false;
    state.bDepthWrite = true;
    state.bColourWrite = true;
    state.bAlphaWrite = false;
    return state;
}

struct VTracePasses::Frame
{
    CoreGraphics::RenderContext& rContext;
    TQL::ITraceDataProvider& rProvider;
    const TraceDrawList& rList;
    const TracePassSettings& rSettings;

    QVector2D AxisY() const
    {
        return {static_cast<float>(rSettings.Y.Minimum), static_cast<float>(rSettings.Y.Length())};
    }

    RowRange Rows(const TraceDraw& i_rDraw) const
    {
        if (!rSettings.bSkipInvisible)
            return {0, static_cast<int>(i_rDraw.pChannel->Info.SampleCount)};
        const float width = static_cast<float>(rContext.Viewport().width());
        return VisibleRows(*i_rDraw.pChannel, width, ReachInPixels);
    }

    RowRange Segments(const TraceDraw& i_rDraw, int i_LongestStep) const
    {
        const int count = static_cast<int>(i_rDraw.pChannel->Info.SampleCount);
        return VisibleSegments(Rows(i_rDraw), count, i_LongestStep);
    }

    RowRange GapSegments(const TraceDraw& i_rDraw) const
    {
        const int longestStep = LongestStep(i_rDraw);
        if (rSettings.bSkipInvisible && (longestStep == 1 || rSettings.GapOpacity <= 0.0f))
            return {};
        return Segments(i_rDraw, longestStep);
    }

    void DrawInstances(TraceUniformBlock& i_rUniforms, GLenum i_Mode, int i_VertexCount, const RowRange& i_rRows) const
    {
        if (i_rRows.Count <= 0)
            return;
        i_rUniforms.Set(ETraceUniform::FirstInstance, i_rRows.First);
        rContext.DrawInstanced(i_Mode, i_VertexCount, i_rRows.Count);
    }
};

void VTracePasses::Initialise(CoreGraphics::Resources& i_rResources)
{
    m_pBarsProgram = i_rResources.GetProgram("TraceBars", "TraceLines");
    m_pLinesProgram = i_rResources.GetProgram("TraceLines", "TraceLines");
    m_pPointsProgram = i_rResources.GetProgram("TracePoints", "TracePoints");

    const std::array<QVector2D, 4> quad{{{0.0f, 0.0f}, {0.0f, 1.0f}, {1.0f, 1.0f}, {1.0f, 0.0f}}};
    m_UnitQuad.SetData(quad.data(), sizeof(quad), CoreGraphics::VertexLayout::TwoFloats());
    const QVector2D point(0.0f, 0.0f);
    m_SinglePoint.SetData(&point, sizeof(point), CoreGraphics::VertexLayout::TwoFloats());
}

void VTracePasses::Draw(CoreGraphics::RenderContext& i_rContext, TQL::ITraceDataProvider& i_rProvider,
                        const TraceDrawList& i_rList, const TracePassSettings& i_rSettings)
{
    if (i_rList.Draws.empty())
        return;
    const Frame frame{i_rContext, i_rProvider, i_rList, i_rSettings};
    DrawLines(frame);
    DrawPoints(frame);
    DrawBars(frame);
}

bool VTracePasses::BeginPass(const Frame& i_rFrame, const std::shared_ptr<CoreGraphics::VShaderProgram>& i_rpProgram,
                             CoreGraphics::VertexBuffer& i_rBuffer)
{
    if (!i_rFrame.rContext.UseProgram(i_rpProgram))
        return false;
    i_rFrame.rContext.ApplyRenderState(GraphRenderState());
    i_rFrame.rContext.BindVertexBuffer(i_rBuffer);
    return true;
}

bool VTracePasses::BeginTrace(const Frame& i_rFrame, const TraceDraw& i_rDraw, TraceUniformBlock& o_rUniforms)
{
    TQL::IResult result;
    i_rFrame.rProvider.BindTraceTexture(result, i_rDraw.pTrace->Channel(), i_rFrame.rContext, 0);
    if (result.IsError())
        return false;
    const ChannelDraw& rChannel = *i_rDraw.pChannel;
    if (i_rDraw.Colour)
    {
        const Colour4f& rColour = *i_rDraw.Colour;
        o_rUniforms.Set(ETraceUniform::TraceColour, QVector4D(rColour[0], rColour[1], rColour[2], rColour[3]));
    }
    o_rUniforms.Set(ETraceUniform::AxisRangeX, QVector2D(rChannel.AxisStart, rChannel.AxisLength));
    o_rUniforms.Set(ETraceUniform::LodScale, rChannel.LodScale);
    o_rUniforms.Set(ETraceUniform::CircleBufferStart, static_cast<int>(rChannel.Info.CircularStart));
    o_rUniforms.Set(ETraceUniform::CircleBufferCapacity, static_cast<int>(rChannel.Info.CircularCapacity));
    o_rUniforms.Set(ETraceUniform::ComponentIndex, int{i_rDraw.pTrace->Component()});
    i_rFrame.rContext.ApplySamplerState(TraceSamplerState());
    return true;
}

void VTracePasses::DrawLines(const Frame& i_rFrame)
{
    if (!BeginPass(i_rFrame, m_pLinesProgram, m_UnitQuad))
        return;
    TraceUniformBlock uniforms(m_pLinesProgram);
    uniforms.Set(ETraceUniform::Trace, 0);
    uniforms.Set(ETraceUniform::AxisRangeY, i_rFrame.AxisY());
    uniforms.Set(ETraceUniform::GapOpacity, i_rFrame.rSettings.GapOpacity);
    for (const TraceDraw& rDraw : i_rFrame.rList.Draws)
    {
        const RowRange gaps = i_rFrame.GapSegments(rDraw);
        const RowRange solid = i_rFrame.Segments(rDraw, 1);
        if (rDraw.pChannel->Info.SampleCount < 2 || (gaps.Count == 0 && solid.Count == 0) ||
            !BeginTrace(i_rFrame, rDraw, uniforms))
            continue;
        uniforms.Set(ETraceUniform::LineThickness, rDraw.Thickness);
        uniforms.Set(ETraceUniform::DrawGaps, 1);
        i_rFrame.DrawInstances(uniforms, GL_TRIANGLE_FAN, 4, gaps);
        uniforms.Set(ETraceUniform::DrawGaps, 0);
        i_rFrame.DrawInstances(uniforms, GL_TRIANGLE_FAN, 4, solid);
    }
}

void VTracePasses::DrawPoints(const Frame& i_rFrame)
{
    if (!BeginPass(i_rFrame, m_pPointsProgram, m_SinglePoint))
        return;
    const float width = static_cast<float>(i_rFrame.rSettings.RectSize.width());
    const float height = static_cast<float>(i_rFrame.rSettings.RectSize.height());
    TraceUniformBlock uniforms(m_pPointsProgram);
    uniforms.Set(ETraceUniform::Trace, 0);
    uniforms.Set(ETraceUniform::AxisRangeY, i_rFrame.AxisY());
    uniforms.Set(ETraceUniform::RectSize, QVector2D(width, height));
    for (const TraceDraw& rDraw : i_rFrame.rList.Draws)
    {
        const bool bTransparent = width / rDraw.pChannel->AxisLength < PointsAppearAtPixels;
        const RowRange rows = i_rFrame.Rows(rDraw);
        if ((i_rFrame.rSettings.bSkipInvisible && bTransparent) || rows.Count == 0 ||
            !BeginTrace(i_rFrame, rDraw, uniforms))
            continue;
        i_rFrame.DrawInstances(uniforms, GL_POINTS, 1, rows);
    }
}

void VTracePasses::DrawBars(const Frame& i_rFrame)
{
    if (!BeginPass(i_rFrame, m_pBarsProgram, m_UnitQuad))
        return;
    TraceUniformBlock uniforms(m_pBarsProgram);
    uniforms.Set(ETraceUniform::Trace, 0);
    uniforms.Set(ETraceUniform::AxisRangeY, i_rFrame.AxisY());
    uniforms.Set(ETraceUniform::DrawGaps, 0);
    for (const TraceDraw& rDraw : i_rFrame.rList.Draws)
    {
        // At level 0 minimum and maximum are the same.
        const bool bFlat = rDraw.pChannel->Info.Level == 0;
        const RowRange rows = i_rFrame.Rows(rDraw);
        if ((i_rFrame.rSettings.bSkipInvisible && bFlat) || rows.Count == 0 || !BeginTrace(i_rFrame, rDraw, uniforms))
            continue;
        uniforms.Set(ETraceUniform::LineThickness, rDraw.Thickness);
        i_rFrame.DrawInstances(uniforms, GL_TRIANGLE_FAN, 4, rows);
    }
}

} // namespace GraphPlotUI
