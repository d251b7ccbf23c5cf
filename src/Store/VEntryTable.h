#pragma once

#include "Store/VStoreEntry.h"

#include <cstddef>
#include <deque>
#include <string_view>
#include <vector>

namespace Store
{

/// Owns all nodes of one store and finds them by path: a chained hash table that doubles when there are more entries
/// than buckets. Not thread-safe: the store's mutex guards it.
class VEntryTable
{
public:
    /// i_BucketCount is rounded up to a power of two. Makes the root.
    explicit VEntryTable(std::size_t i_BucketCount);

    VStoreEntry& Root() { return m_Entries.front(); }
    const VStoreEntry& Root() const { return m_Entries.front(); }
    VStoreEntry* Find(std::string_view i_Text, std::uint64_t i_Hash) const;
    /// Makes what is missing of the parents too. Not for a path with a wildcard.
    VStoreEntry& FindOrCreate(const EntryPath& i_rPath);
    VStoreEntry* FindChild(const VStoreEntry& i_rParent, std::string_view i_Leaf) const;

    /// The node that a handle names; null for a null handle and for one of another store. Needs no mutex.
    VStoreEntry* Own(EntryHandle i_Entry) const
    {
        VStoreEntry* const pEntry = const_cast<VStoreEntry*>(i_Entry.Get());
        return pEntry && pEntry->pTable == this ? pEntry : nullptr;
    }

private:
    VStoreEntry& Add(EntryPath i_Path, VStoreEntry* i_pParent);
    void Grow();
    VStoreEntry*& Bucket(std::uint64_t i_Hash) { return m_Buckets[i_Hash & (m_Buckets.size() - 1)]; }

    std::deque<VStoreEntry> m_Entries;
    std::vector<VStoreEntry*> m_Buckets;
};

} // namespace Store
