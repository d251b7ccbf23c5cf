#pragma once

#include "CoreGraphics/RenderState.h"
#include "CoreGraphics/VertexBuffer.h"
#include "GraphPlotUI/Traces/TraceDrawList.h"

#include <QtCore/QSizeF>

#include <memory>

namespace CoreGraphics
{
class RenderContext;
class Resources;
class VShaderProgram;
} // namespace CoreGraphics

namespace TQL
{
class ITraceDataProvider;
}

namespace GraphPlotUI
{

class TraceUniformBlock;

/// What is the same for all traces of a subplot in one frame.
struct TracePassSettings
{
    AxisRange Y;
    QSizeF RectSize; ///< framebuffer pixels
    float GapOpacity = 0.5f;
    bool bSkipInvisible = true;  ///< false issues every draw, also those that cannot touch a pixel
    bool bMergeDenseRows = true; ///< false draws every row by itself also where a strip of them would be quicker
};

/// Draws traces in three passes, each over all traces: lines with their gaps, sample points, bars from minimum to
/// maximum. The samples lie in textures; each instance of a draw fetches its own. An instance is one row, or, with a
/// software renderer and where rows stand close together, a strip of pixel columns. Owned by a subplot render type;
/// render thread. A pass whose program is missing is left out.
class VTracePasses
{
public:
    void Initialise(CoreGraphics::Resources& i_rResources);

    /// View, projection and viewport are those of the context.
    void Draw(CoreGraphics::RenderContext& i_rContext, TQL::ITraceDataProvider& i_rProvider,
              const TraceDrawList& i_rList, const TracePassSettings& i_rSettings);

private:
    using Program = std::shared_ptr<CoreGraphics::VShaderProgram>;
    struct Frame;

    void DrawLines(Frame& i_rFrame);
    void DrawPoints(Frame& i_rFrame);
    void DrawBars(Frame& i_rFrame);
    void DrawLineStrips(Frame& i_rFrame, const TraceDraw& i_rDraw, int i_StripWidth);
    void DrawBarStrips(Frame& i_rFrame, const TraceDraw& i_rDraw, int i_StripWidth);
    int ChooseStripWidth(const Frame& i_rFrame, const TraceDraw& i_rDraw, const Program& i_rpProgram) const;

    Program m_pBarsProgram;
    Program m_pLinesProgram;
    Program m_pPointsProgram;
    Program m_pBarStripsProgram;
    Program m_pLineStripsProgram;
    CoreGraphics::VertexBuffer m_UnitQuad;
    CoreGraphics::VertexBuffer m_SinglePoint;
    CoreGraphics::VertexBuffer m_MiddleLine;
    bool m_bCanMerge = false; // whether strips pay with this renderer
};

/// Alpha blending without depth test, the alpha channel left alone: for everything that a graph draws.
CoreGraphics::RenderState GraphRenderState();

} // namespace GraphPlotUI
