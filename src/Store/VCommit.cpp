#include "Store/VCommit.h"

#include "Store/EntryApply.h"
#include "Store/EntryPatterns.h"

#include <algorithm>
#include <iterator>

namespace Store
{

using TQL::ChangeFlags;
using enum TQL::EChangeFlags;

void VCommit::Run()
{
    if (m_rTable.Root().pChange)
        CommitEntry(m_rTable.Root());
}

ChangeFlags VCommit::CommitEntry(VStoreEntry& i_rEntry)
{
    ChangeFlags report;
    EntryChange& rChange = *i_rEntry.pChange;
    const bool bRecreated = i_rEntry.pData && rChange.Mask.HasAny(Created);
    if (!i_rEntry.pData)
    {
        i_rEntry.pData = std::make_unique<EntryData>();
        m_rHandlers.AttachWaiting(i_rEntry);
        report |= Created;
    }
    report |= CommitChildren(i_rEntry);
    const bool bRemoved = rChange.Mask.HasAny(Removed);
    ApplyChange(*i_rEntry.pData, rChange, bRecreated, m_Id, report);
    m_rHandlers.Tell(i_rEntry, report);
    if (bRemoved)
        i_rEntry.pData.reset();
    m_rStaging.Release(i_rEntry);
    return report;
}

/// Children that came are merged in, and those that went taken out, once for all: one by one would move the whole list
/// each time.
ChangeFlags VCommit::CommitChildren(VStoreEntry& i_rEntry)
{
    ChangeFlags report;
    std::vector<VStoreEntry*>& rStaged = i_rEntry.pChange->Children;
    std::erase_if(rStaged, [](const VStoreEntry* i_pChild) { return !i_pChild->pChange; });
    std::ranges::sort(rStaged, IsBefore);
    rStaged.erase(std::unique(rStaged.begin(), rStaged.end()), rStaged.end());

    auto& rChildren = i_rEntry.pData->Children;
    const auto before = static_cast<std::ptrdiff_t>(rChildren.size());
    bool bWent = false;
    for (VStoreEntry* const pChild : rStaged)
    {
        if (!pChild->pData)
            rChildren.push_back(pChild);
        report |= MoveUp(CommitEntry(*pChild));
        bWent = bWent || !pChild->pData;
    }
    if (static_cast<std::ptrdiff_t>(rChildren.size()) > before)
        std::inplace_merge(rChildren.begin(), rChildren.begin() + before, rChildren.end(), IsBefore);
    if (bWent)
        rChildren.erase(std::remove_if(rChildren.begin(), rChildren.end(),
                                       [](const VStoreEntry* i_pChild) { return !i_pChild->pData; }),
                        rChildren.end());
    return report;
}

void VCommit::Tell(const QueuedNotice& i_rNotice)
{
    std::vector<EntryHandle> entries = i_rNotice.Key.Entries;
    for (const EntryPath& rPattern : i_rNotice.Key.Patterns)
        std::ranges::copy(FindAll<CommittedView>(m_rTable, rPattern), std::back_inserter(entries));
    for (const EntryHandle entry : entries)
        if (VStoreEntry* const pEntry = m_rTable.Own(entry); pEntry && pEntry->pData)
            TellSubtree(*pEntry, i_rNotice.What);
}

void VCommit::TellSubtree(VStoreEntry& i_rEntry, ChangeFlags i_What)
{
    if (!i_What.IsEmpty())
        m_rHandlers.Tell(i_rEntry, i_What);
    else if (IsUnverified(i_rEntry.pData->Blocks.Get<EntryValueBlock>()))
        m_rHandlers.Tell(i_rEntry, Unverified);
    for (VStoreEntry* const pChild : i_rEntry.pData->Children)
        TellSubtree(*pChild, i_What);
}

} // namespace Store
