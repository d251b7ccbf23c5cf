#pragma once

#include "TQL/ITick.h"
#include "TQL/NearlyEqual.h"

#include <cstdint>

namespace GraphPlotUI
{

/// How many rows of one trace the view can hold; see the trace storage.
inline constexpr std::int64_t TraceRowCapacity = 4096;

/// The level of detail at which a pixel covers one to two rows: 0 is the samples themselves, each level above halves
/// the rows. Periods are in ticks and above 0, the time range in frames, the width in pixels and above 0.
std::uint8_t ChooseLevel(std::int64_t i_FramePeriod, std::int64_t i_SamplePeriod, const TQL::FrameRange& i_rTimeRange,
                         int i_SubplotWidth);

/// Raises a level until a read of that range fits into the rows of a trace. The grid offset is in ticks.
std::uint8_t RaiseLevelToFit(std::uint8_t i_Level, const TQL::TickRange& i_rRead, std::int64_t i_SamplePeriod,
                             std::int64_t i_GridOffset);

} // namespace GraphPlotUI
