#pragma once

#include "Studio/Session/VFrameClock.h"
#include "TQL/IResult.h"

#include <condition_variable>
#include <cstdint>
#include <functional>
#include <mutex>
#include <thread>

namespace Studio
{

/// Calls for frames at the pace of a capture, on a thread of its own, until it is destroyed. A pause stops the time of
/// the capture: no frame is lost, the next one comes when it goes on. Owned by the session; UI thread.
class VLiveCapture
{
public:
    /// Delivers the frames [first, first + count). Called on the capture's thread. An error ends the
    /// capture, and so does OkButNoEffect, which says that there are no more frames.
    using Produce = std::function<TQL::IResult(std::int64_t i_First, std::int64_t i_Count)>;

    /// Begins with i_FirstFrame, at once.
    VLiveCapture(Produce i_Produce, double i_FramesPerSecond, std::int64_t i_FirstFrame);
    ~VLiveCapture();
    VLiveCapture(const VLiveCapture&) = delete;
    VLiveCapture& operator=(const VLiveCapture&) = delete;

    void SetPaused(bool i_bPaused);
    bool IsPaused() const;
    bool HasEnded() const; ///< there will be no more frames

private:
    void Work();

    const Produce m_Produce;
    const std::int64_t m_FirstFrame;
    mutable std::mutex m_Mutex;
    std::condition_variable m_Wake;
    VFrameClock m_Clock;      // guarded by m_Mutex
    bool m_bStopping = false; // guarded by m_Mutex
    bool m_bEnded = false;    // guarded by m_Mutex
    std::thread m_Thread;
};

} // namespace Studio
