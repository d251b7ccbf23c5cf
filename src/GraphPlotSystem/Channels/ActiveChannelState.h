#pragma once

#include "GraphPlotSystem/Texts/IChannelComponentControls.h"

#include <cstdint>
#include <string>

namespace GraphPlotUI
{

/// What one view of a window was asked to plot, as it is saved and restored. Plain data; a value that was not saved has
/// the default of a new window. The manager of the active channels, the component controls and the key each read and
/// write their own fields.
struct ActiveChannelState
{
    TQL::DisabledComponentsTable DisabledComponents; ///< by channel subtype
    std::string SelectedChannelType = "Auto";
    std::string GlobalChannelType = "None";
    std::int32_t RotationFormat = 0; ///< as the stored enumerations count
    std::int32_t RotationUnits = 0;
    std::int32_t LengthUnits = 0;
    std::int32_t DerivativeOrder = 0; ///< 0, 1, 2
    bool bPlotMagnitude = false;
    bool bSelectionLinked = true;
    bool bShowKey = true;

    friend bool operator==(const ActiveChannelState&, const ActiveChannelState&) = default;
};

} // namespace GraphPlotUI
