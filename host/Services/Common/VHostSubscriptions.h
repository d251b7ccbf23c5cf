#pragma once

#include "NotificationSystem/VSubscriptions.h"

#include <cstddef>
#include <map>
#include <memory>
#include <mutex>
#include <vector>

namespace Services
{

/// How many subscribers of each signal are the host's own, so that the check at the end of a plug-in does not take them
/// for the plug-in's. Owned by the host services. Any thread.
class VHostSubscriptionLedger
{
public:
    void Add(const void* i_pSignal);
    void Remove(const void* i_pSignal);
    std::size_t Count(const void* i_pSignal) const;

private:
    mutable std::mutex m_Mutex;
    std::map<const void*, std::size_t> m_Counts; // guarded by m_Mutex
};

/// Holds subscriptions of the host itself (its transport bar, its menus) and ends them when drained or destroyed, as
/// VSubscriptions does, and keeps the ledger in step. A null ledger is allowed. One thread.
class VHostSubscriptions
{
public:
    explicit VHostSubscriptions(std::shared_ptr<VHostSubscriptionLedger> i_pLedger);
    ~VHostSubscriptions();
    VHostSubscriptions(const VHostSubscriptions&) = delete;
    VHostSubscriptions& operator=(const VHostSubscriptions&) = delete;

    /// Through the given postal service; a null service calls on the thread that raises the signal.
    template <typename Signature>
    void Subscribe(const std::shared_ptr<TQL::IMultiCallbackPostal<Signature>>& i_rpSignal,
                   typename TQL::IMultiCallbackPostal<Signature>::Callback i_Callback,
                   std::shared_ptr<TQL::IPostalService> i_pPostalService)
    {
        Enter(i_rpSignal.get());
        m_Subscriptions.Subscribe(i_rpSignal, std::move(i_Callback), std::move(i_pPostalService));
    }

    void Drain();

private:
    void Enter(const void* i_pSignal);

    const std::shared_ptr<VHostSubscriptionLedger> m_pLedger;
    NotificationSystem::VSubscriptions m_Subscriptions;
    std::vector<const void*> m_Signals;
};

} // namespace Services
