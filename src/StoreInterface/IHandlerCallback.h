#pragma once

#include "StoreInterface/EChangeFlags.h"
#include "StoreInterface/ITypedId.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>

namespace TQL
{

class IHandlerCallbackProxy;
class IPostalService;

/// Tells subscribers of changes at the entries of a store that it was made for (IStore::GetHandlerCallback). Callables
/// run after the commit with no access to the store held: posted ones through their service in the order of commits,
/// direct ones on the thread that committed. A callable whose weak target has died throws
/// VDeregisterWeakCallbackException and is dropped. All operations from any thread, also from inside a callable.
class IHandlerCallback
{
public:
    using Callback = std::function<void(ChangeFlags i_What, ChangeId i_Commit)>;
    using Token = std::uint64_t; ///< names one subscription while it lives; never 0

    virtual ~IHandlerCallback() = default;

    /// An empty proxy when the handler is being destroyed.
    virtual IHandlerCallbackProxy GetProxy() = 0;
    /// Through the default postal service; NotSet, and a token of 0, while none was set. Users pass 0 for i_Option.
    virtual IResult Subscribe(Token& o_rToken, Callback i_Callback, std::uint32_t i_Option) = 0;
    /// InvalidPointer, and a token of 0, for a null service.
    virtual IResult SubscribePostal(Token& o_rToken, std::shared_ptr<IPostalService> i_pService, Callback i_Callback,
                                    std::uint32_t i_Option) = 0;
    virtual IResult SubscribeDirect(Token& o_rToken, Callback i_Callback) = 0;
    /// NotFound when there is no such subscription.
    virtual IResult UnsubscribeCallback(Token i_Token) = 0;
    /// How many were removed: 1 or 0.
    virtual std::size_t RemoveSubscription(Token i_Token) = 0;
    /// How many were removed.
    virtual std::size_t Clear() = 0;
    virtual std::size_t GetSubscriptionCount(Token i_Token) const = 0; ///< 1 or 0
    virtual std::size_t GetTotalSubscriptionCount() const = 0;

    virtual void SetDefaultPostalService(std::shared_ptr<IPostalService> i_pService) = 0;
};

} // namespace TQL
