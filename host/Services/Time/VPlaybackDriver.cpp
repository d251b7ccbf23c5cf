#include "Services/Time/VPlaybackDriver.h"

#include "Services/Time/TimeRules.h"
#include "Services/Time/VTimeController.h"

namespace Services
{

VPlaybackDriver::VPlaybackDriver(std::shared_ptr<VTimeController> i_pController,
                                 std::shared_ptr<TQL::IPostalService> i_pUiPostalService, Clock i_Clock)
    : m_pController(std::move(i_pController)), m_Clock(std::move(i_Clock))
{
    m_Timer.setTimerType(Qt::PreciseTimer);
    m_Timer.setInterval(StepMilliseconds);
    QObject::connect(&m_Timer, &QTimer::timeout, [this] { Step(); });
    // A call that is already posted when this object goes finds its token dead.
    const auto follow = [this, pAlive = std::weak_ptr(m_pAlive)]
    {
        if (!pAlive.expired())
            FollowPlay();
    };
    m_Subscriptions.Subscribe(m_pController->PlayChanged(), follow, std::move(i_pUiPostalService));
}

VPlaybackDriver::Clock VPlaybackDriver::SteadyClock()
{
    return []
    {
        return std::chrono::nanoseconds(std::chrono::steady_clock::now().time_since_epoch());
    };
}

void VPlaybackDriver::Step()
{
    if (!m_Timer.isActive())
        return;
    const std::chrono::nanoseconds now = m_Clock();
    m_pController->Advance(NanosecondsToTicks((now - m_Last).count()));
    m_Last = now;
}

void VPlaybackDriver::FollowPlay()
{
    if (m_pController->IsPlaying() == m_Timer.isActive())
        return;
    if (m_Timer.isActive())
    {
        m_Timer.stop();
        return;
    }
    m_Last = m_Clock();
    m_Timer.start();
}

} // namespace Services
