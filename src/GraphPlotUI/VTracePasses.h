#pragma once

#include "CoreGraphics/RenderState.h"
#include "CoreGraphics/VertexBuffer.h"
#include "GraphPlotUI/TraceDrawList.h"

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
    bool bSkipInvisible = true; ///< false issues every draw, also those that cannot touch a pixel
};

/// Draws traces in three passes, each over all traces: lines with their gaps, sample points, bars from minimum to
/// maximum. The samples lie in textures; each instance of a draw fetches its own. Owned by a subplot render type; render
/// thread. A pass whose program is missing is left out.
class VTracePasses
{
public:
    void Initialise(CoreGraphics::Resources& i_rResources);

    /// View, projection and viewport are those of the context.
    void Draw(CoreGraphics::RenderContext& i_rContext, TQL::ITraceDataProvider& i_rProvider,
              const TraceDrawList& i_rList, const TracePassSettings& i_rSettings);

private:
    struct Frame;

    void DrawLines(const Frame& i_rFrame);
    void DrawPoints(const Frame& i_rFrame);
    void DrawBars(const Frame& i_rFrame);
    bool BeginPass(const Frame& i_rFrame, const std::shared_ptr<CoreGraphics::VShaderProgram>& i_rpProgram,
                   CoreGraphics::VertexBuffer& i_rBuffer);
    bool BeginTrace(const Frame& i_rFrame, const TraceDraw& i_rDraw, TraceUniformBlock& o_rUniforms);

    std::shared_ptr<CoreGraphics::VShaderProgram> m_pBarsProgram;
    std::shared_ptr<CoreGraphics::VShaderProgram> m_pLinesProgram;
    std::shared_ptr<CoreGraphics::VShaderProgram> m_pPointsProgram;
    CoreGraphics::VertexBuffer m_UnitQuad;
    CoreGraphics::VertexBuffer m_SinglePoint;
};

/// Alpha blending without depth test, the alpha channel left alone: for everything that a graph draws.
CoreGraphics::RenderState GraphRenderState();

} // namespace GraphPlotUI
