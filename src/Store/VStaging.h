#pragma once

#include "Store/VStoreEntry.h"
#include "TQL/IResult.h"

#include <deque>
#include <memory>
#include <vector>

namespace Store
{

/// Hangs change records on entries and takes them off again; keeps the unused ones for the next write. A record's
/// entry is linked into the records of its ancestors up to the root, so that a commit walks only what changed. Owned by
/// the store; used by the thread that writes or commits.
class VStaging
{
public:
    /// The entry's record, without bringing a removed entry back.
    EntryChange& Stage(VStoreEntry& i_rEntry);
    /// The entry's record, to be written to: the entry and what is missing above it come into being.
    EntryChange& Write(VStoreEntry& i_rEntry);
    /// The entry and all below it. What came into being in this write vanishes without a trace. NotFound when there is
    /// nothing to remove.
    TQL::IResult Remove(VStoreEntry& i_rEntry);
    /// Takes the record off the entry.
    void Release(VStoreEntry& i_rEntry);

private:
    static constexpr std::size_t s_MostUnused = 4096; // records kept; a large import gives the rest back

    std::unique_ptr<EntryChange> Take();
    void Vanish(VStoreEntry& i_rEntry);
    void MarkRemoved(VStoreEntry& i_rEntry);

    std::vector<std::unique_ptr<EntryChange>> m_Unused;
};

/// Whether the entry counts as new to the running write: what the record does not hold is empty.
inline bool IsFresh(const EntryChange& i_rChange)
{
    return i_rChange.Mask.HasAny(TQL::EChangeFlags::Created | TQL::EChangeFlags::Removed);
}

} // namespace Store
