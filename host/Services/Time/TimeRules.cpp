#include "Services/Time/TimeRules.h"

#include <algorithm>
#include <cmath>

namespace Services
{

std::int64_t LatestFrameTick(const TQL::TickRange& i_rRange, std::int64_t i_FramePeriod)
{
    return std::max(i_rRange.First, i_rRange.Last - i_FramePeriod);
}

std::int64_t ClampToFrames(std::int64_t i_Tick, const TQL::TickRange& i_rRange, std::int64_t i_FramePeriod)
{
    return std::clamp(i_Tick, i_rRange.First, LatestFrameTick(i_rRange, i_FramePeriod));
}

PlayStep AdvancePlay(std::int64_t i_Tick, std::int64_t i_ElapsedTicks, double i_Rate, const TQL::TickRange& i_rRange,
                     std::int64_t i_FramePeriod)
{
    // In double: an enormous rate must end at the end of the range, not wrap around.
    const double first = static_cast<double>(i_rRange.First);
    const double last = static_cast<double>(LatestFrameTick(i_rRange, i_FramePeriod));
    const double way = std::round(static_cast<double>(i_ElapsedTicks) * i_Rate);
    const double target = static_cast<double>(i_Tick) + way;
    if (i_Rate > 0.0 && target >= last)
        return {LatestFrameTick(i_rRange, i_FramePeriod), true};
    if (i_Rate < 0.0 && target <= first)
        return {i_rRange.First, true};
    return {ClampToFrames(i_Tick + static_cast<std::int64_t>(way), i_rRange, i_FramePeriod), false};
}

std::int64_t AdvanceLoop(std::int64_t i_Tick, std::int64_t i_ElapsedTicks, double i_Rate,
                         const TQL::TickRange& i_rRange, std::int64_t i_FramePeriod)
{
    const std::int64_t latest = LatestFrameTick(i_rRange, i_FramePeriod);
    if (i_Tick < i_rRange.First || i_Tick > latest)
        return i_Rate < 0.0 ? latest : i_rRange.First;
    const double length = static_cast<double>(latest - i_rRange.First);
    const double way = std::round(static_cast<double>(i_ElapsedTicks) * i_Rate);
    double offset = static_cast<double>(i_Tick - i_rRange.First) + way;
    if (offset < 0.0 || offset > length)
        offset = length > 0.0 ? std::fmod(offset, length) : 0.0;
    return i_rRange.First + static_cast<std::int64_t>(offset < 0.0 ? offset + length : offset);
}

TQL::TickRange LoopRange(const TQL::TickRange& i_rMarks, const TQL::TickRange& i_rRange, std::int64_t i_FramePeriod)
{
    const TQL::TickRange common{std::max(i_rMarks.First, i_rRange.First), std::min(i_rMarks.Last, i_rRange.Last)};
    return common.Last - common.First >= i_FramePeriod ? common : i_rRange;
}

TQL::TickRange MoveFirstMark(const TQL::TickRange& i_rMarks, std::int64_t i_Tick, const TQL::TickRange& i_rRange,
                             std::int64_t i_FramePeriod)
{
    const std::int64_t first = TQL::FloorDivide(i_Tick, i_FramePeriod) * i_FramePeriod;
    const bool bKeep = !i_rMarks.IsEmpty() && i_rMarks.Last > first;
    return {first, bKeep ? i_rMarks.Last : std::max(i_rRange.Last, first + i_FramePeriod)};
}

TQL::TickRange MoveLastMark(const TQL::TickRange& i_rMarks, std::int64_t i_Tick, const TQL::TickRange& i_rRange,
                            std::int64_t i_FramePeriod)
{
    const std::int64_t last = (TQL::FloorDivide(i_Tick, i_FramePeriod) + 1) * i_FramePeriod;
    const bool bKeep = !i_rMarks.IsEmpty() && i_rMarks.First < last;
    return {bKeep ? i_rMarks.First : std::min(i_rRange.First, last - i_FramePeriod), last};
}

std::int64_t NanosecondsToTicks(std::int64_t i_Nanoseconds)
{
    // 27 ticks take 200 ns; whole seconds apart, so that the product stays small.
    constexpr std::int64_t second = 1'000'000'000;
    const std::int64_t whole = i_Nanoseconds / second;
    const std::int64_t rest = i_Nanoseconds % second;
    return whole * TQL::DefaultTickRate +
           TQL::RoundHalfAway(static_cast<double>(rest) * static_cast<double>(TQL::DefaultTickRate) /
                              static_cast<double>(second));
}

} // namespace Services
