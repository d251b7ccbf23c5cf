#include "GraphPlotUI/Traces/VTracePasses.h"

#include "CoreGraphics/RenderContext.h"
#include "CoreGraphics/Resources.h"
#include "GraphPlotSystem/Traces/ITraceDataProvider.h"
#include "GraphPlotUI/Traces/TracePassFrame.h"
#include "GraphPlotUI/Traces/TraceStrips.h"

#include <QtGui/QOpenGLContext>
#include <QtGui/QOpenGLFunctions>

#include <algorithm>
#include <array>
#include <optional>
#include <string_view>

namespace GraphPlotUI
{

namespace
{

// Points are transparent up to five pixels between samples; the rest is room for rounding in the shader.
constexpr float PointsAppearAtPixels = 4.999f;

constexpr float WidestStrip = 16.0f;

// A graphics processor shades small primitives side by side and needs no strips. Software renderers do, and they draw
// wide lines as exact rectangles.
bool IsSoftwareRendererWithWideLines()
{
    QOpenGLFunctions* pFunctions = QOpenGLContext::currentContext()->functions();
    const auto* pName = reinterpret_cast<const char*>(pFunctions->glGetString(GL_RENDERER));
    std::array<float, 2> widths{};
    pFunctions->glGetFloatv(GL_ALIASED_LINE_WIDTH_RANGE, widths.data());
    return pName && std::string_view(pName).find("llvmpipe") != std::string_view::npos && widths[1] >= WidestStrip;
}

template <std::size_t Count>
void Fill(CoreGraphics::VertexBuffer& o_rBuffer, const std::array<QVector2D, Count>& i_rVertices)
{
    o_rBuffer.SetData(i_rVertices.data(), sizeof(i_rVertices), CoreGraphics::VertexLayout::TwoFloats());
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

void VTracePasses::Initialise(CoreGraphics::Resources& i_rResources)
{
    m_pBarsProgram = i_rResources.GetProgram("TraceBars", "TraceLines");
    m_pLinesProgram = i_rResources.GetProgram("TraceLines", "TraceLines");
    m_pPointsProgram = i_rResources.GetProgram("TracePoints", "TracePoints");
    m_bCanMerge = IsSoftwareRendererWithWideLines();
    if (m_bCanMerge)
    {
        m_pBarStripsProgram = i_rResources.GetProgram("TraceBarStrips", "TraceBarStrips");
        m_pLineStripsProgram = i_rResources.GetProgram("TraceLineStrips", "TraceLineStrips");
    }
    Fill(m_UnitQuad, std::array<QVector2D, 4>{{{0.0f, 0.0f}, {0.0f, 1.0f}, {1.0f, 1.0f}, {1.0f, 0.0f}}});
    Fill(m_SinglePoint, std::array<QVector2D, 1>{{{0.0f, 0.0f}}});
    Fill(m_MiddleLine, std::array<QVector2D, 2>{{{0.5f, 0.0f}, {0.5f, 1.0f}}});
}

void VTracePasses::Draw(CoreGraphics::RenderContext& i_rContext, TQL::ITraceDataProvider& i_rProvider,
                        const TraceDrawList& i_rList, const TracePassSettings& i_rSettings)
{
    if (i_rList.Draws.empty())
        return;
    Frame frame{i_rContext, i_rProvider, i_rList, i_rSettings};
    DrawLines(frame);
    DrawPoints(frame);
    DrawBars(frame);
}

int VTracePasses::ChooseStripWidth(const Frame& i_rFrame, const TraceDraw& i_rDraw, const Program& i_rpProgram) const
{
    if (!m_bCanMerge || !i_rFrame.rSettings.bMergeDenseRows || !i_rpProgram || !i_rpProgram->IsLinked())
        return 0;
    return StripWidth(i_rFrame.RowDistance(i_rDraw), i_rDraw.Thickness);
}

void VTracePasses::DrawLines(Frame& i_rFrame)
{
    for (const TraceDraw& rDraw : i_rFrame.rList.Draws)
    {
        if (rDraw.pChannel->Info.SampleCount < 2)
            continue;
        const RowRange gaps = i_rFrame.GapSegments(rDraw);
        if (gaps.Count > 0 && i_rFrame.Begin(m_pLinesProgram, m_UnitQuad) && i_rFrame.BeginTrace(rDraw))
        {
            i_rFrame.Set(ETraceUniform::DrawGaps, 1);
            i_rFrame.DrawInstances(GL_TRIANGLE_FAN, 4, gaps);
        }
        if (const int width = ChooseStripWidth(i_rFrame, rDraw, m_pLineStripsProgram); width > 0)
        {
            DrawLineStrips(i_rFrame, rDraw, width);
            continue;
        }
        const RowRange solid = i_rFrame.Segments(rDraw, 1);
        if (solid.Count > 0 && i_rFrame.Begin(m_pLinesProgram, m_UnitQuad) && i_rFrame.BeginTrace(rDraw))
        {
            i_rFrame.Set(ETraceUniform::DrawGaps, 0);
            i_rFrame.DrawInstances(GL_TRIANGLE_FAN, 4, solid);
        }
    }
}

void VTracePasses::DrawPoints(Frame& i_rFrame)
{
    const float width = static_cast<float>(i_rFrame.rSettings.RectSize.width());
    const float height = static_cast<float>(i_rFrame.rSettings.RectSize.height());
    for (const TraceDraw& rDraw : i_rFrame.rList.Draws)
    {
        const bool bTransparent = width / rDraw.pChannel->AxisLength < PointsAppearAtPixels;
        const RowRange rows = i_rFrame.Rows(rDraw);
        if ((i_rFrame.rSettings.bSkipInvisible && bTransparent) || rows.Count == 0 ||
            !i_rFrame.Begin(m_pPointsProgram, m_SinglePoint) || !i_rFrame.BeginTrace(rDraw))
            continue;
        i_rFrame.Set(ETraceUniform::RectSize, QVector2D(width, height));
        i_rFrame.DrawInstances(GL_POINTS, 1, rows);
    }
}

void VTracePasses::DrawBars(Frame& i_rFrame)
{
    for (const TraceDraw& rDraw : i_rFrame.rList.Draws)
    {
        // At level 0 minimum and maximum are the same.
        const bool bFlat = rDraw.pChannel->Info.Level == 0;
        const RowRange rows = i_rFrame.Rows(rDraw);
        if ((i_rFrame.rSettings.bSkipInvisible && bFlat) || rows.Count == 0)
            continue;
        if (const int width = ChooseStripWidth(i_rFrame, rDraw, m_pBarStripsProgram); width > 0)
            DrawBarStrips(i_rFrame, rDraw, width);
        else if (i_rFrame.Begin(m_pBarsProgram, m_UnitQuad) && i_rFrame.BeginTrace(rDraw))
        {
            i_rFrame.Set(ETraceUniform::DrawGaps, 0);
            i_rFrame.DrawInstances(GL_TRIANGLE_FAN, 4, rows);
        }
    }
}

void VTracePasses::DrawLineStrips(Frame& i_rFrame, const TraceDraw& i_rDraw, int i_StripWidth)
{
    const RowRange strips = i_rFrame.Strips(i_rDraw, MakeStripLayout(i_rFrame.rContext.Viewport(), i_StripWidth));
    if (strips.Count == 0 || !i_rFrame.Begin(m_pLineStripsProgram, m_UnitQuad) || !i_rFrame.BeginTrace(i_rDraw))
        return;
    i_rFrame.Set(ETraceUniform::StripWidth, static_cast<float>(i_StripWidth));
    i_rFrame.DrawInstances(GL_TRIANGLE_FAN, 4, strips);
}

void VTracePasses::DrawBarStrips(Frame& i_rFrame, const TraceDraw& i_rDraw, int i_StripWidth)
{
    const QRect& rViewport = i_rFrame.rContext.Viewport();
    const StripLayout layout = MakeStripLayout(rViewport, i_StripWidth);
    const RowRange strips = i_rFrame.Strips(i_rDraw, layout);
    if (strips.Count == 0 || !i_rFrame.Begin(m_pBarStripsProgram, m_UnitQuad) || !i_rFrame.BeginTrace(i_rDraw))
        return;
    i_rFrame.Set(ETraceUniform::StripWidth, static_cast<float>(i_StripWidth));

    // A line is one primitive where a quad is two triangles that share every block of a narrow strip. Lines are not
    // clipped at the sides of the viewport, so the strips there stay quads.
    const RowRange lines = layout.Inside(strips, rViewport.width());
    const int end = lines.First + lines.Count;
    i_rFrame.DrawInstances(GL_TRIANGLE_FAN, 4, {strips.First, std::min(lines.First - strips.First, strips.Count)});
    i_rFrame.DrawInstances(GL_TRIANGLE_FAN, 4, {end, strips.First + strips.Count - end});
    if (lines.Count == 0)
        return;
    QOpenGLFunctions* pFunctions = QOpenGLContext::currentContext()->functions();
    i_rFrame.rContext.SetScissor(rViewport);
    i_rFrame.rContext.BindVertexBuffer(m_MiddleLine);
    pFunctions->glLineWidth(static_cast<float>(i_StripWidth));
    i_rFrame.DrawInstances(GL_LINES, 2, lines);
    pFunctions->glLineWidth(1.0f);
    i_rFrame.rContext.BindVertexBuffer(m_UnitQuad);
    i_rFrame.rContext.SetScissor(std::nullopt);
}

} // namespace GraphPlotUI
