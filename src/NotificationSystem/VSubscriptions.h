#pragma once

#include "TQL/IMultiCallback.h"

#include <deque>
#include <functional>
#include <memory>
#include <utility>

namespace NotificationSystem
{

/// Holds the subscriptions of one object and ends them, front first, when drained or destroyed. Keeps each
/// multi-callback alive until its subscription has been ended. One thread.
class VSubscriptions
{
public:
    VSubscriptions() = default;
    ~VSubscriptions() { Drain(); }
    VSubscriptions(const VSubscriptions&) = delete;
    VSubscriptions& operator=(const VSubscriptions&) = delete;

    /// Through the given postal service; a null service calls on the thread that invokes.
    template <typename Signature>
    void Subscribe(const std::shared_ptr<TQL::IMultiCallbackPostal<Signature>>& i_rpSignal,
                   typename TQL::IMultiCallbackPostal<Signature>::Callback i_Callback,
                   std::shared_ptr<TQL::IPostalService> i_pPostalService)
    {
        const auto handle = i_rpSignal->Add(std::move(i_Callback), std::move(i_pPostalService));
        m_Removals.push_back([pSignal = i_rpSignal.get(), handle] { pSignal->Remove(handle); });
        m_Kept.push_back(i_rpSignal);
    }

    void Drain()
    {
        while (!m_Removals.empty())
        {
            m_Removals.front()();
            m_Removals.pop_front();
            m_Kept.pop_front();
        }
    }

    bool IsEmpty() const { return m_Removals.empty(); }

private:
    std::deque<std::function<void()>> m_Removals;
    std::deque<std::shared_ptr<void>> m_Kept;
};

} // namespace NotificationSystem
