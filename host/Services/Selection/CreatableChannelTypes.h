#pragma once

#include "ChannelSystem/ISelectionSource.h"
#include "ChannelSystem/VDerivedChannelParameters.h"

#include <cstddef>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace Services
{

/// A channel type that this host makes from selected channels.
struct CreatableChannelType
{
    std::string Name;
    std::string DisplayName;
    std::string ComponentNames; ///< separated by commas
    std::string Category;
    std::size_t InputCount = 1;
    std::set<std::string> InputTypes;
    bool bSupportMagnitude = false;
    TQL::ESelectionKind Selection = TQL::ESelectionKind::Segment;
    /// How the channel is made from the inputs; nothing: the input itself is what there is to see.
    std::optional<ChannelSystem::VDerivedChannelParameters> Record;
};

/// All of them, in the order in which they are offered. "_PositionAndRotation" leaves a pose as it is: one channel with
/// the components of both, which the plot then shows in the form that the operator chose for rotations. A channel each
/// would be shown in two rows of the key and would lose that choice, for a position has no rotation to choose a form
/// of. Distances, differences and angles between are measured between markers as well as between segments.
std::vector<CreatableChannelType> MakeCreatableChannelTypes();

} // namespace Services
