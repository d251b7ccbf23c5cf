#pragma once

#include "Studio/Tree/ChannelTreeLeaf.h"

#include <span>
#include <string>
#include <vector>

namespace Channels
{
class VChannelContext;
}

namespace Studio
{

/// One thing that an operator can select: what a channel is about, or a subject.
struct SelectableThing
{
    std::string Name;     ///< as shown: "Walker1:LFHD"; "Walker1" for a subject
    std::string TypeName; ///< of its channel's id; empty for a subject
    TQL::SelectionItem Item;
    std::vector<std::string> Units = {};      ///< of its components, each once
    std::vector<std::string> Components = {}; ///< names; for a subject the name of its root segment
    std::string TypeText = {};                ///< what plots call its type; empty where that is the type's own name
    int Rank = 0; ///< the lower, the sooner is it what an operator wants to see of a recording at first
};

/// Those of the context's channels in their order, then of the global ones, then the subjects that have segments.
/// i_pGlobal may be null.
std::vector<SelectableThing> ListThings(const Channels::VChannelContext& i_rContext,
                                        const Channels::VChannelContext* i_pGlobal);

/// The items of the things: first the markers, then segments, joint angles, model outputs, devices, columns, all else,
/// and last what only counts the rows; in their order within those.
std::vector<TQL::SelectionItem> ItemsByRank(std::span<const SelectableThing> i_Things);

/// The things as leaves of the tree: what stands before the first colon of a name is the subject and the top branch,
/// then comes the kind. A subject is a leaf of its own branch.
std::vector<ChannelTreeLeaf> MakeLeaves(std::span<const SelectableThing> i_Things);

/// The items of the things whose names match one of the patterns, each once, in the order of the patterns. When one
/// of them matches nothing it is given in o_rUnmatched and the answer is empty.
std::vector<TQL::SelectionItem> FindItems(std::span<const SelectableThing> i_Things,
                                          std::span<const std::string> i_Patterns, std::string& o_rUnmatched);

} // namespace Studio
