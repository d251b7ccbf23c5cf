#pragma once

#include "TQL/ITick.h"

#include <cstdint>

namespace Services
{

/// The tick of the latest frame of a range, its first tick when the range is empty. Ticks.
std::int64_t LatestFrameTick(const TQL::TickRange& i_rRange, std::int64_t i_FramePeriod);

/// The nearest tick between the first and the latest frame of the range, both included.
std::int64_t ClampToFrames(std::int64_t i_Tick, const TQL::TickRange& i_rRange, std::int64_t i_FramePeriod);

struct PlayStep
{
    std::int64_t Tick = 0;
    bool bEnded = false; ///< the end in the direction of play was reached
};

/// Where play stands after i_ElapsedTicks of real time. The rate is a factor: 1 is real time, 0.5 half as fast,
/// negative backwards. Play does not loop: it stops at the latest frame, backwards at the first.
PlayStep AdvancePlay(std::int64_t i_Tick, std::int64_t i_ElapsedTicks, double i_Rate, const TQL::TickRange& i_rRange,
                     std::int64_t i_FramePeriod);

/// Nanoseconds to ticks, rounded to nearest.
std::int64_t NanosecondsToTicks(std::int64_t i_Nanoseconds);

} // namespace Services
