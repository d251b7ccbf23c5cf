#include "GraphPlotUI/Frame/VBaseGraphRenderType.h"

#include "TQL/NearlyEqual.h"

#include <cstdint>
#include <limits>
#include <utility>

namespace GraphPlotUI
{
namespace
{

constexpr double c_MaximumLength = std::numeric_limits<std::int32_t>::max();

bool IsUsableLength(double i_Length)
{
    return i_Length > 1.0 && i_Length <= c_MaximumLength; // false for NaN too
}

bool IsSameRect(const QRectF& i_rA, const QRectF& i_rB)
{
    return TQL::NearlyEqual(i_rA.x(), i_rB.x()) && TQL::NearlyEqual(i_rA.y(), i_rB.y()) &&
           TQL::NearlyEqual(i_rA.width(), i_rB.width()) && TQL::NearlyEqual(i_rA.height(), i_rB.height());
}

} // namespace

VBaseGraphRenderType::VBaseGraphRenderType(QQuickItem* i_pParent) : QQuickItem(i_pParent)
{
    connect(this, &QQuickItem::visibleChanged, this, &VBaseGraphRenderType::MarkChanged);
}

VBaseGraphRenderType::~VBaseGraphRenderType()
{
    if (m_DestroyedCallback)
        m_DestroyedCallback(this);
}

void VBaseGraphRenderType::SetDestroyedCallback(DestroyedCallback i_Callback)
{
    m_DestroyedCallback = std::move(i_Callback);
}

void VBaseGraphRenderType::Initialise(std::shared_ptr<CoreGraphics::Resources>)
{
    m_bInitialised = true;
}

void VBaseGraphRenderType::SetScreenRect(const QRectF& i_rRect)
{
    if (!IsUsableLength(i_rRect.width()) || !IsUsableLength(i_rRect.height()) || IsSameRect(m_ScreenRect, i_rRect))
        return;
    m_ScreenRect = i_rRect;
    UpdateScaledRect();
}

void VBaseGraphRenderType::SetDevicePixelRatio(double i_Ratio)
{
    if (m_DevicePixelRatio == i_Ratio)
        return;
    m_DevicePixelRatio = i_Ratio;
    UpdateScaledRect();
    Q_EMIT DevicePixelRatioChanged();
}

void VBaseGraphRenderType::UpdateScaledRect()
{
    m_ScaledRect = QRectF(m_ScreenRect.topLeft() * m_DevicePixelRatio, m_ScreenRect.size() * m_DevicePixelRatio);
    m_Projection.setToIdentity();
    m_Projection.ortho(QRectF(0.0, 0.0, m_ScaledRect.width(), m_ScaledRect.height()));
    MarkChanged();
    Q_EMIT ScreenRectChanged();
}

void VBaseGraphRenderType::SetLiveContext(bool i_bLive)
{
    if (m_bLiveContext == i_bLive)
        return;
    m_bLiveContext = i_bLive;
    MarkChanged();
    Q_EMIT LiveContextChanged();
}

void VBaseGraphRenderType::SetRelativeTimeDisplay(bool i_bRelative)
{
    if (m_bRelativeTimeDisplay == i_bRelative)
        return;
    m_bRelativeTimeDisplay = i_bRelative;
    MarkChanged();
    Q_EMIT RelativeTimeDisplayChanged();
}

void VBaseGraphRenderType::SetTraceDataProvider(std::weak_ptr<TQL::ITraceDataProvider> i_pProvider)
{
    m_pTraceDataProvider = std::move(i_pProvider);
    MarkChanged();
}

} // namespace GraphPlotUI
