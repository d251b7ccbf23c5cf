#pragma once

#include <cstdint>
#include <string>

namespace ChannelSystemUtils
{

/// How the operator wants the channels of a plot derived from their sources. Plain data.
struct VActiveChannelOptions
{
    std::int32_t DerivativeOrder = 0;      ///< 0, 1, 2
    std::int32_t DifferentiateByFrame = 0; ///< 1: per frame, 0: per second
    std::int32_t RotationFormat = 0;       ///< as the stored enumeration ERotationFormat counts
    bool bPlotMagnitude = false;
    std::string RotationUnitName = "radian";
    std::string LengthUnitName = "meter";
    std::string LengthPrefix = "milli";

    friend bool operator==(const VActiveChannelOptions&, const VActiveChannelOptions&) = default;
};

} // namespace ChannelSystemUtils
