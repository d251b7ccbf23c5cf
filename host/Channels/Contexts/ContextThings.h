#pragma once

#include "ChannelSystem/ISelectionSource.h"

#include <cstdint>
#include <vector>

/// The things of a context that its channels are about. Pure functions over the channels as they stand; any thread.
namespace Channels
{

class VChannelContext;

/// The segment that carries the others of a subject: its first one, for skeletons are written from the root on. 0 for a
/// subject without segments.
std::uint64_t RootSegmentOf(const VChannelContext& i_rContext, std::uint64_t i_Subject);

/// Subjects that have markers or segments, and devices that have outputs; each once, by number.
std::vector<TQL::SelectionItem> SubjectsOf(const VChannelContext& i_rContext);
std::vector<TQL::SelectionItem> DevicesOf(const VChannelContext& i_rContext);

} // namespace Channels
