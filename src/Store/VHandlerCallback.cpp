#include "Store/VHandlerCallback.h"

#include "StoreInterface/IHandlerCallbackProxy.h"

#include <algorithm>
#include <utility>

namespace Store
{
namespace
{

/// What i_rCount gives, summed over all lists.
template <typename TLists, typename TCount>
std::size_t Sum(const TLists& i_rLists, const TCount& i_rCount)
{
    std::size_t sum = i_rLists.pDirect ? i_rCount(*i_rLists.pDirect) : 0;
    for (const auto& rpPosted : i_rLists.Posted)
        sum += i_rCount(*rpPosted);
    return sum;
}

} // namespace

std::shared_ptr<VHandlerCallback::Direct> VHandlerCallback::GetDirect()
{
    const std::lock_guard lock(m_Mutex);
    if (m_pDirect && m_pDirect->IsEmpty())
        m_pDirect.reset();
    return m_pDirect;
}

void VHandlerCallback::Post(TQL::ChangeFlags i_What, TQL::ChangeId i_Commit, NotificationSystem::VFirstFault& io_rFault)
{
    DropEmpty();
    for (const auto& rpPosted : CopyLists().Posted)
    {
        try
        {
            rpPosted->Invoke(i_What, i_Commit);
        }
        catch (...)
        {
            io_rFault.KeepCurrent();
        }
    }
}

TQL::IHandlerCallbackProxy VHandlerCallback::GetProxy()
{
    return TQL::IHandlerCallbackProxy(weak_from_this().lock());
}

TQL::IResult VHandlerCallback::Subscribe(Token& o_rToken, Callback i_Callback, std::uint32_t i_Option)
{
    o_rToken = 0;
    std::shared_ptr<TQL::IPostalService> pService;
    {
        const std::lock_guard lock(m_Mutex);
        pService = m_pDefaultService;
    }
    return pService ? SubscribePostal(o_rToken, std::move(pService), std::move(i_Callback), i_Option)
                    : TQL::Result::NotSet;
}

TQL::IResult VHandlerCallback::SubscribePostal(Token& o_rToken, std::shared_ptr<TQL::IPostalService> i_pService,
                                               Callback i_Callback, std::uint32_t)
{
    o_rToken = 0;
    if (!i_pService || !i_Callback)
        return TQL::Result::InvalidPointer;
    const std::lock_guard lock(m_Mutex);
    std::shared_ptr<Posted>& rpPosted = m_Posted[i_pService];
    if (!rpPosted)
        rpPosted = std::make_shared<Posted>(i_pService);
    o_rToken = rpPosted->Add(std::move(i_Callback));
    return TQL::Result::Ok;
}

TQL::IResult VHandlerCallback::SubscribeDirect(Token& o_rToken, Callback i_Callback)
{
    o_rToken = 0;
    if (!i_Callback)
        return TQL::Result::InvalidPointer;
    const std::lock_guard lock(m_Mutex);
    if (!m_pDirect)
        m_pDirect = std::make_shared<Direct>();
    o_rToken = m_pDirect->Add(std::move(i_Callback));
    return TQL::Result::Ok;
}

TQL::IResult VHandlerCallback::UnsubscribeCallback(Token i_Token)
{
    return RemoveSubscription(i_Token) > 0 ? TQL::Result::Ok : TQL::Result::NotFound;
}

std::size_t VHandlerCallback::RemoveSubscription(Token i_Token)
{
    const std::size_t removed = Sum(CopyLists(), [i_Token](auto& i_rList) { return i_rList.Remove(i_Token); });
    DropEmpty();
    return removed;
}

std::size_t VHandlerCallback::Clear()
{
    const std::size_t removed = Sum(CopyLists(), [](auto& i_rList) { return i_rList.RemoveAll(); });
    DropEmpty();
    return removed;
}

std::size_t VHandlerCallback::GetSubscriptionCount(Token i_Token) const
{
    return Sum(CopyLists(), [i_Token](auto& i_rList) { return i_rList.CountOf(i_Token); });
}

std::size_t VHandlerCallback::GetTotalSubscriptionCount() const
{
    return Sum(CopyLists(), [](auto& i_rList) { return i_rList.Count(); });
}

void VHandlerCallback::SetDefaultPostalService(std::shared_ptr<TQL::IPostalService> i_pService)
{
    const std::lock_guard lock(m_Mutex);
    m_pDefaultService.swap(i_pService);
}

VHandlerCallback::Lists VHandlerCallback::CopyLists() const
{
    const std::lock_guard lock(m_Mutex);
    Lists lists{m_pDirect, {}};
    for (const auto& [pService, pPosted] : m_Posted)
        lists.Posted.push_back(pPosted);
    return lists;
}

/// The lists have no callables, but the services of the posted ones may own jobs: they go after the mutex.
void VHandlerCallback::DropEmpty()
{
    PostedLists dropped;
    const std::lock_guard lock(m_Mutex);
    if (m_pDirect && m_pDirect->IsEmpty())
        m_pDirect.reset();
    for (auto next = m_Posted.begin(); next != m_Posted.end();)
        if (const auto posted = next++; posted->second->Count() == 0)
            dropped.insert(m_Posted.extract(posted));
}

} // namespace Store
