#pragma once

#include "GraphPlotUI/Frame/VBaseGraphRenderType.h"
#include "GraphPlotUI/Geometry/SubplotGeometry.h"
#include "GraphPlotUI/Traces/VTracePasses.h"

#include <QtCore/QPointF>
#include <QtCore/QVariant>
#include <QtGui/QColor>

#include <vector>

namespace GraphPlotUI
{

/// Draws one subplot: background, grid, zero lines, overlays behind and in front of the traces, and the traces with
/// their gaps, points and bars. QML type SubplotRenderType of Zarvo.GraphPlot, owned by the QML scene. Properties and
/// the geometry that follows from them on the GUI thread between frames, Initialise and Render on the render thread.
class VSubplotRenderType : public VBaseGraphRenderType
{
    Q_OBJECT
    Q_PROPERTY(QPointF valueRangeX READ GetValueRangeX WRITE SetValueRangeX NOTIFY ValueRangeXChanged)
    Q_PROPERTY(QPointF valueRangeY READ GetValueRangeY WRITE SetValueRangeY NOTIFY ValueRangeYChanged)
    Q_PROPERTY(QVariant overlays READ GetOverlays WRITE SetOverlays NOTIFY OverlaysChanged)
    Q_PROPERTY(QVariant traceIds READ GetTraceIds WRITE SetTraceIds NOTIFY TraceIdsChanged)
    Q_PROPERTY(float gapOpacity READ GetGapOpacity WRITE SetGapOpacity NOTIFY GapOpacityChanged)
    Q_PROPERTY(QColor backgroundColor READ GetBackgroundColor WRITE SetBackgroundColor NOTIFY BackgroundColorChanged)
    Q_PROPERTY(bool drawMinorGrid READ GetDrawMinorGrid WRITE SetDrawMinorGrid NOTIFY GridPropertyChanged)
    Q_PROPERTY(bool drawMajorGrid READ GetDrawMajorGrid WRITE SetDrawMajorGrid NOTIFY GridPropertyChanged)
    Q_PROPERTY(bool drawZero READ GetDrawZero WRITE SetDrawZero NOTIFY GridPropertyChanged)

public:
    explicit VSubplotRenderType(QQuickItem* i_pParent = nullptr);
    ~VSubplotRenderType() override;

    void Initialise(std::shared_ptr<CoreGraphics::Resources> i_pResources) override;
    void Render(CoreGraphics::RenderContext& i_rContext) override;

    /// x is the minimum, y the maximum, in frames relative to the latest frame of a live context, else in frames.
    /// Ignored when not finite or empty.
    QPointF GetValueRangeX() const { return {m_RangeX.Minimum, m_RangeX.Maximum}; }
    void SetValueRangeX(const QPointF& i_rRange);

    /// x is the minimum, y the maximum, in the unit of the traces. Ignored when NaN or empty; infinite values pass.
    QPointF GetValueRangeY() const { return {m_RangeY.Minimum, m_RangeY.Maximum}; }
    void SetValueRangeY(const QPointF& i_rRange);

    /// Holds a std::vector<TQL::IGraphPlotOverlay>; anything else leaves the overlays that are shown.
    QVariant GetOverlays() const { return m_Overlays; }
    void SetOverlays(const QVariant& i_rOverlays);

    /// Holds a list of variants; those that are no TQL::ITraceId are left out. The setter emits no signal.
    QVariant GetTraceIds() const { return m_TraceIds; }
    void SetTraceIds(const QVariant& i_rTraceIds);
    const std::vector<TQL::ITraceId>& GetTraces() const { return m_Traces; }

    float GetGapOpacity() const { return m_GapOpacity; }
    void SetGapOpacity(float i_Opacity);
    QColor GetBackgroundColor() const;
    void SetBackgroundColor(const QColor& i_rColour);
    bool GetDrawMinorGrid() const { return m_bDrawMinorGrid; }
    void SetDrawMinorGrid(bool i_bDraw) { SetGridProperty(m_bDrawMinorGrid, i_bDraw); }
    bool GetDrawMajorGrid() const { return m_bDrawMajorGrid; }
    void SetDrawMajorGrid(bool i_bDraw) { SetGridProperty(m_bDrawMajorGrid, i_bDraw); }
    bool GetDrawZero() const { return m_bDrawZero; }
    void SetDrawZero(bool i_bDraw) { SetGridProperty(m_bDrawZero, i_bDraw); }

