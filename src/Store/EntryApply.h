#pragma once

#include "Store/VStoreEntry.h"

namespace Store
{

/// Merges a staged record into an entry's committed data and adds what changed to io_rReport, which already holds what
/// changed below. Moves values out of the record. Gives the entry's change ids their new value. i_bRecreated: the entry
/// lives but was removed and came back, so that what the record does not hold becomes empty.
void ApplyChange(EntryData& io_rData, EntryChange& io_rChange, bool i_bRecreated, TQL::ChangeId i_Commit,
                 TQL::ChangeFlags& io_rReport);

/// Whether VerifyRequired is set and the verified and the proposed value differ.
bool IsUnverified(const EntryValueBlock& i_rValues);

/// What a parent reports of a child's report: creation and removal move one level down, the rest stays.
TQL::ChangeFlags MoveUp(TQL::ChangeFlags i_Report);

} // namespace Store
