#pragma once

#include <cmath>
#include <compare>
#include <cstdint>

namespace TQL
{

/// A count of ticks at a fixed rate, as a value. The one rate in use is DefaultTickRate.
template <std::int64_t TicksPerSecond>
struct ITickAtRate
{
    static constexpr std::int64_t Rate = TicksPerSecond;

    std::int64_t Count = 0;

    constexpr double Seconds() const noexcept { return static_cast<double>(Count) / static_cast<double>(Rate); }
    friend constexpr auto operator<=>(ITickAtRate, ITickAtRate) noexcept = default;
};

/// Ticks per second. 120, 100, 50, 30, 60, 1000 and 1200 Hz all have whole periods at this rate.
inline constexpr std::int64_t DefaultTickRate = 135'000'000;
inline constexpr std::int64_t DefaultFramePeriod = 1'125'000; ///< ticks of one frame at 120 Hz

using ITick = ITickAtRate<DefaultTickRate>;

/// A range of ticks; Last is exclusive: N samples from tick f at period p cover [f, f + N p). Empty when both are
/// equal.
struct TickRange
{
    std::int64_t First = 0;
    std::int64_t Last = 0;

    constexpr bool IsEmpty() const noexcept { return First == Last; }
    friend constexpr bool operator==(const TickRange&, const TickRange&) noexcept = default;
};

/// Floor of i_Dividend / i_Divisor for a positive divisor.
constexpr std::int64_t FloorDivide(std::int64_t i_Dividend, std::int64_t i_Divisor) noexcept
{
    const std::int64_t quotient = i_Dividend / i_Divisor;
    return i_Dividend % i_Divisor < 0 ? quotient - 1 : quotient;
}

/// The multiple of i_Step, measured from i_Origin, at or below i_Value. i_Step > 0.
constexpr std::int64_t AlignDown(std::int64_t i_Value, std::int64_t i_Step, std::int64_t i_Origin = 0) noexcept
{
    return FloorDivide(i_Value - i_Origin, i_Step) * i_Step + i_Origin;
}

/// The multiple of i_Step, measured from i_Origin, at or above i_Value. i_Step > 0.
constexpr std::int64_t AlignUp(std::int64_t i_Value, std::int64_t i_Step, std::int64_t i_Origin = 0) noexcept
{
    return AlignDown(i_Value + i_Step - 1, i_Step, i_Origin);
}

/// Rounds half away from zero. The constant is the largest double below 0.5: with 0.5 itself its own sum would give 1.
inline std::int64_t RoundHalfAway(double i_Value) noexcept
{
    constexpr double half = 0.49999999999999994;
    return static_cast<std::int64_t>(i_Value < 0.0 ? i_Value - half : i_Value + half);
}

/// Ticks of a number of frames: the whole and the fractional part are rounded apart, so whole frames are exact.
inline std::int64_t FramesToTicks(double i_Frames, std::int64_t i_FramePeriod) noexcept
{
    double whole = 0.0;
    const double fraction = std::modf(i_Frames, &whole);
    return RoundHalfAway(whole) * i_FramePeriod + RoundHalfAway(fraction * static_cast<double>(i_FramePeriod));
}

/// Frames of a number of ticks: whole frames are exact, the rest is a fraction. i_FramePeriod must not be 0.
constexpr double TicksToFrames(std::int64_t i_Ticks, std::int64_t i_FramePeriod) noexcept
{
    return static_cast<double>(i_Ticks / i_FramePeriod) +
           static_cast<double>(i_Ticks % i_FramePeriod) / static_cast<double>(i_FramePeriod);
}

} // namespace TQL
