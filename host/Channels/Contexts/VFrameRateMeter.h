#pragma once

#include <chrono>
#include <cstdint>
#include <deque>

namespace Channels
{

/// How fast frames come, by the clock on the wall, over the last second; for slow captures over the last eight frames.
/// Remembers at most a few dozen marks. One thread.
class VFrameRateMeter
{
public:
    using Time = std::chrono::nanoseconds; ///< of a clock that never goes back

    /// i_FramesPerSecond is how fast they should come, above 0.
    explicit VFrameRateMeter(double i_FramesPerSecond);

    /// Frames that came together now. Returns how fast they come, 1 for as fast as they should; NaN for too short a
    /// time to tell, which also begins after a time without frames.
    float Add(std::int64_t i_Frames, Time i_Now);

private:
    struct Mark
    {
        Time At;
        std::int64_t Frames; ///< that had come by then
    };

    const double m_FramesPerSecond;
    const Time m_Window;
    std::int64_t m_Frames = 0;
    std::deque<Mark> m_Marks; ///< within the window
};

} // namespace Channels
