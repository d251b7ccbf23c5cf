#include "Store/VStaging.h"

namespace Store
{

using enum TQL::EChangeFlags;

EntryChange& VStaging::Stage(VStoreEntry& i_rEntry)
{
    VStoreEntry* pNewChild = nullptr;
    for (VStoreEntry* pEntry = &i_rEntry; pEntry; pEntry = pEntry->pParent)
    {
        const bool bNew = pEntry->pChange == nullptr;
        if (bNew)
        {
            pEntry->pChange = Take();
            if (!pEntry->pData)
                pEntry->pChange->Mask |= Created;
        }
        if (pNewChild)
            pEntry->pChange->Children.push_back(pNewChild);
        if (!bNew)
            break;
        pNewChild = pEntry;
    }
    return *i_rEntry.pChange;
}

EntryChange& VStaging::Write(VStoreEntry& i_rEntry)
{
    EntryChange& rChange = Stage(i_rEntry);
    for (VStoreEntry* pEntry = &i_rEntry; pEntry && IsFresh(*pEntry->pChange); pEntry = pEntry->pParent)
        pEntry->pChange->Mask = (pEntry->pChange->Mask & ~Removed) | Created;
    return rChange;
}

TQL::IResult VStaging::Remove(VStoreEntry& i_rEntry)
{
    const EntryChange* const pChange = i_rEntry.pChange.get();
    if (pChange ? pChange->Mask.HasAny(Removed) : !i_rEntry.pData)
        return TQL::Result::NotFound;
    if (i_rEntry.pData)
        MarkRemoved(i_rEntry);
    else
        Vanish(i_rEntry);
    return TQL::Result::Ok;
}

void VStaging::MarkRemoved(VStoreEntry& i_rEntry)
{
    EntryChange& rChange = Stage(i_rEntry);
    if (rChange.Mask.HasAny(Removed))
        return;
    for (std::size_t i = 0, count = rChange.Children.size(); i < count; ++i)
        if (rChange.Children[i]->pChange && !rChange.Children[i]->pData)
            Vanish(*rChange.Children[i]);
    for (VStoreEntry* const pChild : i_rEntry.pData->Children)
        MarkRemoved(*pChild);
    rChange.ClearAttributes();
    rChange.Mask = Removed;
}

void VStaging::Vanish(VStoreEntry& i_rEntry)
{
    for (VStoreEntry* const pChild : i_rEntry.pChange->Children)
        if (pChild->pChange)
            Vanish(*pChild);
    Release(i_rEntry);
}

void VStaging::Release(VStoreEntry& i_rEntry)
{
    std::unique_ptr<EntryChange> pChange = std::move(i_rEntry.pChange);
    if (m_Unused.size() >= s_MostUnused)
        return;
    pChange->ClearAttributes();
    pChange->Children.clear();
    if (pChange->Children.capacity() > 64)
        pChange->Children.shrink_to_fit();
    m_Unused.push_back(std::move(pChange));
}

std::unique_ptr<EntryChange> VStaging::Take()
{
    if (m_Unused.empty())
        return std::make_unique<EntryChange>();
    auto pChange = std::move(m_Unused.back());
    m_Unused.pop_back();
    return pChange;
}

} // namespace Store
