#pragma once

#include "GraphPlotUI/Traces/TraceStrips.h"
#include "GraphPlotUI/Traces/TraceUniformBlock.h"
#include "GraphPlotUI/Traces/VTracePasses.h"

#include <QtGui/QVector2D>
#include <QtGui/qopengl.h>

#include <optional>

namespace GraphPlotUI
{

/// One subplot's traces in one frame, while VTracePasses draws them: which rows of a trace have to be drawn, and the
/// program in use. Lives for one call of Draw, on the render thread.
struct VTracePasses::Frame
{
    CoreGraphics::RenderContext& rContext;
    TQL::ITraceDataProvider& rProvider;
    const TraceDrawList& rList;
    const TracePassSettings& rSettings;

    float RowDistance(const TraceDraw& i_rDraw) const; ///< pixels
    RowRange Rows(const TraceDraw& i_rDraw) const;
    RowRange Segments(const TraceDraw& i_rDraw, int i_LongestStep) const;
    RowRange GapSegments(const TraceDraw& i_rDraw) const;
    RowRange Strips(const TraceDraw& i_rDraw, const StripLayout& i_rLayout) const;

    /// Uses a program for the draws that follow, with what is the same for all traces. False when it cannot be used.
    bool Begin(const Program& i_rpProgram, CoreGraphics::VertexBuffer& i_rBuffer);
    /// Binds a trace's texture and sets what belongs to the trace. False without a texture.
    bool BeginTrace(const TraceDraw& i_rDraw);
    void DrawInstances(GLenum i_Mode, int i_VertexCount, const RowRange& i_rInstances);

    template <typename T>
    void Set(ETraceUniform i_Uniform, const T& i_rValue)
    {
        Uniforms->Set(i_Uniform, i_rValue);
    }

    Program pProgram{};                          ///< in use, empty at first
    std::optional<TraceUniformBlock> Uniforms{}; ///< of the program in use
    Colour4f LastColour{0.0f, 0.0f, 0.0f, 1.0f}; ///< for a trace without a colour of its own
};

} // namespace GraphPlotUI
