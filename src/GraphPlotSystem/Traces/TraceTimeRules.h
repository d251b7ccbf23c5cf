#pragma once

#include "TQL/ITick.h"
#include "TQL/NearlyEqual.h"

#include <array>
#include <cstdint>
#include <optional>
#include <string_view>

namespace GraphPlotUI
{

/// The presets of the live time window, in the order of their index.
inline constexpr std::array<std::string_view, 9> LiveTimePresets{"1s",  "10s", "30s", "1m", "10m",
                                                                 "30m", "1h",  "12h", "24h"};
inline constexpr int StandardLiveTimePreset = 1;

/// Both ends finite, and the minimum below the maximum.
bool IsUsableRange(const TQL::FrameRange& i_rRange);

/// How often a range of that many frames is drawn anew: 20 ms up to 10 seconds, 500 ms from 1800 seconds on.
int DisplayUpdatePeriodMillis(const TQL::FrameRange& i_rRange, std::int64_t i_FramePeriod);

/// (-frames, 0) of a preset: an integer and "s", "m" or "h". None for a text that is no preset.
std::optional<TQL::FrameRange> PresetRange(std::string_view i_Preset, std::int64_t i_FramePeriod);

/// The index of a preset text; the standard one for any other text.
int PresetIndex(std::string_view i_Preset);

/// The range that shows all of a live buffer: at least 3 seconds, at most the length of the default range.
TQL::FrameRange FitLiveRange(const TQL::TickRange& i_rCached, std::int64_t i_FramePeriod,
                             const TQL::FrameRange& i_rDefaultRange);

/// FramesToTicks that saturates where the ticks would not fit.
std::int64_t SaturatedFramesToTicks(double i_Frames, std::int64_t i_FramePeriod);

/// Ticks that a cache must hold for a range of frames.
std::int64_t CacheTicks(const TQL::FrameRange& i_rRange, std::int64_t i_FramePeriod);

/// The ticks to read: the part of the shown range inside the default range, one frame more before and two after.
/// i_LatestFrame is added to both ends (0 in a review).
TQL::TickRange ReadRange(const TQL::FrameRange& i_rTimeRange, const TQL::FrameRange& i_rDefaultRange,
                         std::int64_t i_LatestFrame, std::int64_t i_FramePeriod);

} // namespace GraphPlotUI
