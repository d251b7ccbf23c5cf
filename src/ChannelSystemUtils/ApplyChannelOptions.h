#pragma once

#include "ChannelSystemUtils/VActiveChannelOptions.h"
#include "TQL/IResult.h"

#include <memory>

namespace ChannelSystem
{
class IChannelService;
}
namespace TQL
{
class IChannelOutput;
}

namespace ChannelSystemUtils
{

/// Derives from a source what the operator wants to see of it: rotation format or derivative, then magnitude and units.
/// o_rpOutput becomes the output of the last derivation that the host could make, the source itself when it made none:
/// an option that does not fit the source is silently left out. InvalidArgument for a null source, else Ok. UI thread.
TQL::IResult ApplyChannelOptions(ChannelSystem::IChannelService& i_rService,
                                 const std::shared_ptr<TQL::IChannelOutput>& i_rpSource,
                                 const VActiveChannelOptions& i_rOptions,
                                 std::shared_ptr<TQL::IChannelOutput>& o_rpOutput);

} // namespace ChannelSystemUtils
