#pragma once

#include "Store/EntryViews.h"

#include <utility>

namespace Store
{

/// Stages one attribute. The record must have been taken for writing.
template <typename TBlock, typename T>
void PutInto(EntryChange& io_rChange, BlockField<TBlock, T> i_Field, T i_Value)
{
    io_rChange.Blocks.Make<TBlock>().*i_Field.pMember = std::move(i_Value);
    io_rChange.Mask |= i_Field.Bit;
}

/// The staged attribute to be changed in place; taken over from what the writer sees on the first change.
template <typename TBlock, typename T>
T& StageCopy(const VStoreEntry& i_rEntry, EntryChange& io_rChange, BlockField<TBlock, T> i_Field)
{
    if (!io_rChange.Mask.HasAny(i_Field.Bit))
        PutInto(io_rChange, i_Field, T(StagedView::Get(i_rEntry, i_Field)));
    return io_rChange.Blocks.Make<TBlock>().*i_Field.pMember;
}

} // namespace Store
