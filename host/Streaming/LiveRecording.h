#pragma once

#include "Recordings/Common/VRecording.h"

#include <functional>
#include <set>
#include <string>
#include <vector>

namespace Channels
{
class VChannelContext;
class VSourceChannel;
} // namespace Channels

namespace Streaming
{

/// What a context has kept, as a recording: every channel from the context's first frame to its last, missing samples
/// where a channel has none. The capture may go on meanwhile: what comes later is not part of it, and frames that the
/// context forgets while they are copied are left out of all channels. Takes as much memory as the samples. Any thread.
/// i_rTakes says which channels; empty: all.
Recordings::VRecording CopyContext(const Channels::VChannelContext& i_rContext,
                                   const std::function<bool(const Channels::VSourceChannel&)>& i_rTakes = {});

/// The channels of a context that one C3D file has room for. Those that have more than one sample come first, so that
/// strays do not take the place of others. o_rRemarks says how many were left out, and names some.
std::set<const Channels::VSourceChannel*> ChooseForC3d(const Channels::VChannelContext& i_rContext,
                                                       std::vector<std::string>& o_rRemarks);

/// Makes a recording one that a C3D file can hold. Columns and joint angles become analog channels, one a component
/// ("name.component"), with their units. All analog channels get the rate of the fastest: each sample of a slower one
/// stands until its next. What has no place (segment poses, markers in another unit than the first, rates that do not
/// fit) is left out. o_rRemarks says what was changed or left out, a sentence for each kind of thing.
void FitToC3d(Recordings::VRecording& io_rRecording, std::vector<std::string>& o_rRemarks);

} // namespace Streaming
