#include "Store/EntryViews.h"

#include "Store/VEntryTable.h"
#include "StoreInterface/EntryFlag.h"

#include <iterator>

namespace Store
{

std::vector<VStoreEntry*> CommittedView::Children(const VStoreEntry& i_rEntry)
{
    if (!i_rEntry.pData)
        return {};
    return {i_rEntry.pData->Children.begin(), i_rEntry.pData->Children.end()};
}

VStoreEntry* CommittedView::FindChild(const VStoreEntry& i_rEntry, std::string_view i_Leaf)
{
    if (!i_rEntry.pData)
        return nullptr;
    const auto& rChildren = i_rEntry.pData->Children;
    const auto found = std::ranges::lower_bound(rChildren, i_Leaf, {},
                                                [](const VStoreEntry* i_pChild) { return i_pChild->Path.Leaf(); });
    return found != rChildren.end() && (*found)->Path.Leaf() == i_Leaf ? *found : nullptr;
}

std::uint32_t StagedView::Flags(const VStoreEntry& i_rEntry)
{
    const EntryChange* const pChange = i_rEntry.pChange.get();
    if (!pChange)
        return CommittedView::Flags(i_rEntry);
    const std::uint32_t committed = IsFresh(*pChange) ? 0 : CommittedView::Flags(i_rEntry);
    const auto staged = static_cast<std::uint32_t>((pChange->Mask & TQL::EChangeFlags::FlagBits).Value());
    return (committed & ~staged) | (pChange->Blocks.Get<EntryValueBlock>().Flags & staged);
}

const TQL::ISchema* StagedView::Schema(const VStoreEntry& i_rEntry)
{
    const EntryChange* const pChange = i_rEntry.pChange.get();
    if (pChange && (pChange->pSchema || IsFresh(*pChange)))
        return pChange->pSchema;
    return CommittedView::Schema(i_rEntry);
}

std::vector<VStoreEntry*> StagedView::Children(const VStoreEntry& i_rEntry)
{
    std::vector<VStoreEntry*> children = CommittedView::Children(i_rEntry);
    if (!i_rEntry.pChange)
        return children;
    std::erase_if(children, [](const VStoreEntry* i_pChild) { return !Exists(*i_pChild); });
    const auto committed = static_cast<std::ptrdiff_t>(children.size());
    std::ranges::copy_if(i_rEntry.pChange->Children, std::back_inserter(children),
                         [](const VStoreEntry* i_pChild) { return !i_pChild->pData && Exists(*i_pChild); });
    std::sort(children.begin() + committed, children.end(), IsBefore);
    children.erase(std::unique(children.begin() + committed, children.end()), children.end());
    std::inplace_merge(children.begin(), children.begin() + committed, children.end(), IsBefore);
    return children;
}

std::size_t StagedView::ChildCount(const VStoreEntry& i_rEntry)
{
    return i_rEntry.pChange ? Children(i_rEntry).size() : CommittedView::ChildCount(i_rEntry);
}

VStoreEntry* StagedView::FindChild(const VStoreEntry& i_rEntry, std::string_view i_Leaf)
{
    VStoreEntry* const pChild = i_rEntry.pTable->FindChild(i_rEntry, i_Leaf);
    return pChild && Exists(*pChild) ? pChild : nullptr;
}

} // namespace Store
