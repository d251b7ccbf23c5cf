#pragma once

#include "Store/VEntryTable.h"
#include "Store/VHandlerCallback.h"

#include <map>
#include <memory>
#include <utility>
#include <vector>

namespace Store
{

/// The handlers whose entries a commit touched, each with what it is told. Keeps them alive.
using NoticeList = std::vector<std::pair<std::shared_ptr<VHandlerCallback>, TQL::ChangeFlags>>;

/// Which handlers there are, where they are attached, and what the commit that runs tells them. Refers to handlers
/// without owning them: one whose last owner has let go stays attached until Detach and is told nothing. Not
/// thread-safe: the store's mutex guards it.
class VHandlerRegistry
{
public:
    explicit VHandlerRegistry(VEntryTable& i_rTable) : m_rTable(i_rTable) {}

    /// The living handler of that (normalised) key, or null.
    std::shared_ptr<VHandlerCallback> Find(const HandlerKey& i_rKey) const;
    /// Those that somebody still owns.
    std::vector<std::shared_ptr<VHandlerCallback>> GetLiving() const;
    /// Enters the handler and attaches it to the entries that it names.
    void Attach(const std::shared_ptr<VHandlerCallback>& i_rpHandler);
    void Detach(VHandlerCallback& i_rHandler);

    /// An entry came into being: handlers that wait for it by a pattern are attached.
    void AttachWaiting(VStoreEntry& i_rEntry);
    /// Adds to the notices of the entry's handlers. Nothing for an empty mask.
    void Tell(VStoreEntry& i_rEntry, TQL::ChangeFlags i_What);
    /// What was told since the last call, in the order in which handlers were first told.
    NoticeList TakeNotices();

private:
    struct Known
    {
        VHandlerCallback* pHandler = nullptr;
        std::weak_ptr<VHandlerCallback> pWeak;
    };

    void Tell(const std::vector<VHandlerCallback*>& i_rHandlers, TQL::ChangeFlags i_What);

    VEntryTable& m_rTable;
    std::map<HandlerKey, Known> m_Handlers;
    std::vector<std::pair<EntryPath, VHandlerCallback*>> m_Patterns;
    std::vector<VHandlerCallback*> m_Told; ///< those whose pending notice is not empty
};

} // namespace Store
