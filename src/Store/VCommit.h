#pragma once

#include "Store/VHandlerRegistry.h"
#include "Store/VStaging.h"

namespace Store
{

/// A notice that the writer asked for beside the changes; an empty mask asks for the check of unverified values.
struct QueuedNotice
{
    HandlerKey Key;
    TQL::ChangeFlags What;
};

/// One commit: merges the staged records into the committed state, from the root down, and tells the handlers of each
/// entry what changed there and below. Runs under the store's mutex with no reader inside.
class VCommit
{
public:
    VCommit(VEntryTable& i_rTable, VStaging& i_rStaging, VHandlerRegistry& i_rHandlers, TQL::ChangeId i_Id)
        : m_rTable(i_rTable), m_rStaging(i_rStaging), m_rHandlers(i_rHandlers), m_Id(i_Id)
    {
    }

    void Run();
    /// After Run: tells the handlers of the entries that the key names and that exist, and of all below them.
    void Tell(const QueuedNotice& i_rNotice);

private:
    TQL::ChangeFlags CommitEntry(VStoreEntry& i_rEntry);
    TQL::ChangeFlags CommitChildren(VStoreEntry& i_rEntry);
    void TellSubtree(VStoreEntry& i_rEntry, TQL::ChangeFlags i_What);

    VEntryTable& m_rTable;
    VStaging& m_rStaging;
    VHandlerRegistry& m_rHandlers;
    const TQL::ChangeId m_Id;
};

} // namespace Store
