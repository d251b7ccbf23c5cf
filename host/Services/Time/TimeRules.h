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

/// Where play stands in a loop over the frames of the range: the latest frame and the first one are the same moment.
/// From outside the range play goes to the end of it where it begins.
std::int64_t AdvanceLoop(std::int64_t i_Tick, std::int64_t i_ElapsedTicks, double i_Rate,
                         const TQL::TickRange& i_rRange, std::int64_t i_FramePeriod);

/// What a loop goes over: the marks as far as they lie in the range, the whole range where they hold no frame of it.
TQL::TickRange LoopRange(const TQL::TickRange& i_rMarks, const TQL::TickRange& i_rRange, std::int64_t i_FramePeriod);

/// The marks after one of them was moved to the frame at a tick. The other one stays unless it is on the wrong side or
/// there is none; then it goes to the end of the range.
TQL::TickRange MoveFirstMark(const TQL::TickRange& i_rMarks, std::int64_t i_Tick, const TQL::TickRange& i_rRange,
                             std::int64_t i_FramePeriod);
TQL::TickRange MoveLastMark(const TQL::TickRange& i_rMarks, std::int64_t i_Tick, const TQL::TickRange& i_rRange,
                            std::int64_t i_FramePeriod);

/// Nanoseconds to ticks, rounded to nearest.
std::int64_t NanosecondsToTicks(std::int64_t i_Nanoseconds);

} // namespace Services