    /// A TQL::IChannelInstanceId or a TQL::ITraceId; anything else takes the focus away.
    Q_INVOKABLE void setFocusChannelOrTraceId(const QVariant& i_rChannelOrTraceId);
    const TraceFocus& GetFocus() const { return m_Focus; }

    /// Whether draws that cannot touch a pixel are left out; the picture is the same either way. On by default, off to
    /// compare the two.
    void SetSkipInvisibleDraws(bool i_bSkip)
    {
        m_bSkipInvisibleDraws = i_bSkip;
        MarkChanged();
    }

    /// Whether a software renderer gets strips instead of single rows where rows stand close together; the picture is
    /// the same but for rounding. On by default, off to compare the two.
    void SetMergeDenseRows(bool i_bMerge)
    {
        m_bMergeDenseRows = i_bMerge;
        MarkChanged();
    }

Q_SIGNALS:
    void ValueRangeXChanged();
    void ValueRangeYChanged();
    void OverlaysChanged();
    void TraceIdsChanged();
    void GapOpacityChanged();
    void BackgroundColorChanged();
    void GridPropertyChanged();

private:
    /// An overlay with what is drawn of it.
    struct SubplotOverlay
    {
        TQL::IGraphPlotOverlay Overlay;
        TraceGeometry Fill;
        TraceGeometry Outline;
    };
    using OverlayList = std::vector<SubplotOverlay>;

    void OnScreenRectChanged();
    void SetGridProperty(bool& o_rProperty, bool i_bValue);
    void RebuildGeometry();
    void RebuildOverlays(OverlayList& io_rOverlays) const;

    void DrawFlat(CoreGraphics::RenderContext& i_rContext, TraceGeometry& i_rGeometry, const QVector4D& i_rColour,
                  GLenum i_Mode);
    void DrawBackground(CoreGraphics::RenderContext& i_rContext);
    void DrawGrid(CoreGraphics::RenderContext& i_rContext, double i_Offset);
    void DrawZeroLines(CoreGraphics::RenderContext& i_rContext);
    void DrawOverlays(CoreGraphics::RenderContext& i_rContext, OverlayList& i_rOverlays);
    void DrawTraces(CoreGraphics::RenderContext& i_rContext, TQL::ITraceDataProvider& i_rProvider, double i_Offset);

    std::shared_ptr<CoreGraphics::VShaderProgram> m_pFlatProgram;
    std::shared_ptr<CoreGraphics::VShaderProgram> m_pStippleProgram;
    VTracePasses m_TracePasses;
    QMatrix4x4 m_View;
    TraceGeometry m_Background;
    TraceGeometry m_ZeroLineX;
    TraceGeometry m_ZeroLineY;
    TraceGeometry m_MajorGrid;
    TraceGeometry m_MinorGridX;
    TraceGeometry m_MinorGridY;
    QVector4D m_BackgroundColour{0.0f, 0.0f, 0.0f, 1.0f};
    QVector4D m_MinorColourX;
    QVector4D m_MinorColourY;
    AxisRange m_RangeX;
    AxisRange m_RangeY;
    QVariant m_Overlays;
    QVariant m_TraceIds;
    std::vector<TQL::ITraceId> m_Traces;
    TraceFocus m_Focus;
    double m_MajorDivisionX = 1.0;
    float m_GapOpacity = 0.5f;
    bool m_bDrawMinorGrid = true;
    bool m_bDrawMajorGrid = true;
    bool m_bDrawZero = true;
    bool m_bSkipInvisibleDraws = true;
    bool m_bMergeDenseRows = true;
    OverlayList m_FrontOverlays;
    OverlayList m_BehindOverlays;
};

} // namespace GraphPlotUI
