#include "GraphPlotUI/Axes/VAxisRenderType.h"

#include "CoreGraphics/RenderContext.h"
#include "CoreGraphics/Resources.h"
#include "GraphPlotUI/Traces/VTracePasses.h"

#include <QtGui/QVector4D>

#include <cmath>
#include <utility>

namespace GraphPlotUI
{

namespace
{

constexpr EDivisionMode DivisionMode = EDivisionMode::MajorAndMinor;
constexpr CoreGraphics::NameHash FlatColour = CoreGraphics::HashName("u_colour");
const QVector4D TickColour(1.0f, 1.0f, 1.0f, 1.0f);

} // namespace

VAxisRenderType::VAxisRenderType(QQuickItem* i_pParent)
    : VBaseGraphRenderType(i_pParent), m_RenderState(GraphRenderState())
{
}

VAxisRenderType::~VAxisRenderType() = default;

void VAxisRenderType::Initialise(std::shared_ptr<CoreGraphics::Resources> i_pResources)
{
    if (IsInitialised())
        return;
    m_pFlatProgram = i_pResources->GetProgram("Simple3DPointSize", "UniformColour");
    VBaseGraphRenderType::Initialise(std::move(i_pResources));
}

void VAxisRenderType::SetTicksOnFarEdge(bool i_bFarEdge)
{
    if (m_bTicksOnFarEdge == i_bFarEdge)
        return;
    m_bTicksOnFarEdge = i_bFarEdge;
    Q_EMIT TicksOnFarEdgeChanged();
    RebuildTicks();
}

void VAxisRenderType::SetMajorTickLength(double i_Length)
{
    if (m_MajorTickLength == i_Length)
        return;
    m_MajorTickLength = i_Length;
    Q_EMIT TickLengthChanged();
    RebuildTicks();
}

void VAxisRenderType::SetValueRange(const QPointF& i_rRange)
{
    if (!std::isfinite(i_rRange.x()) || !std::isfinite(i_rRange.y()) || !(i_rRange.x() < i_rRange.y()) ||
        (m_Range.Minimum == i_rRange.x() && m_Range.Maximum == i_rRange.y()))
        return;
    m_Range.SetRange(i_rRange.x(), i_rRange.y());
    Q_EMIT ValueRangeChanged();
    RebuildTicks();
}

void VAxisRenderType::AppendTicks(const AxisRange& i_rRange, VertexList& o_rVertices)
{
    const float majorEnd = TickEndCoordinate(m_MajorTickLength, true);
    const float minorEnd = TickEndCoordinate(0.5 * m_MajorTickLength, true);
    const float base = TickEndCoordinate(m_MajorTickLength, false);
    DivideRange(
        i_rRange, DivisionMode,
        [&](float i_Value, bool i_bIsMajor)
        {
            o_rVertices.push_back(MakeVertex(i_Value, i_bIsMajor ? majorEnd : minorEnd));
            o_rVertices.push_back(MakeVertex(i_Value, base));
        },
        m_MajorDivision, m_MinorDivision, m_MinorFade);
    m_MinorAlpha = MinorAlpha(m_MinorFade);
}

void VAxisRenderType::AppendAxisLine(double i_First, double i_Last, VertexList& o_rVertices) const
{
    const float base = TickEndCoordinate(m_MajorTickLength, false);
    o_rVertices.push_back(MakeVertex(static_cast<float>(i_First), base));
    o_rVertices.push_back(MakeVertex(static_cast<float>(i_Last), base));
}

void VAxisRenderType::SetTicks(VertexList i_Vertices)
{
    m_Ticks.Set(std::move(i_Vertices));
    MarkChanged();
}

void VAxisRenderType::SetPixelLength(double i_ScaledLength)
{
    m_Range.SetPixelLength(qRound(i_ScaledLength) - 1);
    RebuildTicks();
}

void VAxisRenderType::DrawTicks(CoreGraphics::RenderContext& i_rContext, const QMatrix4x4& i_rView)
{
    i_rContext.SetViewport(GetViewport());
    i_rContext.SetProjection(GetProjection());
    i_rContext.SetView(i_rView);
    if (!i_rContext.UseProgram(m_pFlatProgram))
        return;
    i_rContext.ApplyRenderState(m_RenderState);
    m_pFlatProgram->SetUniform(m_pFlatProgram->UniformLocation(FlatColour), TickColour);
    m_Ticks.Draw(i_rContext, GL_LINES);
}

} // namespace GraphPlotUI
