#pragma once

#include "OrvanePluginInterface/ITimeController.h"
#include "TQL/NearlyEqual.h"

#include <cstdint>
#include <optional>

namespace GraphPlotUI
{

/// What a time source's state means in frames. Relative frames are counted back from the latest one.
struct PlotTimeSample
{
    std::int64_t LatestFrame = 0; ///< never relative
    TQL::FrameRange SessionRange{0.0, 0.0};
    std::int64_t CurrentTime = 0;
    std::int64_t FramePeriod = 0; ///< ticks

    friend bool operator==(const PlotTimeSample&, const PlotTimeSample&) = default;
};

/// None for a state whose period is not positive.
std::optional<PlotTimeSample> SamplePlotTime(const OrvanePluginInterface::TimeState& i_rState, bool i_bRelative);

/// The tick at which a frame stands. None for a state whose period is not positive.
std::optional<std::int64_t> SeekTickOfFrame(const OrvanePluginInterface::TimeState& i_rState, std::int64_t i_Frame,
                                            bool i_bRelative);

} // namespace GraphPlotUI
