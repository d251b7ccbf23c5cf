#pragma once

#include "NotificationSystem/VMultiCallbackPostal.h"
#include "StoreInterface/HandlerKey.h"
#include "StoreInterface/IHandlerCallback.h"

#include <map>
#include <memory>
#include <mutex>
#include <utility>
#include <vector>

namespace Store
{

/// A handler of one store: who subscribed for the changes of one key. Held by those who asked for it; the store refers
/// to it weakly. No callable runs, and no callable or postal service is destroyed, while the handler's mutex is held.
class VHandlerCallback final : public TQL::IHandlerCallback, public std::enable_shared_from_this<VHandlerCallback>
{
public:
    using Direct = NotificationSystem::VMultiCallback<void(TQL::ChangeFlags, TQL::ChangeId)>;
    using Posted = NotificationSystem::VMultiCallbackPostal<void(TQL::ChangeFlags, TQL::ChangeId)>;

    explicit VHandlerCallback(HandlerKey i_Key) : m_Key(std::move(i_Key)) {}

    const HandlerKey& Key() const { return m_Key; }
    /// What the commit that runs has told so far; guarded by the store's mutex.
    TQL::ChangeFlags& Pending() { return m_Pending; }

    /// The direct subscribers, null when there are none.
    std::shared_ptr<Direct> GetDirect();
    /// Posts the calls to the posted subscribers; a service that fails keeps no other from its call.
    void Post(TQL::ChangeFlags i_What, TQL::ChangeId i_Commit, NotificationSystem::VFirstFault& io_rFault);

    TQL::IHandlerCallbackProxy GetProxy() override;
    TQL::IResult Subscribe(Token& o_rToken, Callback i_Callback, std::uint32_t i_Option) override;
    TQL::IResult SubscribePostal(Token& o_rToken, std::shared_ptr<TQL::IPostalService> i_pService, Callback i_Callback,
                                 std::uint32_t i_Option) override;
    TQL::IResult SubscribeDirect(Token& o_rToken, Callback i_Callback) override;
    TQL::IResult UnsubscribeCallback(Token i_Token) override;
    std::size_t RemoveSubscription(Token i_Token) override;
    std::size_t Clear() override;
    std::size_t GetSubscriptionCount(Token i_Token) const override;
    std::size_t GetTotalSubscriptionCount() const override;
    void SetDefaultPostalService(std::shared_ptr<TQL::IPostalService> i_pService) override;

private:
    struct Lists
    {
        std::shared_ptr<Direct> pDirect;
        std::vector<std::shared_ptr<VHandlerCallback::Posted>> Posted;
    };
    using PostedLists = std::map<std::shared_ptr<TQL::IPostalService>, std::shared_ptr<Posted>>;

    Lists CopyLists() const;
    void DropEmpty();

    const HandlerKey m_Key;
    TQL::ChangeFlags m_Pending;
    mutable std::mutex m_Mutex;
    std::shared_ptr<TQL::IPostalService> m_pDefaultService; // guarded by m_Mutex
    std::shared_ptr<Direct> m_pDirect;                      // guarded by m_Mutex
    PostedLists m_Posted;                                   // guarded by m_Mutex
};

} // namespace Store
