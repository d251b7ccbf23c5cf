#pragma once

#include "NotificationSystem/VMultiCallback.h"
#include "TQL/IPostalService.h"

#include <map>
#include <tuple>
#include <utility>

namespace NotificationSystem
{

/// The subscriber side of a signal that calls each subscriber through its postal service. Subscribers of one service
/// share one inner list; the key null holds the direct ones. Thread-safe; no lock is held while a subscriber runs, or
/// while one, or a postal service, is destroyed.
template <typename Signature>
class VMultiCallbackPostalBase;

template <typename... Args>
class VMultiCallbackPostalBase<void(Args...)> : public TQL::IMultiCallbackPostal<void(Args...)>
{
public:
    using Inner = VMultiCallback<void(Args...)>;
    using typename TQL::IMultiCallbackPostal<void(Args...)>::Callback;
    using typename TQL::IMultiCallbackPostal<void(Args...)>::Handle;

    explicit VMultiCallbackPostalBase(std::shared_ptr<TQL::IPostalService> i_pDefault = nullptr)
        : m_pDefault(std::move(i_pDefault))
    {
    }

    Handle Add(Callback i_Callback) override { return AddFor(m_pDefault, std::move(i_Callback)); }

    Handle Add(Callback i_Callback, std::shared_ptr<TQL::IPostalService> i_pPostalService) override
    {
        return AddFor(std::move(i_pPostalService), std::move(i_Callback));
    }

    Handle AddDirect(Callback i_Callback) override { return AddFor(nullptr, std::move(i_Callback)); }

    std::size_t Remove(Handle i_Handle) override
    {
        std::size_t removed = 0;
        for (const auto& [pService, pInner] : Snapshot())
            removed += pInner->Remove(i_Handle);
        DropEmpty();
        return removed;
    }

    std::size_t RemoveAll() override
    {
        std::size_t removed = 0;
        for (const auto& [pService, pInner] : Snapshot())
            removed += pInner->RemoveAll();
        DropEmpty();
        return removed;
    }

    std::size_t Count() const override
    {
        const std::lock_guard lock(m_Mutex);
        std::size_t count = 0;
        for (const auto& [pService, pInner] : m_Inner)
            count += pInner->Count();
        return count;
    }

    /// 1 while there is a subscriber of that handle, else 0.
    std::size_t CountOf(Handle i_Handle) const
    {
        const std::lock_guard lock(m_Mutex);
        std::size_t count = 0;
        for (const auto& [pService, pInner] : m_Inner)
            count += pInner->CountOf(i_Handle);
        return count;
    }

protected:
    using Pair = std::pair<std::shared_ptr<TQL::IPostalService>, std::shared_ptr<Inner>>;

    bool HasNoSubscriber() const { return m_NoSubscriber.load(std::memory_order_acquire) != 0; }

    /// Copies of the lists that have subscribers.
    std::vector<Pair> Snapshot()
    {
        InnerLists dropped;
        const std::lock_guard lock(m_Mutex);
        dropped = TakeEmptyLocked();
        return std::vector<Pair>(m_Inner.begin(), m_Inner.end());
    }

    /// The direct list when it is the only one, else null: the usual case, taken without a copy of the map.
    std::shared_ptr<Inner> OnlyDirect()
    {
        InnerLists dropped;
        const std::lock_guard lock(m_Mutex);
        dropped = TakeEmptyLocked();
        return m_Inner.size() == 1 && !m_Inner.begin()->first ? m_Inner.begin()->second : nullptr;
    }

private:
    using InnerLists = std::map<std::shared_ptr<TQL::IPostalService>, std::shared_ptr<Inner>>;

    Handle AddFor(std::shared_ptr<TQL::IPostalService> i_pService, Callback i_Callback)
    {
        const std::lock_guard lock(m_Mutex);
        std::shared_ptr<Inner>& rpInner = m_Inner[std::move(i_pService)];
        if (!rpInner)
            rpInner = std::make_shared<Inner>();
        const Handle handle = rpInner->Add(std::move(i_Callback));
        m_NoSubscriber.store(0, std::memory_order_release);
        return handle;
    }

    void DropEmpty()
    {
        InnerLists dropped;
        const std::lock_guard lock(m_Mutex);
        dropped = TakeEmptyLocked();
    }

    /// What is taken out may be the last owner of a postal service and of the jobs that wait in it, so it is let go of
    /// after the mutex.
    [[nodiscard]] InnerLists TakeEmptyLocked()
    {
        InnerLists taken;
        for (auto next = m_Inner.begin(); next != m_Inner.end();)
            if (const auto inner = next++; inner->second->IsEmpty())
                taken.insert(m_Inner.extract(inner));
        m_NoSubscriber.store(m_Inner.empty() ? 1 : 0, std::memory_order_release);
        return taken;
    }

    mutable std::mutex m_Mutex;
    const std::shared_ptr<TQL::IPostalService> m_pDefault;
    InnerLists m_Inner; // guarded by m_Mutex
    std::atomic<std::uint64_t> m_NoSubscriber{1};
};

template <typename Signature>
class VMultiCallbackPostal;

/// The signal itself. Without subscribers an Invoke costs one atomic load.
template <typename... Args>
class VMultiCallbackPostal<void(Args...)> : public VMultiCallbackPostalBase<void(Args...)>
{
    using Base = VMultiCallbackPostalBase<void(Args...)>;

public:
    using VMultiCallbackPostalBase<void(Args...)>::VMultiCallbackPostalBase;

    /// Posts one call to each service that has subscribers, with the arguments by value, and calls the direct ones on
    /// this thread. A subscriber added before the posted job runs is called too. False when nobody listens.
    bool Invoke(const Args&... i_rArgs)
    {
        if (this->HasNoSubscriber())
            return false;
        if (const auto pDirect = this->OnlyDirect())
            return pDirect->Invoke(i_rArgs...);
        bool bReached = false;
        for (auto& [pService, pInner] : this->Snapshot())
        {
            if (!pService)
            {
                bReached = pInner->Invoke(i_rArgs...) || bReached;
                continue;
            }
            pService->Post([pKept = pInner, arguments = std::make_tuple(i_rArgs...)]
                           { std::apply([&pKept](const auto&... i_rKept) { pKept->Invoke(i_rKept...); }, arguments); });
            bReached = true;
        }
        return bReached;
    }
};

/// The common signal: something changed, look.
using VChangeSignal = VMultiCallbackPostal<void()>;

} // namespace NotificationSystem
