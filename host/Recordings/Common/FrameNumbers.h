#pragma once

#include "TQL/ITick.h"

#include <cstdint>

namespace Recordings
{

/// The number of the frame that a time in ticks lies in, as files and plots count them: the frame at time 0 is 1, and a
/// C3D file that begins at frame 725 begins at time 724 x period. The period is above 0.
inline std::int64_t FrameAt(std::int64_t i_Tick, std::int64_t i_FramePeriod)
{
    return TQL::FloorDivide(i_Tick, i_FramePeriod) + 1;
}

/// Where the frame of a number begins, in ticks.
inline std::int64_t TickOfFrame(std::int64_t i_Frame, std::int64_t i_FramePeriod)
{
    return (i_Frame - 1) * i_FramePeriod;
}

} // namespace Recordings
