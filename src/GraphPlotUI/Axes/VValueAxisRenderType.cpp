#include "GraphPlotUI/Axes/VValueAxisRenderType.h"

#include <cmath>
#include <utility>

namespace GraphPlotUI
{

namespace
{

// The axis line of the far edge stands on the very edge of the viewport, where rounding decides whether it is clipped.
constexpr double EdgeInset = 1.0 / 64.0;

} // namespace

VValueAxisRenderType::VValueAxisRenderType(QQuickItem* i_pParent) : VAxisRenderType(i_pParent)
{
    connect(this, &VBaseGraphRenderType::ScreenRectChanged, this, [this] { SetPixelLength(GetScaledRect().height()); });
}

VValueAxisRenderType::~VValueAxisRenderType() = default;

void VValueAxisRenderType::RebuildTicks()
{
    UpdateViewMatrix();
    const AxisRange& rRange = GetRange();
    VertexList vertices;
    AppendAxisLine(rRange.Minimum, rRange.Maximum, vertices);
    AppendTicks(rRange, vertices);
    SetTicks(std::move(vertices));
    const double major = GetMajorDivisionSize();
    if (StoreMajorTickStart(rRange.Minimum - major - std::fmod(rRange.Minimum, major)))
        Q_EMIT MajorTickStartChanged();
    Q_EMIT TicksChanged();
}

float VValueAxisRenderType::TickEndCoordinate(double i_Length, bool i_bExtended) const
{
    const QRectF& rRect = GetScaledRect();
    const double farEdge = rRect.x() + rRect.width();
    if (GetTicksOnFarEdge()) // the base line is moved half a pixel, onto the last column
        return static_cast<float>(i_bExtended ? farEdge - i_Length : farEdge - 0.5);
    return static_cast<float>(i_bExtended ? rRect.x() + i_Length : rRect.x());
}

void VValueAxisRenderType::UpdateViewMatrix()
{
    const AxisRange& rRange = GetRange();
    QMatrix4x4 view;
    view.scale(1.0f, static_cast<float>(rRange.PixelsPerUnit()), 1.0f);
    view.translate(static_cast<float>(0.5 - EdgeInset - GetScaledRect().x()),
                   static_cast<float>(0.5 * rRange.UnitsPerPixel() - rRange.Minimum), 0.0f);
    SetView(view);
}

void VValueAxisRenderType::Render(CoreGraphics::RenderContext& i_rContext)
{
    if (isVisible() && IsInitialised())
        DrawTicks(i_rContext, GetView());
}

} // namespace GraphPlotUI
