#pragma once

#include "GraphPlotSystem/Common/ESubplotLayoutModes.h"

#include <cstdint>
#include <vector>

namespace GraphPlotUI
{

/// The value ranges of one subplot, as they are saved and restored.
struct SubplotConfiguration
{
    double YAxisMinimum = 0.0; ///< set by hand
    double YAxisMaximum = 1.0;
    double YAxisCacheMinimum = 0.0; ///< fitted to the data
    double YAxisCacheMaximum = 1.0;

    friend bool operator==(const SubplotConfiguration&, const SubplotConfiguration&) = default;
};

/// The subplots of one view of a window, as they are saved and restored. Plain data; a value that was not saved has
/// the default of a new window.
struct SubplotState
{
    std::vector<SubplotConfiguration> Configurations; ///< first those on show, from top to bottom
    std::vector<std::uint64_t> SubplotIds;            ///< of the configurations; empty where they were not saved
    ESubplotLayoutModes LayoutMode = ESubplotLayoutModes::SubplotPerTraceType;
    bool bLockYAxes = false;
    bool bFitYAxes = true;

    friend bool operator==(const SubplotState&, const SubplotState&) = default;
};

} // namespace GraphPlotUI
