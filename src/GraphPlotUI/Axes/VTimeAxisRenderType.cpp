#include "GraphPlotUI/Axes/VTimeAxisRenderType.h"

#include "GraphPlotSystem/Traces/ITraceDataProvider.h"

#include <utility>

namespace GraphPlotUI
{

VTimeAxisRenderType::VTimeAxisRenderType(QQuickItem* i_pParent) : VAxisRenderType(i_pParent)
{
    connect(this, &VBaseGraphRenderType::ScreenRectChanged, this, [this] { SetPixelLength(GetScaledRect().width()); });
}

VTimeAxisRenderType::~VTimeAxisRenderType() = default;

void VTimeAxisRenderType::RebuildTicks()
{
    UpdateViewMatrix();
    const AxisRange fromZero{0.0, GetRange().Length(), GetRange().PixelLength};
    VertexList vertices;
    AppendTicks(fromZero, vertices);
    AppendAxisLine(0.0, fromZero.Maximum + 2.0 * GetMajorDivisionSize(), vertices);
    SetTicks(std::move(vertices));
    Q_EMIT TicksChanged();
}

float VTimeAxisRenderType::TickEndCoordinate(double i_Length, bool i_bExtended) const
{
    const QRectF& rRect = GetScaledRect();
    if (GetTicksOnFarEdge())
        return static_cast<float>(i_bExtended ? rRect.y() + i_Length : rRect.y());
    const double base = rRect.y() + rRect.height();
    return static_cast<float>(i_bExtended ? base - i_Length : base);
}

void VTimeAxisRenderType::UpdateViewMatrix()
{
    const AxisRange& rRange = GetRange();
    QMatrix4x4 view;
    view.scale(static_cast<float>(rRange.PixelsPerUnit()), 1.0f, 1.0f);
    view.translate(static_cast<float>(0.5 * rRange.UnitsPerPixel() - rRange.Minimum),
                   static_cast<float>(-0.5 - GetScaledRect().y()), 0.0f);
    SetView(view);
}

void VTimeAxisRenderType::Render(CoreGraphics::RenderContext& i_rContext)
{
    if (!isVisible() || !IsInitialised())
        return;
    const auto pProvider = LockTraceDataProvider();
    if (!pProvider)
        return;
    const qlonglong latest = IsLiveContext() ? static_cast<qlonglong>(pProvider->GetLatestFrameIndex()) : 0;
    if (m_LatestFrameIndex.exchange(latest) != latest)
        QMetaObject::invokeMethod(this, &VTimeAxisRenderType::LatestFrameIndexChanged, Qt::QueuedConnection);

    double firstTick = 0.0;
    QVector3D translation;
    PanOffset(GetRange(), IsLiveContext(), IsRelativeTimeDisplay(), static_cast<double>(latest), GetMajorDivisionSize(),
              firstTick, translation);
    QMatrix4x4 view = GetView();
    view.translate(translation);
    DrawTicks(i_rContext, view);
    if (StoreMajorTickStart(firstTick))
        QMetaObject::invokeMethod(this, &VAxisRenderType::MajorTickStartChanged, Qt::QueuedConnection);
}

} // namespace GraphPlotUI
