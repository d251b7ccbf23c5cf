#pragma once

#include "Store/VStaging.h"
#include "Store/VStoreEntry.h"

#include <algorithm>
#include <cstdint>
#include <string_view>
#include <vector>

namespace Store
{

/// How a reader sees an entry: as it was committed.
struct CommittedView
{
    static bool Exists(const VStoreEntry& i_rEntry) { return i_rEntry.pData != nullptr; }

    template <typename TBlock, typename T>
    static const T& Get(const VStoreEntry& i_rEntry, BlockField<TBlock, T> i_Field)
    {
        return Block<TBlock>(i_rEntry).*i_Field.pMember;
    }
    static std::uint32_t Flags(const VStoreEntry& i_rEntry) { return Block<EntryValueBlock>(i_rEntry).Flags; }
    static const TQL::ISchema* Schema(const VStoreEntry& i_rEntry)
    {
        return i_rEntry.pData ? i_rEntry.pData->pSchema : nullptr;
    }

    static std::vector<VStoreEntry*> Children(const VStoreEntry& i_rEntry);
    static std::size_t ChildCount(const VStoreEntry& i_rEntry)
    {
        return i_rEntry.pData ? i_rEntry.pData->Children.size() : 0;
    }
    static VStoreEntry* FindChild(const VStoreEntry& i_rEntry, std::string_view i_Leaf);

private:
    template <typename TBlock>
    static const TBlock& Block(const VStoreEntry& i_rEntry)
    {
        return i_rEntry.pData ? i_rEntry.pData->Blocks.Get<TBlock>() : EmptyBlock<TBlock>();
    }
};

/// How the writer sees an entry: what is staged, else, unless the entry is new to this write, what was committed.
struct StagedView
{
    static bool Exists(const VStoreEntry& i_rEntry)
    {
        const EntryChange* const pChange = i_rEntry.pChange.get();
        return pChange && IsFresh(*pChange) ? pChange->Mask.HasAny(TQL::EChangeFlags::Created)
                                            : i_rEntry.pData != nullptr;
    }

    template <typename TBlock, typename T>
    static const T& Get(const VStoreEntry& i_rEntry, BlockField<TBlock, T> i_Field)
    {
        if (const EntryChange* const pChange = i_rEntry.pChange.get())
        {
            if (pChange->Mask.HasAny(i_Field.Bit))
                return pChange->Blocks.Get<TBlock>().*i_Field.pMember;
            if (IsFresh(*pChange))
                return EmptyBlock<TBlock>().*i_Field.pMember;
        }
        return CommittedView::Get(i_rEntry, i_Field);
    }
    static std::uint32_t Flags(const VStoreEntry& i_rEntry);
    static const TQL::ISchema* Schema(const VStoreEntry& i_rEntry);

    static std::vector<VStoreEntry*> Children(const VStoreEntry& i_rEntry);
    static std::size_t ChildCount(const VStoreEntry& i_rEntry);
    /// Under the store's mutex: there may be very many staged children, so the table is asked.
    static VStoreEntry* FindChild(const VStoreEntry& i_rEntry, std::string_view i_Leaf);
};

} // namespace Store
