#pragma once

#include "ChannelSystem/ComponentDescription.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace GraphPlotUI
{

/// The id of what a channel looks like: the same for all channels with the same type name (as shown), the same units
/// and the same component names, as they stand in their parameter; nothing where that cannot be read. Saved with a
/// graph, so it never changes; never 0, which stands for an unknown channel.
std::uint64_t ComputeChannelSubType(std::string_view i_TypeName, const TQL::ComponentDescription& i_rDescription,
                                    const std::optional<std::string>& i_rComponentNames);

} // namespace GraphPlotUI
