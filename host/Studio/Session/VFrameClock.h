#pragma once

#include <chrono>
#include <cstdint>

namespace Studio
{

/// Says how many frames a capture must have delivered by a time: those of the running time, not of pauses. Times come
/// from any clock that only goes forwards. One thread at a time.
class VFrameClock
{
public:
    using Time = std::chrono::nanoseconds;

    explicit VFrameClock(double i_FramesPerSecond);

    void Run(Time i_Now);
    void Pause(Time i_Now);
    bool IsRunning() const { return m_bRunning; }

    std::int64_t FramesDue(Time i_Now) const;

    /// When the frame with that number, counted from 0, is due if the clock keeps running.
    Time TimeOfFrame(std::int64_t i_Frame) const;

private:
    Time Elapsed(Time i_Now) const;

    const double m_FramesPerSecond;
    bool m_bRunning = false;
    Time m_Before{0}; ///< running time before the last start
    Time m_Start{0};
};

} // namespace Studio
