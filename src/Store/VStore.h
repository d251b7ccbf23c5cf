#pragma once

#include "NotificationSystem/VFirstFault.h"
#include "Store/EntryPatterns.h"
#include "Store/VCommit.h"
#include "Store/VEntryTable.h"
#include "Store/VHandlerRegistry.h"
#include "Store/VStaging.h"
#include "Store/VThreadSlots.h"
#include "Store/VTicketGate.h"
#include "StoreInterface/IStore.h"
#include "TQL/VShared.h"

#include <condition_variable>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <type_traits>
#include <vector>

namespace Store
{

class VStoreReader;
class VStoreWriter;

/// What one commit told.
struct CommitNotices
{
    NoticeList List;
    TQL::ChangeId Commit;
    bool bClosed = false;   ///< nobody is to be told
    std::uint64_t Turn = 0; ///< in the order of posting; 0 where nothing is to be posted
};

/// The store. Made by TQL::MakeShared; handlers refer to it weakly and do nothing once it is gone. Its mutex guards the
/// gate, the table of entries and the handlers, and is held during a commit; no callable runs and no handler is
/// destroyed under it. What was told is posted in the order of commits: EndWrite waits until the threads that committed
/// before have posted, and returns when its own notices are posted. An exception of a callable or of a postal service
/// leaves EndWrite or EndRead after all the others have been told.
class VStore final : public TQL::IStore, public TQL::VShared
{
public:
    /// i_pOwner is only kept and given back.
    explicit VStore(std::shared_ptr<void> i_pOwner = nullptr, std::size_t i_BucketCount = 1024);
    ~VStore() override;

    const EntryPath& GetPath(const EntryPath& i_rPath) override;
    void Close() override;
    EntryHandle GetRoot() const override { return EntryHandle(&m_Table.Root()); }
    EntryHandle GetEntry(const EntryPath& i_rPath) override;
    const EntryPath& GetEntryPath(EntryHandle i_Entry) const override;
    TQL::IStoreReader& BeginRead() override;
    void EndRead() override;
    TQL::IStoreWriter* BeginWrite() override;
    void EndWrite() override;
    std::shared_ptr<TQL::IHandlerCallback> GetHandlerCallback(const HandlerKey& i_rKey) override;
    std::shared_ptr<void> GetOwner() const override { return m_pOwner; }

    /// The handlers that somebody holds, for a host that looks for what a plug-in has left.
    std::vector<std::shared_ptr<VHandlerCallback>> GetHandlers() const;

    // For the reader and the writer.
    std::shared_ptr<VStore> GetShared();
    VStoreEntry* Own(EntryHandle i_Entry) const { return m_Table.Own(i_Entry); }
    TQL::ChangeId GetChangeIdOfThisThread() const;
    void Defer(std::function<void()> i_Callable);
    VStaging& Staging() { return m_Staging; }
    void QueueNotice(QueuedNotice i_Notice) { m_QueuedNotices.push_back(std::move(i_Notice)); }
    template <typename TView>
    std::vector<EntryHandle> FindEntries(const EntryPath& i_rPattern) const
    {
        const std::lock_guard lock(m_Mutex);
        return FindAll<TView>(m_Table, i_rPattern);
    }
    template <typename TView>
    VStoreEntry* FindChild(const VStoreEntry& i_rEntry, std::string_view i_Leaf) const
    {
        if constexpr (std::is_same_v<TView, CommittedView>)
            return TView::FindChild(i_rEntry, i_Leaf);
        const std::lock_guard lock(m_Mutex);
        return TView::FindChild(i_rEntry, i_Leaf);
    }

private:
    std::shared_ptr<const CommitNotices> Commit(ThreadSlot& io_rSlot, TQL::ChangeId i_Id);
    void PostNotices(ThreadSlot& io_rSlot, NotificationSystem::VFirstFault& io_rFault);
    void PostInTurn(const CommitNotices& i_rNotices, NotificationSystem::VFirstFault& io_rFault);
    static void QueueDirectCalls(ThreadSlot& io_rSlot, const CommitNotices& i_rNotices);
    static void RunDirectCalls(ThreadSlot& io_rSlot, NotificationSystem::VFirstFault& io_rFault);
    void ReleaseHandler(VHandlerCallback& i_rHandler);

    const std::shared_ptr<void> m_pOwner;
    mutable std::mutex m_Mutex;
    bool m_bClosed = false; // guarded by m_Mutex
    VTicketGate m_Gate;
    VThreadSlots m_Slots;
    VEntryTable m_Table;                       // guarded by m_Mutex
    VHandlerRegistry m_Handlers;               // guarded by m_Mutex
    VStaging m_Staging;                        // the writer's
    std::vector<QueuedNotice> m_QueuedNotices; // the writer's
    std::unique_ptr<VStoreReader> m_pReader;
    std::unique_ptr<VStoreWriter> m_pWriter;

    std::mutex m_PostMutex; // taken after m_Mutex, never before it
    std::condition_variable m_TurnMoved;
    std::uint64_t m_LastTurn = 0; // guarded by m_PostMutex; given out
    std::uint64_t m_Posted = 0;   // guarded by m_PostMutex; the last turn that is through
};

} // namespace Store
