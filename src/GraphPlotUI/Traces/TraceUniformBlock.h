#pragma once

#include "CoreGraphics/VShaderProgram.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>

namespace GraphPlotUI
{

/// The uniforms of the trace shaders. The names stand in TraceUniformBlock.cpp, in the same order.
enum class ETraceUniform : std::uint8_t
{
    Trace, ///< the sampler
    TraceColour,
    AxisRangeX,
    AxisRangeY,
    ValueRange,
    FillOpacity,
    LodScale,
    RectSize,
    ComponentIndex,
    DrawGaps,
    LineThickness,
    GapOpacity,
    CircleBufferStart,
    CircleBufferCapacity,
    FirstInstance, ///< added to gl_InstanceID
    RowCount,      ///< of the ring
    StripWidth,    ///< pixels
    Count
};

/// Where one program keeps the uniforms of the trace shaders: looked up by hashes made at compile time, once a pass.
/// Lives for one pass, on the render thread, with its program in use.
class TraceUniformBlock
{
public:
    explicit TraceUniformBlock(std::shared_ptr<CoreGraphics::VShaderProgram> i_pProgram);

    /// -1 for a uniform that the program does not use.
    int Location(ETraceUniform i_Uniform) const { return m_Locations[static_cast<std::size_t>(i_Uniform)]; }

    /// No effect for a uniform that the program does not use. int, float, QSize, QVector2D, QVector4D.
    template <typename T>
    void Set(ETraceUniform i_Uniform, const T& i_rValue)
    {
        m_pProgram->SetUniform(Location(i_Uniform), i_rValue);
    }

private:
    std::shared_ptr<CoreGraphics::VShaderProgram> m_pProgram;
    std::array<std::int32_t, static_cast<std::size_t>(ETraceUniform::Count)> m_Locations;
};

} // namespace GraphPlotUI
