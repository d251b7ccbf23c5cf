#pragma once

#include "CoreGraphics/RenderState.h"
#include "GraphPlotUI/Frame/VBaseGraphRenderType.h"
#include "GraphPlotUI/Geometry/AxisRange.h"
#include "GraphPlotUI/Geometry/TraceGeometry.h"

#include <QtCore/QPointF>

#include <atomic>

namespace CoreGraphics
{
class VShaderProgram;
}

namespace GraphPlotUI
{

/// What the time axis and the value axes share: an axis line and tick marks in the graph window's framebuffer, and the
/// divisions as properties, from which QML makes the labels. Owned by the QML scene. Properties and ticks on the GUI
/// thread between frames, Initialise and Render on the render thread.
class VAxisRenderType : public VBaseGraphRenderType
{
    Q_OBJECT
    Q_PROPERTY(bool ticksOnFarEdge READ GetTicksOnFarEdge WRITE SetTicksOnFarEdge NOTIFY TicksOnFarEdgeChanged)
    Q_PROPERTY(double majorTickLength READ GetMajorTickLength WRITE SetMajorTickLength NOTIFY TickLengthChanged)
    Q_PROPERTY(QPointF valueRange READ GetValueRange WRITE SetValueRange NOTIFY ValueRangeChanged)
    Q_PROPERTY(double majorDivisionSize READ GetMajorDivisionSize NOTIFY TicksChanged)
    Q_PROPERTY(double minorDivisionSize READ GetMinorDivisionSize NOTIFY TicksChanged)
    Q_PROPERTY(double majorTickStart READ GetMajorTickStart NOTIFY MajorTickStartChanged)
    Q_PROPERTY(double pixelsPerUnit READ GetPixelsPerUnit NOTIFY TicksChanged)
    Q_PROPERTY(float minorAlpha READ GetMinorAlpha NOTIFY TicksChanged)

public:
    explicit VAxisRenderType(QQuickItem* i_pParent = nullptr);
    ~VAxisRenderType() override;

    void Initialise(std::shared_ptr<CoreGraphics::Resources> i_pResources) override;

    bool GetTicksOnFarEdge() const { return m_bTicksOnFarEdge; }
    void SetTicksOnFarEdge(bool i_bFarEdge);

    /// Framebuffer pixels; minor ticks are half as long.
    double GetMajorTickLength() const { return m_MajorTickLength; }
    void SetMajorTickLength(double i_Length);

    /// x is the minimum, y the maximum. Ignored when not finite or empty.
    QPointF GetValueRange() const { return {m_Range.Minimum, m_Range.Maximum}; }
    void SetValueRange(const QPointF& i_rRange);

    /// In axis units; those of the last range that could be divided.
    double GetMajorDivisionSize() const { return m_MajorDivision; }
    double GetMinorDivisionSize() const { return m_MinorDivision; }

    /// The first major tick, one or two majors below the range.
    double GetMajorTickStart() const { return m_MajorTickStart; }

    double GetPixelsPerUnit() const { return m_Range.PixelsPerUnit(); }
    float GetMinorAlpha() const { return m_MinorAlpha; }

    /// The axis line and the ticks: pairs of vertices for GL_LINES.
    const VertexList& GetTickVertices() const { return m_Ticks.Vertices(); }

    virtual void RebuildTicks() = 0;
    /// The pixel coordinate across the axis of a tick's end, or of its base on the axis line.
    virtual float TickEndCoordinate(double i_Length, bool i_bExtended) const = 0;
    virtual QVector2D MakeVertex(float i_Along, float i_Across) const = 0;
    virtual void UpdateViewMatrix() = 0;

Q_SIGNALS:
    void TicksOnFarEdgeChanged();
    void TickLengthChanged();
    void ValueRangeChanged();
    void TicksChanged();
    void MajorTickStartChanged();

protected:
    /// Appends the tick of each division of a range and takes over its divisions; on a range that cannot be divided
    /// they stay.
    void AppendTicks(const AxisRange& i_rRange, VertexList& o_rVertices);
    void AppendAxisLine(double i_First, double i_Last, VertexList& o_rVertices) const;
    void SetTicks(VertexList i_Vertices);
    void SetPixelLength(double i_ScaledLength);
    /// True when it changed.
    bool StoreMajorTickStart(double i_Start) { return m_MajorTickStart.exchange(i_Start) != i_Start; }
    void DrawTicks(CoreGraphics::RenderContext& i_rContext, const QMatrix4x4& i_rView);

    const AxisRange& GetRange() const { return m_Range; }
    const QMatrix4x4& GetView() const { return m_View; }
    void SetView(const QMatrix4x4& i_rView) { m_View = i_rView; }

private:
    std::shared_ptr<CoreGraphics::VShaderProgram> m_pFlatProgram;
    CoreGraphics::RenderState m_RenderState;
    QMatrix4x4 m_View;
    TraceGeometry m_Ticks;
    AxisRange m_Range;
    double m_MajorDivision = 1.0;
    double m_MinorDivision = 1.0;
    double m_MajorTickLength = 10.0;
    std::atomic<double> m_MajorTickStart{0.0}; // written on the render thread by the time axis
    double m_MinorFade = 1.0;
    float m_MinorAlpha = 1.0f;
    bool m_bTicksOnFarEdge = true;
};

} // namespace GraphPlotUI
