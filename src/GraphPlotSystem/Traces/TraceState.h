#pragma once

#include "TQL/NearlyEqual.h"

#include <limits>
#include <string>

namespace GraphPlotUI
{

/// The time axis and the gaps of one window, as they are saved and restored. Plain data; a value that was not saved has
/// the default of a new window. A time range with an infinite or extreme end stands for "the default range".
struct TraceState
{
    std::string LiveTimePreset; ///< the text of a preset; empty for the standard one
    bool bRelativeTimeDisplay = true;
    bool bLockTimeRange = false;
    bool bFitTimeRange = false;
    TQL::FrameRange TimeRange{std::numeric_limits<double>::lowest(), std::numeric_limits<double>::max()}; ///< frames
    double GapOpacity = 0.5;

    friend bool operator==(const TraceState&, const TraceState&) = default;
};

} // namespace GraphPlotUI
