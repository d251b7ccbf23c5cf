#pragma once

#include "ChannelSystem/IChannelContext.h"
#include "Services/Common/VHostSubscriptions.h"

#include <memory>

namespace Services
{

class VTimeSource;

/// Keeps the range of a time source in step with the channel context of the same name, on whichever thread the context
/// grows. Owned by whoever added both; ends with its destruction. The ledger knows its subscription as the host's own.
class VContextTimeFeed
{
public:
    VContextTimeFeed(const std::shared_ptr<ChannelSystem::IChannelContext>& i_rpContext,
                     const std::shared_ptr<VTimeSource>& i_rpSource,
                     std::shared_ptr<VHostSubscriptionLedger> i_pLedger);

private:
    VHostSubscriptions m_Subscriptions;
};

} // namespace Services
