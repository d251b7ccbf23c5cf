#include "Store/VEntryTable.h"

#include <algorithm>
#include <bit>
#include <utility>

namespace Store
{

VEntryTable::VEntryTable(std::size_t i_BucketCount) : m_Buckets(std::bit_ceil(std::max<std::size_t>(i_BucketCount, 1)))
{
    Add(EntryPath(), nullptr);
}

VStoreEntry* VEntryTable::Find(std::string_view i_Text, std::uint64_t i_Hash) const
{
    VStoreEntry* pEntry = m_Buckets[i_Hash & (m_Buckets.size() - 1)];
    while (pEntry && (pEntry->Path.Hash() != i_Hash || pEntry->Path.Text() != i_Text))
        pEntry = pEntry->pNextInBucket;
    return pEntry;
}

VStoreEntry& VEntryTable::FindOrCreate(const EntryPath& i_rPath)
{
    if (VStoreEntry* const pEntry = Find(i_rPath.Text(), i_rPath.Hash()))
        return *pEntry;
    VStoreEntry& rParent = FindOrCreate(i_rPath.Parent());
    return Add(i_rPath, &rParent);
}

VStoreEntry* VEntryTable::FindChild(const VStoreEntry& i_rParent, std::string_view i_Leaf) const
{
    const EntryPath path = i_rParent.Path / i_Leaf;
    VStoreEntry* const pEntry = Find(path.Text(), path.Hash());
    return pEntry && pEntry->pParent == &i_rParent && pEntry->Path.Leaf() == i_Leaf ? pEntry : nullptr;
}

VStoreEntry& VEntryTable::Add(EntryPath i_Path, VStoreEntry* i_pParent)
{
    if (m_Entries.size() >= m_Buckets.size())
        Grow();
    VStoreEntry& rEntry = m_Entries.emplace_back(std::move(i_Path), i_pParent, *this);
    VStoreEntry*& rpBucket = Bucket(rEntry.Path.Hash());
    rEntry.pNextInBucket = std::exchange(rpBucket, &rEntry);
    return rEntry;
}

void VEntryTable::Grow()
{
    m_Buckets.assign(m_Buckets.size() * 2, nullptr);
    for (VStoreEntry& rEntry : m_Entries)
    {
        VStoreEntry*& rpBucket = Bucket(rEntry.Path.Hash());
        rEntry.pNextInBucket = std::exchange(rpBucket, &rEntry);
    }
}

} // namespace Store
