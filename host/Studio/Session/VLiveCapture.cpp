#include "Studio/Session/VLiveCapture.h"

#include "TQL/Log.h"

#include <algorithm>

namespace Studio
{

namespace
{

constexpr std::int64_t mostAtOnce = 120; // frames, so that a capture that fell behind can still be stopped

VFrameClock::Time Now()
{
    return std::chrono::duration_cast<VFrameClock::Time>(std::chrono::steady_clock::now().time_since_epoch());
}

} // namespace

VLiveCapture::VLiveCapture(Produce i_Produce, double i_FramesPerSecond, std::int64_t i_FirstFrame)
    : m_Produce(std::move(i_Produce)), m_FirstFrame(i_FirstFrame), m_Clock(i_FramesPerSecond)
{
    m_Clock.Run(Now());
    m_Thread = std::thread([this] { Work(); });
}

VLiveCapture::~VLiveCapture()
{
    {
        const std::lock_guard lock(m_Mutex);
        m_bStopping = true;
    }
    m_Wake.notify_one();
    m_Thread.join();
}

void VLiveCapture::SetPaused(bool i_bPaused)
{
    {
        const std::lock_guard lock(m_Mutex);
        if (i_bPaused)
            m_Clock.Pause(Now());
        else
            m_Clock.Run(Now());
    }
    m_Wake.notify_one();
}

bool VLiveCapture::IsPaused() const
{
    const std::lock_guard lock(m_Mutex);
    return !m_Clock.IsRunning();
}

bool VLiveCapture::HasEnded() const
{
    const std::lock_guard lock(m_Mutex);
    return m_bEnded;
}

void VLiveCapture::Work()
{
    std::int64_t done = 0;
    std::unique_lock lock(m_Mutex);
    while (!m_bStopping)
    {
        const std::int64_t due = m_Clock.FramesDue(Now());
        if (due > done)
        {
            const std::int64_t count = std::min(due - done, mostAtOnce);
            lock.unlock();
            const TQL::IResult result = m_Produce(m_FirstFrame + done, count);
            lock.lock();
            m_bEnded = result.IsError() || result == TQL::Result::OkButNoEffect;
            if (result.IsError())
                TQL::Log::Format(TQL::Log::GetCategory("Studio"), TQL::ELogSeverity::Error,
                                 "The live capture has stopped: %1%", result.Description());
            if (m_bEnded)
                return;
            done += count;
        }
        else if (m_Clock.IsRunning())
            m_Wake.wait_until(lock, std::chrono::steady_clock::time_point(m_Clock.TimeOfFrame(done)));
        else
            m_Wake.wait(lock);
    }
}

} // namespace Studio
