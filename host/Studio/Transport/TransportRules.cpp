#include "Studio/Transport/TransportRules.h"

#include <algorithm>

namespace Studio
{

namespace
{

constexpr double speeds[] = {0.1, 0.25, 0.5, 1.0, 2.0, 5.0, 10.0};

} // namespace

std::span<const double> PlaySpeeds()
{
    return speeds;
}

double NextSpeed(double i_Speed, int i_Direction)
{
    if (i_Direction > 0)
    {
        const double* pNext = std::ranges::upper_bound(speeds, i_Speed);
        return pNext != std::end(speeds) ? *pNext : std::end(speeds)[-1];
    }
    const double* pNext = std::ranges::lower_bound(speeds, i_Speed);
    return pNext != std::begin(speeds) ? pNext[-1] : speeds[0];
}

std::int64_t StepFrame(std::int64_t i_Frame, std::int64_t i_Step, std::int64_t i_First, std::int64_t i_Last)
{
    const std::int64_t frame = std::clamp(i_Frame, i_First, std::max(i_First, i_Last));
    // Compared by the room that is left, so that no step can overflow.
    if (i_Step > 0)
        return i_Last - frame < i_Step ? std::max(i_First, i_Last) : frame + i_Step;
    return i_First - frame > i_Step ? i_First : frame + i_Step;
}

std::optional<std::int64_t> NextEventFrame(std::span<const std::int64_t> i_Frames, std::int64_t i_Frame)
{
    const auto next = std::ranges::upper_bound(i_Frames, i_Frame);
    return next != i_Frames.end() ? std::optional(*next) : std::nullopt;
}

std::optional<std::int64_t> PreviousEventFrame(std::span<const std::int64_t> i_Frames, std::int64_t i_Frame)
{
    const auto next = std::ranges::lower_bound(i_Frames, i_Frame);
    return next != i_Frames.begin() ? std::optional(*(next - 1)) : std::nullopt;
}

} // namespace Studio
