#include "Studio/Session/VFrameClock.h"

#include <cmath>

namespace Studio
{

VFrameClock::VFrameClock(double i_FramesPerSecond) : m_FramesPerSecond(i_FramesPerSecond) {}

void VFrameClock::Run(Time i_Now)
{
    if (m_bRunning)
        return;
    m_bRunning = true;
    m_Start = i_Now;
}

void VFrameClock::Pause(Time i_Now)
{
    m_Before = Elapsed(i_Now);
    m_bRunning = false;
}

VFrameClock::Time VFrameClock::Elapsed(Time i_Now) const
{
    return m_bRunning ? m_Before + (i_Now - m_Start) : m_Before;
}

std::int64_t VFrameClock::FramesDue(Time i_Now) const
{
    const double seconds = std::chrono::duration<double>(Elapsed(i_Now)).count();
    // A frame that is due this very nanosecond counts.
    return static_cast<std::int64_t>(std::floor(seconds * m_FramesPerSecond + 1e-6));
}

VFrameClock::Time VFrameClock::TimeOfFrame(std::int64_t i_Frame) const
{
    const std::chrono::duration<double> running(static_cast<double>(i_Frame + 1) / m_FramesPerSecond);
    return m_Start - m_Before + std::chrono::duration_cast<Time>(running) + Time(1);
}

} // namespace Studio
