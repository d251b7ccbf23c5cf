#pragma once

#include "StoreIO/FirstResult.h"
#include "StoreInterface/IStoreWriter.h"

namespace StoreIO
{

/// Removes all that is below an entry; the entry stays. The first failure, or else the first result that is not `Ok`.
inline TQL::IResult RemoveChildren(TQL::IStoreWriter& i_rWriter, Store::EntryHandle i_Entry)
{
    TQL::IResult result;
    for (const Store::EntryHandle child : i_rWriter.GetChildren(i_Entry))
        KeepFirst(result, i_rWriter.RemoveEntry(child));
    return result;
}

} // namespace StoreIO
