#pragma once

#include "ChannelSystem/IChannel.h"

#include <memory>
#include <unordered_set>
#include <utility>
#include <vector>

namespace ChannelSystemUtils
{

/// Visits a channel and then all that it is made from, depth first and each once, until a visit says true; tells
/// whether one did. Channels may share what they are made from; a null one is passed over.
template <typename TVisit>
bool VisitChannels(const std::shared_ptr<TQL::IChannel>& i_rpChannel, const TVisit& i_rVisit)
{
    std::vector<std::shared_ptr<TQL::IChannel>> open{i_rpChannel};
    std::unordered_set<const TQL::IChannel*> seen;
    while (!open.empty())
    {
        const std::shared_ptr<TQL::IChannel> pChannel = std::move(open.back());
        open.pop_back();
        if (!pChannel || !seen.insert(pChannel.get()).second)
            continue;
        if (i_rVisit(*pChannel))
            return true;
        std::vector<std::shared_ptr<TQL::IChannel>> inputs;
        pChannel->GetDependentChannels(inputs);
        open.insert(open.end(), inputs.rbegin(), inputs.rend());
    }
    return false;
}

} // namespace ChannelSystemUtils
