#pragma once

#include "NotificationSystem/VFirstFault.h"
#include "TQL/IMultiCallback.h"

#include <algorithm>
#include <atomic>
#include <cstddef>
#include <memory>
#include <mutex>
#include <utility>
#include <vector>

namespace NotificationSystem
{

template <typename Signature>
class VMultiCallback;

/// A list of subscribers that are called directly, in the order of adding. Thread-safe; no lock is held while a
/// subscriber runs or is destroyed, so it may add or remove, itself too. One removed while a call is under way may
/// still get that call. A subscriber whose weak target has died is dropped after the call that finds it so; any other
/// exception passes through once all have been called.
template <typename... Args>
class VMultiCallback<void(Args...)> : public TQL::IMultiCallback<void(Args...)>
{
public:
    using typename TQL::IMultiCallback<void(Args...)>::Callback;
    using typename TQL::IMultiCallback<void(Args...)>::Handle;

    Handle Add(Callback i_Callback) override
    {
        auto pStored = std::make_shared<const Callback>(std::move(i_Callback));
        const Handle handle = HandleOf(pStored);
        std::shared_ptr<const List> pBefore; // let go of after the mutex: it may own callables that come back here
        const std::lock_guard lock(m_Mutex);
        pBefore = Replace([&](List& o_rList) { o_rList.push_back(std::move(pStored)); });
        return handle;
    }

    std::size_t Remove(Handle i_Handle) override
    {
        std::shared_ptr<const List> pBefore;
        const std::lock_guard lock(m_Mutex);
        const auto matches = [i_Handle](const Stored& i_rStored)
        {
            return HandleOf(i_rStored) == i_Handle;
        };
        if (!m_pList || std::ranges::none_of(*m_pList, matches))
            return 0;
        pBefore = Replace([&](List& o_rList) { std::erase_if(o_rList, matches); });
        return 1;
    }

    std::size_t RemoveAll() override
    {
        std::shared_ptr<const List> pBefore;
        const std::lock_guard lock(m_Mutex);
        m_pList.swap(pBefore);
        m_Empty.store(1, std::memory_order_release);
        return pBefore ? pBefore->size() : 0;
    }

    std::size_t Count() const override
    {
        const std::lock_guard lock(m_Mutex);
        return m_pList ? m_pList->size() : 0;
    }

    /// 1 while the subscriber of that handle is in the list, else 0.
    std::size_t CountOf(Handle i_Handle) const
    {
        const std::lock_guard lock(m_Mutex);
        const auto matches = [i_Handle](const Stored& i_rStored)
        {
            return HandleOf(i_rStored) == i_Handle;
        };
        return m_pList && std::ranges::any_of(*m_pList, matches) ? 1 : 0;
    }

    bool IsEmpty() const { return m_Empty.load(std::memory_order_acquire) != 0; }

    /// Calls every subscriber on this thread. False when there was none.
    bool Invoke(const Args&... i_rArgs)
    {
        std::shared_ptr<const List> pSnapshot;
        if (IsEmpty())
            return false;
        {
            const std::lock_guard lock(m_Mutex);
            pSnapshot = m_pList;
        }
        if (!pSnapshot)
            return false;
        std::vector<Handle> dead;
        VFirstFault fault;
        for (const Stored& rStored : *pSnapshot)
        {
            try
            {
                (*rStored)(i_rArgs...);
            }
            catch (const TQL::VDeregisterWeakCallbackException&)
            {
                dead.push_back(HandleOf(rStored));
            }
            catch (...)
            {
                fault.KeepCurrent();
            }
        }
        for (const Handle handle : dead)
            Remove(handle);
        fault.Rethrow();
        return true;
    }

private:
    using Stored = std::shared_ptr<const Callback>;
    using List = std::vector<Stored>;

    static Handle HandleOf(const Stored& i_rStored) { return reinterpret_cast<Handle>(i_rStored.get()); }

    /// Copy on write: a running Invoke keeps the list that it took, and taking it copies one pointer. Gives the list
    /// that stood before.
    template <typename TChange>
    [[nodiscard]] std::shared_ptr<const List> Replace(const TChange& i_rChange)
    {
        auto pList = m_pList ? std::make_shared<List>(*m_pList) : std::make_shared<List>();
        i_rChange(*pList);
        m_Empty.store(pList->empty() ? 1 : 0, std::memory_order_release);
        return std::exchange(m_pList, std::move(pList));
    }

    mutable std::mutex m_Mutex;
    std::shared_ptr<const List> m_pList; // guarded by m_Mutex; null or in the order of adding
    std::atomic<std::uint64_t> m_Empty{1};
};

} // namespace NotificationSystem
