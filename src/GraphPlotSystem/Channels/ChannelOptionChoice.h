#pragma once

#include "ChannelSystemUtils/VActiveChannelOptions.h"

namespace GraphPlotUI
{

/// What the pickers of a plot hold: formats and units as the stored enumerations count them. Plain data.
struct ChannelOptionChoice
{
    int RotationFormat = 0;
    int RotationUnits = 0;
    int LengthUnits = 0;
    int DerivativeOrder = 0; ///< 0, 1, 2
    bool bDifferentiateByFrame = false;
    bool bPlotMagnitude = false;
};

/// The options that a choice asks for. A length unit that is not listed stands for metres; a magnitude is plotted only
/// where the plotted type can give one.
ChannelSystemUtils::VActiveChannelOptions MakeChannelOptions(const ChannelOptionChoice& i_rChoice,
                                                             bool i_bCanComputeMagnitude);

} // namespace GraphPlotUI
