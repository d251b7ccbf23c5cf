#pragma once

#include "StoreInterface/IHandlerCallback.h"

#include <utility>

namespace TQL
{

/// Keeps a handler alive, and so its subscriptions, without showing the handler itself. A small value; an empty one
/// answers NotAvailable and 0. Any thread.
class IHandlerCallbackProxy
{
public:
    IHandlerCallbackProxy() = default;
    explicit IHandlerCallbackProxy(std::shared_ptr<IHandlerCallback> i_pHandler) : m_pHandler(std::move(i_pHandler)) {}

    explicit operator bool() const { return m_pHandler != nullptr; }

    IResult SubscribePostal(IHandlerCallback::Token& o_rToken, std::shared_ptr<IPostalService> i_pService,
                            IHandlerCallback::Callback i_Callback, std::uint32_t i_Option) const
    {
        o_rToken = 0;
        return m_pHandler
                   ? m_pHandler->SubscribePostal(o_rToken, std::move(i_pService), std::move(i_Callback), i_Option)
                   : Result::NotAvailable;
    }
    IResult SubscribeDirect(IHandlerCallback::Token& o_rToken, IHandlerCallback::Callback i_Callback) const
    {
        o_rToken = 0;
        return m_pHandler ? m_pHandler->SubscribeDirect(o_rToken, std::move(i_Callback)) : Result::NotAvailable;
    }
    std::size_t RemoveSubscription(IHandlerCallback::Token i_Token) const
    {
        return m_pHandler ? m_pHandler->RemoveSubscription(i_Token) : 0;
    }
    std::size_t GetTotalSubscriptionCount() const { return m_pHandler ? m_pHandler->GetTotalSubscriptionCount() : 0; }

private:
    std::shared_ptr<IHandlerCallback> m_pHandler;
};

} // namespace TQL
