#include "Studio/Common/TimeText.h"

#include "TQL/ITick.h"

#include <algorithm>
#include <array>
#include <cstdio>

namespace Studio
{

std::string FormatTime(std::int64_t i_Ticks)
{
    constexpr std::int64_t ticksPerMillisecond = TQL::DefaultTickRate / 1000;
    const std::int64_t all = (i_Ticks < 0 ? -i_Ticks : i_Ticks) / ticksPerMillisecond;
    std::array<char, 64> text{};
    std::snprintf(text.data(), text.size(), "%s%lld:%02d:%02d.%03d", i_Ticks < 0 ? "-" : "",
                  static_cast<long long>(all / 3'600'000), static_cast<int>(all / 60'000 % 60),
                  static_cast<int>(all / 1000 % 60), static_cast<int>(all % 1000));
    return text.data();
}

std::string FormatTimecode(std::int64_t i_Ticks, std::int64_t i_FramePeriod)
{
    const std::int64_t perSecond = std::max<std::int64_t>(
        1, TQL::RoundHalfAway(static_cast<double>(TQL::DefaultTickRate) / static_cast<double>(i_FramePeriod)));
    const std::int64_t frame = TQL::FloorDivide(i_Ticks, i_FramePeriod);
    const std::int64_t all = frame < 0 ? -frame : frame;
    const std::int64_t seconds = all / perSecond;
    const std::size_t digits = std::max<std::size_t>(2, std::to_string(perSecond - 1).size());
    std::array<char, 96> text{};
    std::snprintf(text.data(), text.size(), "%s%02lld:%02d:%02d:%0*lld", frame < 0 ? "-" : "",
                  static_cast<long long>(seconds / 3600), static_cast<int>(seconds / 60 % 60),
                  static_cast<int>(seconds % 60), static_cast<int>(digits), static_cast<long long>(all % perSecond));
    return text.data();
}

} // namespace Studio
