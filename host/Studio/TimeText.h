#pragma once

#include <cstdint>
#include <string>

namespace Studio
{

/// A time in ticks as hours, minutes, seconds and milliseconds, rounded down: "0:01:02.250". A minus sign comes first.
std::string FormatTime(std::int64_t i_Ticks);

} // namespace Studio
