#pragma once

#include <cstddef>
#include <span>
#include <string_view>

namespace ChannelSystemUtils
{

/// Names of the channel types that stand for a selected segment and a selected camera.
inline constexpr std::string_view PositionAndRotationType = "_PositionAndRotation";
inline constexpr std::string_view CameraPositionType = "_CameraPosition";

/// One type of channels that measures one selected thing against another, and the expression that makes it. Plain data;
/// MakeDerivedRecord makes the record of it.
struct RelativeMeasurement
{
    std::string_view InternalName; ///< the type's name in the registry
    std::string_view Expression;
    std::size_t InputCount;          ///< 2 or 3 poses or positions
    std::string_view ComponentNames; ///< separated by commas; empty for a single component without a name
    std::string_view Category;
    std::string_view TypeDisplayName;
};

/// The six relative measurements, in the order in which they are offered.
std::span<const RelativeMeasurement> GetRelativeMeasurements();

} // namespace ChannelSystemUtils
