#pragma once

#include <cstdint>
#include <string>

namespace Studio
{

/// A time in ticks as hours, minutes, seconds and milliseconds, rounded down: "0:01:02.250". A minus sign comes first.
std::string FormatTime(std::int64_t i_Ticks);

/// The frame at a time in ticks as a timecode: hours, minutes, seconds and the frame of the second: "00:01:02:30". The
/// frames of a second are the whole number nearest to the rate, at least 1; no frame numbers are dropped, so that at a
/// rate such as 59.94 Hz the timecode counts frames and lags behind the clock.
std::string FormatTimecode(std::int64_t i_Ticks, std::int64_t i_FramePeriod);

} // namespace Studio
