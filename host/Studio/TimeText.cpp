#include "Studio/TimeText.h"

#include "TQL/ITick.h"

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

} // namespace Studio
