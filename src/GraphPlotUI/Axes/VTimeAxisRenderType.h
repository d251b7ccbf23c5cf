#pragma once

#include "GraphPlotUI/Axes/VAxisRenderType.h"

namespace GraphPlotUI
{

/// The horizontal axis with the time, in frames, that all subplots of a window share. QML type TimeAxisRenderType of
/// Zarvo.GraphPlot; owned by the QML scene. Its ticks are laid out once a zoom from zero and moved by a translation, so
/// the first tick and the latest frame change in Render; their signals reach QML by queued delivery.
class VTimeAxisRenderType : public VAxisRenderType
{
    Q_OBJECT
    Q_PROPERTY(qlonglong latestFrameIndex READ GetLatestFrameIndex NOTIFY LatestFrameIndexChanged)

public:
    explicit VTimeAxisRenderType(QQuickItem* i_pParent = nullptr);
    ~VTimeAxisRenderType() override;

    /// Draws nothing without a trace data provider.
    void Render(CoreGraphics::RenderContext& i_rContext) override;

    /// As of the last frame drawn in a live context; 0 otherwise.
    qlonglong GetLatestFrameIndex() const { return m_LatestFrameIndex; }

    void RebuildTicks() override;
    float TickEndCoordinate(double i_Length, bool i_bExtended) const override;
    QVector2D MakeVertex(float i_Along, float i_Across) const override { return {i_Along, i_Across}; }
    void UpdateViewMatrix() override;

Q_SIGNALS:
    void LatestFrameIndexChanged();

private:
    std::atomic<qlonglong> m_LatestFrameIndex{0}; // written on the render thread
};

} // namespace GraphPlotUI
