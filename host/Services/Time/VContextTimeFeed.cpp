#include "Services/Time/VContextTimeFeed.h"

#include "Services/Time/VTimeSource.h"

namespace Services
{
namespace
{

void CopyRange(const ChannelSystem::IChannelContext& i_rContext, VTimeSource& i_rSource)
{
    i_rSource.SetRange(i_rContext.GetTickRange(), i_rContext.GetFramePeriod());
}

} // namespace

VContextTimeFeed::VContextTimeFeed(const std::shared_ptr<ChannelSystem::IChannelContext>& i_rpContext,
                                   const std::shared_ptr<VTimeSource>& i_rpSource,
                                   std::shared_ptr<VHostSubscriptionLedger> i_pLedger)
    : m_Subscriptions(std::move(i_pLedger))
{
    const auto copy = [pWeakContext = std::weak_ptr(i_rpContext), pWeakSource = std::weak_ptr(i_rpSource)]
    {
        const auto pContext = pWeakContext.lock();
        const auto pSource = pWeakSource.lock();
        if (pContext && pSource)
            CopyRange(*pContext, *pSource);
    };
    m_Subscriptions.Subscribe(i_rpContext->RangeChanged(), copy, nullptr);
    CopyRange(*i_rpContext, *i_rpSource);
}

} // namespace Services
