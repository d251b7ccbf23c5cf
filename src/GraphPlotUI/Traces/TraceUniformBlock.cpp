#include "GraphPlotUI/Traces/TraceUniformBlock.h"

#include "CoreGraphics/NameHash.h"

#include <algorithm>
#include <utility>

namespace GraphPlotUI
{

namespace
{

constexpr std::array<CoreGraphics::NameHash, static_cast<std::size_t>(ETraceUniform::Count)> NameHashes{
    CoreGraphics::HashName("t_Trace"),
    CoreGraphics::HashName("u_TraceColour"),
    CoreGraphics::HashName("u_AxisRangeX"),
    CoreGraphics::HashName("u_AxisRangeY"),
    CoreGraphics::HashName("u_ValueRange"),
    CoreGraphics::HashName("u_FillOpacity"),
    CoreGraphics::HashName("u_LodScale"),
    CoreGraphics::HashName("u_RectSize"),
    CoreGraphics::HashName("u_ComponentIndex"),
    CoreGraphics::HashName("u_DrawGaps"),
    CoreGraphics::HashName("u_LineThickness"),
    CoreGraphics::HashName("u_GapOpacity"),
    CoreGraphics::HashName("u_CircleBufferStart"),
    CoreGraphics::HashName("u_CircleBufferCapacity"),
    CoreGraphics::HashName("u_FirstInstance"),
    CoreGraphics::HashName("u_RowCount"),
    CoreGraphics::HashName("u_StripWidth"),
};

} // namespace

TraceUniformBlock::TraceUniformBlock(std::shared_ptr<CoreGraphics::VShaderProgram> i_pProgram)
    : m_pProgram(std::move(i_pProgram))
{
    std::transform(NameHashes.begin(), NameHashes.end(), m_Locations.begin(),
                   [this](CoreGraphics::NameHash i_Hash) { return m_pProgram->UniformLocation(i_Hash); });
}

} // namespace GraphPlotUI
