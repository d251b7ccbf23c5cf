#pragma once

#include "Store/EntryViews.h"
#include "Store/VEntryTable.h"

#include <span>
#include <string_view>
#include <vector>

namespace Store
{

/// The components of a path that is not the root's; they refer to its text.
std::vector<std::string_view> SplitPath(const EntryPath& i_rPath);

/// Whether an entry is one of those that the path or pattern names.
bool MatchesPattern(const VStoreEntry& i_rEntry, const EntryPath& i_rPattern);

/// Below i_rEntry, for the pattern's components that are left. A branch ends at an entry that does not exist in the
/// view.
template <typename TView>
void FindMatches(const VStoreEntry& i_rEntry, std::span<const std::string_view> i_Components,
                 std::vector<EntryHandle>& o_rFound)
{
    if (!TView::Exists(i_rEntry))
        return;
    if (i_Components.empty())
    {
        o_rFound.emplace_back(&i_rEntry);
        return;
    }
    if (i_Components.front() == "*")
    {
        for (const VStoreEntry* const pChild : TView::Children(i_rEntry))
            FindMatches<TView>(*pChild, i_Components.subspan(1), o_rFound);
    }
    else if (const VStoreEntry* const pChild = TView::FindChild(i_rEntry, i_Components.front()))
        FindMatches<TView>(*pChild, i_Components.subspan(1), o_rFound);
}

/// All entries of a view that a path or pattern names, in the order of the tree. Under the store's mutex.
template <typename TView>
std::vector<EntryHandle> FindAll(const VEntryTable& i_rTable, const EntryPath& i_rPattern)
{
    std::vector<EntryHandle> found;
    if (i_rPattern.IsWildcard())
        FindMatches<TView>(i_rTable.Root(), SplitPath(i_rPattern), found);
    else if (const VStoreEntry* const pEntry = i_rTable.Find(i_rPattern.Text(), i_rPattern.Hash());
             pEntry && TView::Exists(*pEntry))
        found.emplace_back(pEntry);
    return found;
}

} // namespace Store
