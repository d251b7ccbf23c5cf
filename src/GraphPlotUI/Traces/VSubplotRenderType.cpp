#include "GraphPlotUI/Traces/VSubplotRenderType.h"

#include "CoreGraphics/RenderContext.h"
#include "CoreGraphics/Resources.h"
#include "GraphPlotSystem/Traces/ITraceDataProvider.h"

#include <QtQml/QJSValue>

#include <cmath>
#include <utility>

namespace GraphPlotUI
{

namespace
{

constexpr EDivisionMode DivisionMode = EDivisionMode::MajorAndMinor;
constexpr CoreGraphics::NameHash FlatColour = CoreGraphics::HashName("u_colour");
constexpr CoreGraphics::NameHash OutlineColour = CoreGraphics::HashName("u_ModelColour");
constexpr CoreGraphics::NameHash OutlineSource = CoreGraphics::HashName("u_SourcePoint");

const QVector4D ZeroLineColour(1.0f, 1.0f, 1.0f, 1.0f);
const QVector4D GridColour(0.5f, 0.5f, 0.5f, 1.0f);

bool IsSameRange(const AxisRange& i_rRange, const QPointF& i_rPoint)
{
    return i_rRange.Minimum == i_rPoint.x() && i_rRange.Maximum == i_rPoint.y();
}

QVector4D ToVector(const std::array<float, 4>& i_rColour)
{
    return {i_rColour[0], i_rColour[1], i_rColour[2], i_rColour[3]};
}

QVector4D WithAlpha(QVector4D i_Colour, float i_Alpha)
{
    i_Colour.setW(i_Alpha);
    return i_Colour;
}

QVariantList ToVariantList(const QVariant& i_rVariant)
{
    if (i_rVariant.metaType() == QMetaType::fromType<QJSValue>())
        return i_rVariant.value<QJSValue>().toVariant().toList();
    return i_rVariant.toList();
}

} // namespace

VSubplotRenderType::VSubplotRenderType(QQuickItem* i_pParent) : VBaseGraphRenderType(i_pParent)
{
    connect(this, &VBaseGraphRenderType::ScreenRectChanged, this, &VSubplotRenderType::OnScreenRectChanged);
    RebuildGeometry();
}

VSubplotRenderType::~VSubplotRenderType() = default;

void VSubplotRenderType::SetValueRangeX(const QPointF& i_rRange)
{
    if (!std::isfinite(i_rRange.x()) || !std::isfinite(i_rRange.y()) || !(i_rRange.x() < i_rRange.y()) ||
        IsSameRange(m_RangeX, i_rRange))
        return;
    m_RangeX.SetRange(i_rRange.x(), i_rRange.y());
    Q_EMIT ValueRangeXChanged();
    RebuildGeometry();
}

void VSubplotRenderType::SetValueRangeY(const QPointF& i_rRange)
{
    // The comparison is false for NaN.
    if (!(i_rRange.x() < i_rRange.y()) || IsSameRange(m_RangeY, i_rRange))
        return;
    m_RangeY.SetRange(i_rRange.x(), i_rRange.y());
    Q_EMIT ValueRangeYChanged();
    RebuildGeometry();
}

void VSubplotRenderType::SetOverlays(const QVariant& i_rOverlays)
{
    if (m_Overlays == i_rOverlays)
        return;
    m_Overlays = i_rOverlays;
    MarkChanged();
    using Records = std::vector<TQL::IGraphPlotOverlay>;
    if (i_rOverlays.canConvert<Records>())
    {
        m_FrontOverlays.clear();
        m_BehindOverlays.clear();
        for (TQL::IGraphPlotOverlay& rRecord : i_rOverlays.value<Records>())
        {
            OverlayList& rList = rRecord.bInFrontOfTraces ? m_FrontOverlays : m_BehindOverlays;
            rList.push_back({std::move(rRecord), {}, {}});
        }
        RebuildOverlays(m_FrontOverlays);
        RebuildOverlays(m_BehindOverlays);
    }
    Q_EMIT OverlaysChanged();
}

void VSubplotRenderType::SetTraceIds(const QVariant& i_rTraceIds)
{
    if (m_TraceIds == i_rTraceIds)
        return;
    m_TraceIds = i_rTraceIds;
    m_Traces.clear();
    for (const QVariant& rElement : ToVariantList(i_rTraceIds))
        if (rElement.canConvert<TQL::ITraceId>())
            m_Traces.push_back(rElement.value<TQL::ITraceId>());
    RebuildGeometry();
}

void VSubplotRenderType::SetGapOpacity(float i_Opacity)
{
    if (m_GapOpacity == i_Opacity)
        return;
    m_GapOpacity = i_Opacity;
    MarkChanged();
    Q_EMIT GapOpacityChanged();
}

QColor VSubplotRenderType::GetBackgroundColor() const
{
    return QColor::fromRgbF(m_BackgroundColour.x(), m_BackgroundColour.y(), m_BackgroundColour.z(),
                            m_BackgroundColour.w());
}

void VSubplotRenderType::SetBackgroundColor(const QColor& i_rColour)
{
    m_BackgroundColour = QVector4D(static_cast<float>(i_rColour.redF()), static_cast<float>(i_rColour.greenF()),
                                   static_cast<float>(i_rColour.blueF()), static_cast<float>(i_rColour.alphaF()));
    MarkChanged();
    Q_EMIT BackgroundColorChanged();
}

void VSubplotRenderType::SetGridProperty(bool& o_rProperty, bool i_bValue)
{
    if (o_rProperty == i_bValue)
        return;
    o_rProperty = i_bValue;
    MarkChanged();
    Q_EMIT GridPropertyChanged();
}

void VSubplotRenderType::setFocusChannelOrTraceId(const QVariant& i_rChannelOrTraceId)
{
    MarkChanged();
    m_Focus = {};
    if (i_rChannelOrTraceId.canConvert<TQL::IChannelInstanceId>())
        m_Focus.Channel = i_rChannelOrTraceId.value<TQL::IChannelInstanceId>();
    else if (i_rChannelOrTraceId.canConvert<TQL::ITraceId>())
        m_Focus.Trace = i_rChannelOrTraceId.value<TQL::ITraceId>();
}

void VSubplotRenderType::OnScreenRectChanged()
{
    m_RangeX.SetPixelLength(qRound(GetScaledRect().width()) - 1);
    m_RangeY.SetPixelLength(qRound(GetScaledRect().height()) - 1);
    RebuildGeometry();
}

void VSubplotRenderType::RebuildGeometry()
{
    MarkChanged();
    m_View = SubplotViewMatrix(m_RangeX, m_RangeY);
    m_Background.Set(BackgroundStrip(m_RangeX, m_RangeY));
    m_ZeroLineX.Set(ZeroLineStripX(m_RangeX, m_RangeY));
    m_ZeroLineY.Set(ZeroLineStripY(m_RangeX, m_RangeY));
    SubplotGrid grid = BuildSubplotGrid(m_RangeX, m_RangeY, DivisionMode, m_MajorDivisionX);
    m_MajorGrid.Set(std::move(grid.Major));
    m_MinorGridX.Set(std::move(grid.MinorX));
    m_MinorGridY.Set(std::move(grid.MinorY));
    m_MinorColourX = WithAlpha(GridColour, grid.MinorAlphaX);
    m_MinorColourY = WithAlpha(GridColour, grid.MinorAlphaY);
    RebuildOverlays(m_FrontOverlays);
    RebuildOverlays(m_BehindOverlays);
}

void VSubplotRenderType::RebuildOverlays(OverlayList& io_rOverlays) const
{
    for (SubplotOverlay& rOverlay : io_rOverlays)
    {
        rOverlay.Fill.Set(OverlayFill(rOverlay.Overlay, m_RangeX, m_RangeY));
        rOverlay.Outline.Set(OverlayOutline(rOverlay.Overlay, m_RangeX, m_RangeY));
    }
}

void VSubplotRenderType::Initialise(std::shared_ptr<CoreGraphics::Resources> i_pResources)
{
    if (IsInitialised())
        return;
    m_pFlatProgram = i_pResources->GetProgram("Simple3DPointSize", "UniformColour");
    m_pStippleProgram = i_pResources->GetProgram("ColoredLine", "StippledLine");
    m_TracePasses.Initialise(*i_pResources);
    VBaseGraphRenderType::Initialise(std::move(i_pResources));
}

void VSubplotRenderType::Render(CoreGraphics::RenderContext& i_rContext)
{
    if (!isVisible() || !IsInitialised())
        return;
    i_rContext.SetViewport(GetViewport());
    i_rContext.SetProjection(GetProjection());
    i_rContext.SetView(m_View);
    DrawBackground(i_rContext);

    const auto pProvider = LockTraceDataProvider();
    if (!pProvider)
        return;
    const double offset = IsLiveContext() ? static_cast<double>(pProvider->GetLatestFrameIndex()) : 0.0;
    DrawGrid(i_rContext, offset);
    DrawZeroLines(i_rContext);
    DrawOverlays(i_rContext, m_BehindOverlays);
    DrawTraces(i_rContext, *pProvider, offset);
    DrawOverlays(i_rContext, m_FrontOverlays);
}

void VSubplotRenderType::DrawFlat(CoreGraphics::RenderContext& i_rContext, TraceGeometry& i_rGeometry,
                                  const QVector4D& i_rColour, GLenum i_Mode)
{
    m_pFlatProgram->SetUniform(m_pFlatProgram->UniformLocation(FlatColour), i_rColour);
    i_rGeometry.Draw(i_rContext, i_Mode);
}

void VSubplotRenderType::DrawBackground(CoreGraphics::RenderContext& i_rContext)
{
    if (!i_rContext.UseProgram(m_pFlatProgram))
        return;
    i_rContext.ApplyRenderState(GraphRenderState());
    DrawFlat(i_rContext, m_Background, m_BackgroundColour, GL_TRIANGLE_STRIP);
}

void VSubplotRenderType::DrawGrid(CoreGraphics::RenderContext& i_rContext, double i_Offset)
{
    double firstTick = 0.0;
    QVector3D translation;
    PanOffset(m_RangeX, IsLiveContext(), IsRelativeTimeDisplay(), i_Offset, m_MajorDivisionX, firstTick, translation);
    QMatrix4x4 view = m_View;
    view.translate(translation);
    i_rContext.SetView(view);
    if (i_rContext.UseProgram(m_pFlatProgram))
    {
        if (m_bDrawMinorGrid)
        {
            DrawFlat(i_rContext, m_MinorGridX, m_MinorColourX, GL_LINES);
            DrawFlat(i_rContext, m_MinorGridY, m_MinorColourY, GL_LINES);
        }
        if (m_bDrawMajorGrid)
            DrawFlat(i_rContext, m_MajorGrid, GridColour, GL_LINES);
    }
    i_rContext.SetView(m_View);
}

void VSubplotRenderType::DrawZeroLines(CoreGraphics::RenderContext& i_rContext)
{
    if (!m_bDrawZero || !i_rContext.UseProgram(m_pFlatProgram))
        return;
    DrawFlat(i_rContext, m_ZeroLineX, ZeroLineColour, GL_TRIANGLE_STRIP);
    DrawFlat(i_rContext, m_ZeroLineY, ZeroLineColour, GL_TRIANGLE_STRIP);
}

void VSubplotRenderType::DrawOverlays(CoreGraphics::RenderContext& i_rContext, OverlayList& i_rOverlays)
{
    if (i_rOverlays.empty())
        return;
    if (i_rContext.UseProgram(m_pFlatProgram))
    {
        i_rContext.ApplyRenderState(GraphRenderState());
        for (SubplotOverlay& rOverlay : i_rOverlays)
            DrawFlat(i_rContext, rOverlay.Fill, ToVector(rOverlay.Overlay.FillColour), GL_TRIANGLE_STRIP);
    }
    if (i_rContext.UseProgram(m_pStippleProgram))
    {
        i_rContext.ApplyRenderState(GraphRenderState());
        const int colour = m_pStippleProgram->UniformLocation(OutlineColour);
        m_pStippleProgram->SetUniform(m_pStippleProgram->UniformLocation(OutlineSource), QVector4D());
        for (SubplotOverlay& rOverlay : i_rOverlays)
        {
            m_pStippleProgram->SetUniform(colour, ToVector(rOverlay.Overlay.OutlineColour));
            rOverlay.Outline.Draw(i_rContext, GL_TRIANGLES);
        }
    }
}

void VSubplotRenderType::DrawTraces(CoreGraphics::RenderContext& i_rContext, TQL::ITraceDataProvider& i_rProvider,
                                    double i_Offset)
{
    if (m_Traces.empty())
        return;
    const TracePassSettings settings{m_RangeY, GetScaledRect().size(), m_GapOpacity, m_bSkipInvisibleDraws,
                                     m_bMergeDenseRows};
    const TraceDrawList list = BuildTraceDrawList(i_rProvider, m_Traces, m_Focus, m_RangeX, i_Offset);
    m_TracePasses.Draw(i_rContext, i_rProvider, list, settings);
}

} // namespace GraphPlotUI
