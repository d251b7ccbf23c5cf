#pragma once

#include <cstdint>
#include <optional>
#include <span>

namespace Studio
{

/// The speeds that play offers, as factors of real time, slowest first.
std::span<const double> PlaySpeeds();

/// The offered speed above (i_Direction 1) or below (-1) this one; the last one stays.
double NextSpeed(double i_Speed, int i_Direction);

/// A step by frames that stays between the first and the last frame, both included.
std::int64_t StepFrame(std::int64_t i_Frame, std::int64_t i_Step, std::int64_t i_First, std::int64_t i_Last);

/// The nearest frame with an event after or before a frame; nothing when there is none. The frames are sorted.
std::optional<std::int64_t> NextEventFrame(std::span<const std::int64_t> i_Frames, std::int64_t i_Frame);
std::optional<std::int64_t> PreviousEventFrame(std::span<const std::int64_t> i_Frames, std::int64_t i_Frame);

} // namespace Studio
