#include "GraphPlotSystem/Time/VBaseGraphPlotTime.h"

#include <utility>

namespace GraphPlotUI
{

VBaseGraphPlotTime::VBaseGraphPlotTime(std::shared_ptr<TQL::IPostalService> i_pUiPostalService, QObject* i_pParent)
    : QObject(i_pParent)
    , m_pUiPostalService(std::move(i_pUiPostalService))
    , m_pFramePeriodChanged(std::make_shared<NotificationSystem::VChangeSignal>(m_pUiPostalService))
{
}

VBaseGraphPlotTime::Values VBaseGraphPlotTime::GetValues() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Values;
}

bool VBaseGraphPlotTime::IsLive() const
{
    return GetValues().bLive;
}
bool VBaseGraphPlotTime::IsReview() const
{
    return GetValues().bReview;
}
qlonglong VBaseGraphPlotTime::GetCurrentTime() const
{
    return GetValues().CurrentTime;
}
qlonglong VBaseGraphPlotTime::GetLatestFrameIndex() const
{
    return GetValues().LatestFrame;
}
std::int64_t VBaseGraphPlotTime::GetFramePeriod() const
{
    return GetValues().FramePeriod;
}

QPointF VBaseGraphPlotTime::GetSessionTimeRange() const
{
    const TQL::FrameRange range = GetValues().SessionRange;
    return {range.first, range.second};
}

void VBaseGraphPlotTime::SetValues(const Values& i_rValues)
{
    Values old;
    bool bRangeDiffers = false;
    {
        const std::lock_guard lock(m_Mutex);
        old = std::exchange(m_Values, i_rValues);
        bRangeDiffers = !TQL::NearlyEqual(old.SessionRange, i_rValues.SessionRange);
        if (!bRangeDiffers)
            m_Values.SessionRange = old.SessionRange;
    }
    if (old.bLive != i_rValues.bLive || old.bReview != i_rValues.bReview)
        Q_EMIT ModeChanged();
    if (bRangeDiffers)
        Q_EMIT SessionTimeRangeChanged();
    if (old.CurrentTime != i_rValues.CurrentTime)
        Q_EMIT CurrentTimeChanged();
    if (old.FramePeriod != i_rValues.FramePeriod)
        m_pFramePeriodChanged->Invoke();
    if (old.LatestFrame != i_rValues.LatestFrame)
        Q_EMIT LatestFrameIndexChanged();
}

} // namespace GraphPlotUI
