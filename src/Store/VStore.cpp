#include "Store/VStore.h"

#include "Store/VStoreReader.h"
#include "Store/VStoreWriter.h"
#include "TQL/Log.h"

#include <utility>

namespace Store
{
namespace
{

using NotificationSystem::VFirstFault;

const EntryPath s_NoPath;

/// True while one of a thread's queues is being run, also where a callable throws.
class ScopedFlag
{
public:
    explicit ScopedFlag(bool& io_rbFlag) : m_rbFlag(io_rbFlag) { m_rbFlag = true; }
    ~ScopedFlag() { m_rbFlag = false; }
    ScopedFlag(const ScopedFlag&) = delete;
    ScopedFlag& operator=(const ScopedFlag&) = delete;

private:
    bool& m_rbFlag;
};

template <typename TCallable>
void RunGuarded(const TCallable& i_rCallable, VFirstFault& io_rFault)
{
    try
    {
        i_rCallable();
    }
    catch (...)
    {
        io_rFault.KeepCurrent();
    }
}

void LogUnmatched(const char* i_pText)
{
    static const TQL::VLogCategory& s_rCategory = TQL::Log::GetCategory("Store");
    TQL::Log::Write(s_rCategory, TQL::ELogSeverity::Error, i_pText);
}

} // namespace

VStore::VStore(std::shared_ptr<void> i_pOwner, std::size_t i_BucketCount)
    : m_pOwner(std::move(i_pOwner))
    , m_Gate(m_Mutex)
    , m_Table(i_BucketCount)
    , m_Handlers(m_Table)
    , m_pReader(std::make_unique<VStoreReader>(*this))
    , m_pWriter(std::make_unique<VStoreWriter>(*this))
{
}

VStore::~VStore() = default;

const EntryPath& VStore::GetPath(const EntryPath& i_rPath)
{
    return GetEntryPath(GetEntry(i_rPath));
}

EntryHandle VStore::GetEntry(const EntryPath& i_rPath)
{
    if (i_rPath.IsWildcard())
        return nullptr;
    const std::lock_guard lock(m_Mutex);
    return EntryHandle(&m_Table.FindOrCreate(i_rPath));
}

const EntryPath& VStore::GetEntryPath(EntryHandle i_Entry) const
{
    const VStoreEntry* const pEntry = Own(i_Entry);
    return pEntry ? pEntry->Path : s_NoPath;
}

void VStore::Close()
{
    const bool bWriting = BeginWrite() != nullptr;
    {
        const std::lock_guard lock(m_Mutex);
        m_bClosed = true;
    }
    if (bWriting)
        EndWrite();
}

TQL::IStoreReader& VStore::BeginRead()
{
    GateHold& rHold = m_Slots.OfThisThread().Hold;
    m_Gate.BeginRead(rHold);
    if (rHold.Mode == EGateMode::Write)
        return *m_pWriter;
    return *m_pReader;
}

void VStore::EndRead()
{
    ThreadSlot& rSlot = m_Slots.OfThisThread();
    if (rSlot.Hold.Depth == 0)
        return LogUnmatched("A read of a store was ended on a thread that had begun none.");
    if (rSlot.Hold.Depth == 1 && rSlot.Hold.Mode == EGateMode::Write)
        return EndWrite();
    if (!m_Gate.EndRead(rSlot.Hold) || rSlot.Deferred.empty())
        return;
    const auto pKept = weak_from_this().lock();
    VFirstFault fault;
    for (const auto& rCallable : std::exchange(rSlot.Deferred, {}))
        RunGuarded(rCallable, fault);
    fault.Rethrow();
}

TQL::IStoreWriter* VStore::BeginWrite()
{
    return m_Gate.BeginWrite(m_Slots.OfThisThread().Hold) ? m_pWriter.get() : nullptr;
}

void VStore::EndWrite()
{
    ThreadSlot& rSlot = m_Slots.OfThisThread();
    if (rSlot.Hold.Depth == 0 || rSlot.Hold.Mode == EGateMode::Read)
        return LogUnmatched("A write of a store was ended on a thread that had begun none.");
    std::shared_ptr<const CommitNotices> pNotices;
    if (!m_Gate.EndWrite(rSlot.Hold, [&](std::uint64_t i_Id) { pNotices = Commit(rSlot, TQL::ChangeId(i_Id)); }))
        return;
    const auto pKept = weak_from_this().lock();
    VFirstFault fault;
    PostNotices(rSlot, fault);
    if (!pNotices->bClosed)
        QueueDirectCalls(rSlot, *pNotices);
    pNotices.reset();
    for (auto& rCallable : std::exchange(rSlot.Deferred, {}))
        rSlot.DirectCalls.push_back(std::move(rCallable));
    RunDirectCalls(rSlot, fault);
    fault.Rethrow();
}

/// Under m_Mutex: what is returned keeps handlers alive, so it must be let go of after that. A turn that was given out
/// has to be taken, so nothing may fail after that.
std::shared_ptr<const CommitNotices> VStore::Commit(ThreadSlot& io_rSlot, TQL::ChangeId i_Id)
{
    VCommit commit(m_Table, m_Staging, m_Handlers, i_Id);
    commit.Run();
    for (const QueuedNotice& rNotice : std::exchange(m_QueuedNotices, {}))
        commit.Tell(rNotice);
    auto pNotices = std::make_shared<CommitNotices>(CommitNotices{m_Handlers.TakeNotices(), i_Id, m_bClosed, 0});
    if (!pNotices->bClosed && !pNotices->List.empty())
    {
        io_rSlot.ToPost.push_back(pNotices);
        const std::lock_guard lock(m_PostMutex);
        pNotices->Turn = ++m_LastTurn;
    }
    return pNotices;
}

/// A commit that is made inside Post, by a service that runs jobs there, is posted by the call outside.
void VStore::PostNotices(ThreadSlot& io_rSlot, VFirstFault& io_rFault)
{
    if (io_rSlot.bPosting)
        return;
    const ScopedFlag posting(io_rSlot.bPosting);
    while (!io_rSlot.ToPost.empty())
    {
        const auto pNotices = std::move(io_rSlot.ToPost.front());
        io_rSlot.ToPost.pop_front();
        PostInTurn(*pNotices, io_rFault);
    }
}

/// No lock is held while a service is called; the turn keeps the calls of several threads in order.
void VStore::PostInTurn(const CommitNotices& i_rNotices, VFirstFault& io_rFault)
{
    {
        std::unique_lock lock(m_PostMutex);
        m_TurnMoved.wait(lock, [&] { return m_Posted + 1 == i_rNotices.Turn; });
    }
    for (const auto& rNotice : i_rNotices.List)
        RunGuarded([&] { rNotice.first->Post(rNotice.second, i_rNotices.Commit, io_rFault); }, io_rFault);
    {
        const std::lock_guard lock(m_PostMutex);
        m_Posted = i_rNotices.Turn;
    }
    m_TurnMoved.notify_all();
}

void VStore::QueueDirectCalls(ThreadSlot& io_rSlot, const CommitNotices& i_rNotices)
{
    for (const auto& [pHandler, what] : i_rNotices.List)
        if (auto pDirect = pHandler->GetDirect())
            io_rSlot.DirectCalls.emplace_back([pDirect = std::move(pDirect), what = what, id = i_rNotices.Commit]
                                              { pDirect->Invoke(what, id); });
}

/// A commit made by one of the calls adds to the queue that is being run.
void VStore::RunDirectCalls(ThreadSlot& io_rSlot, VFirstFault& io_rFault)
{
    if (io_rSlot.bCalling)
        return;
    const ScopedFlag calling(io_rSlot.bCalling);
    while (!io_rSlot.DirectCalls.empty())
    {
        const auto call = std::move(io_rSlot.DirectCalls.front());
        io_rSlot.DirectCalls.pop_front();
        RunGuarded(call, io_rFault);
    }
}

std::shared_ptr<TQL::IHandlerCallback> VStore::GetHandlerCallback(const HandlerKey& i_rKey)
{
    const HandlerKey key = i_rKey.Normalised();
    const auto release = [pWeak = WeakSelf(this)](VHandlerCallback* i_pHandler)
    {
        if (const auto pStore = pWeak.lock())
            pStore->ReleaseHandler(*i_pHandler);
        delete i_pHandler;
    };
    std::shared_ptr<VHandlerCallback> pHandler; // let go of after the mutex, whatever happens
    const std::lock_guard lock(m_Mutex);
    pHandler = m_Handlers.Find(key);
    if (!pHandler)
    {
        pHandler = std::shared_ptr<VHandlerCallback>(new VHandlerCallback(key), release);
        m_Handlers.Attach(pHandler);
    }
    return pHandler;
}

std::vector<std::shared_ptr<VHandlerCallback>> VStore::GetHandlers() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Handlers.GetLiving();
}

void VStore::ReleaseHandler(VHandlerCallback& i_rHandler)
{
    const std::lock_guard lock(m_Mutex);
    m_Handlers.Detach(i_rHandler);
}

std::shared_ptr<VStore> VStore::GetShared()
{
    return std::static_pointer_cast<VStore>(shared_from_this());
}

TQL::ChangeId VStore::GetChangeIdOfThisThread() const
{
    return TQL::ChangeId(m_Slots.OfThisThread().Hold.ChangeId);
}

void VStore::Defer(std::function<void()> i_Callable)
{
    m_Slots.OfThisThread().Deferred.push_back(std::move(i_Callable));
}

} // namespace Store
