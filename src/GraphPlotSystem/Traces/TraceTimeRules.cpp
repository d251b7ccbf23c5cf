#include "GraphPlotSystem/Traces/TraceTimeRules.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <limits>

namespace GraphPlotUI
{

bool IsUsableRange(const TQL::FrameRange& i_rRange)
{
    return std::isfinite(i_rRange.first) && std::isfinite(i_rRange.second) && i_rRange.first < i_rRange.second;
}

int DisplayUpdatePeriodMillis(const TQL::FrameRange& i_rRange, std::int64_t i_FramePeriod)
{
    constexpr double millisecondsPerSecond = 0.2681564245810056; // 480 ms over 1790 s
    const double framesPerSecond =
        i_FramePeriod == 0 ? 0.0 : static_cast<double>(TQL::DefaultTickRate) / static_cast<double>(i_FramePeriod);
    const double seconds = std::clamp(std::abs(i_rRange.second - i_rRange.first) / framesPerSecond, 10.0, 1800.0);
    return static_cast<int>(TQL::RoundHalfAway((seconds - 10.0) * millisecondsPerSecond + 20.0));
}

std::optional<TQL::FrameRange> PresetRange(std::string_view i_Preset, std::int64_t i_FramePeriod)
{
    if (i_Preset.empty() || i_FramePeriod <= 0)
        return std::nullopt;
    std::int64_t ticksPerUnit = 0;
    switch (i_Preset.back())
    {
    case 's':
        ticksPerUnit = TQL::DefaultTickRate;
        break;
    case 'm':
        ticksPerUnit = 60 * TQL::DefaultTickRate;
        break;
    case 'h':
        ticksPerUnit = 3600 * TQL::DefaultTickRate;
        break;
    default:
        return std::nullopt;
    }
    i_Preset.remove_suffix(1);
    int count = 0;
    const auto [pEnd, error] = std::from_chars(i_Preset.data(), i_Preset.data() + i_Preset.size(), count);
    std::int64_t ticks = 0;
    if (error != std::errc() || pEnd != i_Preset.data() + i_Preset.size() ||
        __builtin_mul_overflow(std::int64_t{count}, ticksPerUnit, &ticks))
        return std::nullopt;
    return TQL::FrameRange{-TQL::TicksToFrames(ticks, i_FramePeriod), 0.0};
}

int PresetIndex(std::string_view i_Preset)
{
    const auto found = std::ranges::find(LiveTimePresets, i_Preset);
    return found == LiveTimePresets.end() ? StandardLiveTimePreset : static_cast<int>(found - LiveTimePresets.begin());
}

TQL::FrameRange FitLiveRange(const TQL::TickRange& i_rCached, std::int64_t i_FramePeriod,
                             const TQL::FrameRange& i_rDefaultRange)
{
    constexpr double threeSeconds = 3.0 * static_cast<double>(TQL::DefaultTickRate);
    const std::int64_t first = TQL::AlignDown(i_rCached.First, i_FramePeriod);
    const std::int64_t last = TQL::AlignUp(i_rCached.Last, i_FramePeriod);
    const double frames = TQL::TicksToFrames(last - first, i_FramePeriod);
    const double defaultLength = std::abs(i_rDefaultRange.second - i_rDefaultRange.first);
    const double floor = std::min(threeSeconds / static_cast<double>(i_FramePeriod), defaultLength);
    return {-std::min(std::max(frames, floor), defaultLength), 0.0};
}

std::int64_t SaturatedFramesToTicks(double i_Frames, std::int64_t i_FramePeriod)
{
    // A quarter of the clock, so that a few more frames can be added without leaving it.
    const double limit =
        static_cast<double>(std::numeric_limits<std::int64_t>::max() / 4) / static_cast<double>(i_FramePeriod);
    return TQL::FramesToTicks(std::isnan(i_Frames) ? 0.0 : std::clamp(i_Frames, -limit, limit), i_FramePeriod);
}

std::int64_t CacheTicks(const TQL::FrameRange& i_rRange, std::int64_t i_FramePeriod)
{
    return SaturatedFramesToTicks(i_rRange.second - i_rRange.first + 1.0, i_FramePeriod);
}

TQL::TickRange ReadRange(const TQL::FrameRange& i_rTimeRange, const TQL::FrameRange& i_rDefaultRange,
                         std::int64_t i_LatestFrame, std::int64_t i_FramePeriod)
{
    const auto latest = static_cast<double>(i_LatestFrame);
    const double low = std::floor(std::max(i_rTimeRange.first, i_rDefaultRange.first)) - 1.0 + latest;
    const double high = std::ceil(std::min(i_rTimeRange.second, i_rDefaultRange.second)) + 2.0 + latest;
    return {SaturatedFramesToTicks(low, i_FramePeriod), SaturatedFramesToTicks(high, i_FramePeriod)};
}

} // namespace GraphPlotUI
