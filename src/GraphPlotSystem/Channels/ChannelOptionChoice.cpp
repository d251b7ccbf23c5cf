#include "GraphPlotSystem/Channels/ChannelOptionChoice.h"

#include "GraphPlotSystem/Channels/ChannelOptionEnums.h"

namespace GraphPlotUI
{
namespace
{

const char* LengthPrefix(int i_LengthUnits)
{
    switch (i_LengthUnits)
    {
    case TQL::LengthUnits::Millimeters:
        return "milli";
    case TQL::LengthUnits::Centimeters:
        return "centi";
    default:
        return "";
    }
}

} // namespace

ChannelSystemUtils::VActiveChannelOptions MakeChannelOptions(const ChannelOptionChoice& i_rChoice,
                                                             bool i_bCanComputeMagnitude)
{
    ChannelSystemUtils::VActiveChannelOptions options;
    options.DerivativeOrder = i_rChoice.DerivativeOrder;
    options.DifferentiateByFrame = i_rChoice.bDifferentiateByFrame ? 1 : 0;
    options.RotationFormat = i_rChoice.RotationFormat;
    options.bPlotMagnitude = i_rChoice.bPlotMagnitude && i_bCanComputeMagnitude;
    options.RotationUnitName = i_rChoice.RotationUnits == TQL::RotationUnits::Degrees ? "degree" : "radian";
    options.LengthUnitName = "meter";
    options.LengthPrefix = LengthPrefix(i_rChoice.LengthUnits);
    return options;
}

} // namespace GraphPlotUI
