#pragma once

#include "GraphPlotUI/Axes/VAxisRenderType.h"

namespace GraphPlotUI
{

/// A vertical axis with the values of one subplot. QML type ValueAxisRenderType of Zarvo.GraphPlot; owned by the QML
/// scene. Its ticks follow the range itself. Threads as in the base.
class VValueAxisRenderType : public VAxisRenderType
{
    Q_OBJECT

public:
    explicit VValueAxisRenderType(QQuickItem* i_pParent = nullptr);
    ~VValueAxisRenderType() override;

    void Render(CoreGraphics::RenderContext& i_rContext) override;

    void RebuildTicks() override;
    float TickEndCoordinate(double i_Length, bool i_bExtended) const override;
    QVector2D MakeVertex(float i_Along, float i_Across) const override { return {i_Across, i_Along}; }
    void UpdateViewMatrix() override;
};

} // namespace GraphPlotUI
