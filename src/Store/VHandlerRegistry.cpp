#include "Store/VHandlerRegistry.h"

#include "Store/EntryPatterns.h"

#include <algorithm>

namespace Store
{
namespace
{

void AddOnce(std::vector<VHandlerCallback*>& io_rList, VHandlerCallback* i_pHandler)
{
    if (std::ranges::find(io_rList, i_pHandler) == io_rList.end())
        io_rList.push_back(i_pHandler);
}

} // namespace

std::shared_ptr<VHandlerCallback> VHandlerRegistry::Find(const HandlerKey& i_rKey) const
{
    const auto found = m_Handlers.find(i_rKey);
    return found != m_Handlers.end() ? found->second.pWeak.lock() : nullptr;
}

std::vector<std::shared_ptr<VHandlerCallback>> VHandlerRegistry::GetLiving() const
{
    std::vector<std::shared_ptr<VHandlerCallback>> handlers;
    for (const auto& [rKey, rKnown] : m_Handlers)
        if (auto pHandler = rKnown.pWeak.lock())
            handlers.push_back(std::move(pHandler));
    return handlers;
}

void VHandlerRegistry::Attach(const std::shared_ptr<VHandlerCallback>& i_rpHandler)
{
    VHandlerCallback* const pHandler = i_rpHandler.get();
    m_Handlers[pHandler->Key()] = {pHandler, i_rpHandler};
    for (const EntryHandle entry : pHandler->Key().Entries)
        if (VStoreEntry* const pEntry = m_rTable.Own(entry))
            pEntry->Handlers.push_back(pHandler);
    for (const EntryPath& rPattern : pHandler->Key().Patterns)
    {
        m_Patterns.emplace_back(rPattern, pHandler);
        for (const EntryHandle entry : FindAll<CommittedView>(m_rTable, rPattern))
            AddOnce(m_rTable.Own(entry)->pData->PathHandlers, pHandler);
    }
}

void VHandlerRegistry::Detach(VHandlerCallback& i_rHandler)
{
    VHandlerCallback* const pHandler = &i_rHandler;
    for (const EntryHandle entry : pHandler->Key().Entries)
        if (VStoreEntry* const pEntry = m_rTable.Own(entry))
            std::erase(pEntry->Handlers, pHandler);
    for (const EntryPath& rPattern : pHandler->Key().Patterns)
        for (const EntryHandle entry : FindAll<CommittedView>(m_rTable, rPattern))
            std::erase(m_rTable.Own(entry)->pData->PathHandlers, pHandler);
    std::erase_if(m_Patterns, [&](const auto& i_rPair) { return i_rPair.second == pHandler; });
    // A new handler may have taken the key over while this one was on its way out.
    const auto known = m_Handlers.find(pHandler->Key());
    if (known != m_Handlers.end() && known->second.pHandler == pHandler)
        m_Handlers.erase(known);
}

void VHandlerRegistry::AttachWaiting(VStoreEntry& i_rEntry)
{
    for (const auto& [pattern, pHandler] : m_Patterns)
        if (MatchesPattern(i_rEntry, pattern))
            AddOnce(i_rEntry.pData->PathHandlers, pHandler);
}

void VHandlerRegistry::Tell(VStoreEntry& i_rEntry, TQL::ChangeFlags i_What)
{
    if (i_What.IsEmpty())
        return;
    if (i_rEntry.pData)
        Tell(i_rEntry.pData->PathHandlers, i_What);
    Tell(i_rEntry.Handlers, i_What);
}

void VHandlerRegistry::Tell(const std::vector<VHandlerCallback*>& i_rHandlers, TQL::ChangeFlags i_What)
{
    for (VHandlerCallback* const pHandler : i_rHandlers)
    {
        if (pHandler->Pending().IsEmpty())
            m_Told.push_back(pHandler);
        pHandler->Pending() |= i_What;
    }
}

NoticeList VHandlerRegistry::TakeNotices()
{
    NoticeList notices;
    for (VHandlerCallback* const pHandler : m_Told)
    {
        const TQL::ChangeFlags what = std::exchange(pHandler->Pending(), {});
        if (auto pAlive = pHandler->weak_from_this().lock())
            notices.emplace_back(std::move(pAlive), what);
    }
    m_Told.clear();
    return notices;
}

} // namespace Store
