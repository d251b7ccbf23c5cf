#include "Channels/Contexts/VFrameRateMeter.h"

#include <algorithm>
#include <limits>

namespace Channels
{

namespace
{

constexpr double FewestFrames = 8.0;
constexpr std::int64_t MarksInWindow = 64;
constexpr std::int64_t ShortestPart = 4; ///< of a window that tells something

VFrameRateMeter::Time WindowOf(double i_FramesPerSecond)
{
    const std::chrono::duration<double> seconds(std::max(1.0, FewestFrames / i_FramesPerSecond));
    return std::chrono::duration_cast<VFrameRateMeter::Time>(seconds);
}

} // namespace

VFrameRateMeter::VFrameRateMeter(double i_FramesPerSecond)
    : m_FramesPerSecond(i_FramesPerSecond), m_Window(WindowOf(i_FramesPerSecond))
{
}

float VFrameRateMeter::Add(std::int64_t i_Frames, Time i_Now)
{
    m_Frames += i_Frames;
    while (!m_Marks.empty() && i_Now - m_Marks.front().At > m_Window)
        m_Marks.pop_front();
    if (m_Marks.empty() || i_Now - m_Marks.back().At >= m_Window / MarksInWindow)
        m_Marks.push_back({i_Now, m_Frames});
    const Mark& rOldest = m_Marks.front();
    const Time span = i_Now - rOldest.At;
    if (span < m_Window / ShortestPart)
        return std::numeric_limits<float>::quiet_NaN();
    const double seconds = std::chrono::duration<double>(span).count();
    return static_cast<float>(static_cast<double>(m_Frames - rOldest.Frames) / seconds / m_FramesPerSecond);
}

} // namespace Channels
