#pragma once

#include "GraphPlotSystem/Channels/ChannelTypeRows.h"

#include <string>
#include <vector>

namespace ChannelSystem
{
class IChannelService;
}

namespace TQL
{
class IChannelTypeRegistry;
}

namespace GraphPlotUI
{

/// Which of the host's channel types a picker offers.
struct ChannelTypeScope
{
    std::string ContextName;
    bool bDeveloperMode = false;
    bool bSelectedTypes = true; ///< those that apply to what is selected; otherwise the global ones
};

/// The rows of a picker as the host's types stand now, in their order: the start row, then the types that the host
/// lists and those that it can create, under headers. A type is on one side only: it is global when the host's
/// selection says so or when it is created from nothing. The registry may be null. UI thread.
std::vector<ChannelTypeRow> ListChannelTypes(const ChannelSystem::IChannelService& i_rChannelService,
                                             const TQL::IChannelTypeRegistry* i_pTypeRegistry,
                                             const ChannelTypeScope& i_rScope);

} // namespace GraphPlotUI
