#pragma once

#include "NotificationSystem/VSubscriptions.h"

#include <QtCore/QTimer>

#include <chrono>
#include <functional>
#include <memory>

namespace Services
{

class VTimeController;

/// Moves a playing time controller on: a timer that runs only while it plays, and a clock that says how much real time
/// has passed. Owned by the host services. UI thread.
class VPlaybackDriver
{
public:
    using Clock = std::function<std::chrono::nanoseconds()>;

    VPlaybackDriver(std::shared_ptr<VTimeController> i_pController,
                    std::shared_ptr<TQL::IPostalService> i_pUiPostalService, Clock i_Clock = SteadyClock());

    /// One step by the clock, as at each turn of the timer. No effect unless the timer runs.
    void Step();
    bool IsRunning() const { return m_Timer.isActive(); }

    static Clock SteadyClock();

private:
    void FollowPlay();

    static constexpr int StepMilliseconds = 16;

    const std::shared_ptr<VTimeController> m_pController;
    const Clock m_Clock;
    std::chrono::nanoseconds m_Last{0};
    QTimer m_Timer;
    const std::shared_ptr<char> m_pAlive = std::make_shared<char>();
    NotificationSystem::VSubscriptions m_Subscriptions;
};

} // namespace Services
