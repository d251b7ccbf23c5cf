#pragma once

#include "Studio/ChannelTreeLeaf.h"

#include <span>
#include <string>
#include <vector>

namespace Channels
{
class VChannelContext;
}

namespace Studio
{

/// One channel of a context that an operator can select.
struct SelectableChannel
{
    std::string Name;     ///< as shown: "Walker1:LFHD"
    std::string TypeName; ///< of its id
    TQL::SelectionItem Item;
    std::vector<std::string> Units = {};      ///< of its components, each once
    std::vector<std::string> Components = {}; ///< names
};

/// In the order of the context.
std::vector<SelectableChannel> ListChannels(const Channels::VChannelContext& i_rContext);

/// The channels as leaves of the tree: what stands before the first colon of a name is the subject and the top branch,
/// then comes the kind.
std::vector<ChannelTreeLeaf> MakeLeaves(std::span<const SelectableChannel> i_Channels);

/// The items of the channels whose names match one of the patterns, each once, in the order of the patterns. When one
/// of them matches nothing it is given in o_rUnmatched and the answer is empty.
std::vector<TQL::SelectionItem> FindItems(std::span<const SelectableChannel> i_Channels,
                                          std::span<const std::string> i_Patterns, std::string& o_rUnmatched);

} // namespace Studio
