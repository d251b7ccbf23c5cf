#pragma once

#include <condition_variable>
#include <cstdint>
#include <deque>
#include <mutex>

namespace Store
{

/// The rules of the gate without threads: groups of members in arrival order, numbered by tickets. Every operation is
/// one step under the gate's mutex. A group has any number of readers and at most one writer; the head group is
/// inside, the others wait until the ticket reaches their number. The ticket moves by one at each commit only.
struct TicketGateState
{
    struct Group
    {
        std::uint64_t Ticket = 0;
        std::uint32_t MemberCount = 0;
    };

    std::deque<Group> Groups;
    std::uint64_t Ticket = 1; ///< the number of the next commit
    bool bWriterInTail = false;
    bool bCommitting = false; ///< the head group's writer waits for the head group's readers or commits

    /// Both give the ticket that the new member has to wait for.
    std::uint64_t JoinAsReader();
    std::uint64_t JoinAsWriter();
    /// True if this was the last reader that a committing writer waited for.
    [[nodiscard]] bool LeaveAsReader();
    void StartCommit();
    bool MayCommit() const { return Groups.front().MemberCount == 0; }
    /// Ends the head group and moves the ticket on. Gives the change id of the commit.
    std::uint64_t TakeCommit();

private:
    std::uint64_t PushReader(std::uint64_t i_Ticket);
    void PopHead();
};

enum class EGateMode
{
    Read,
    Write
};

/// What one thread holds of one gate.
struct GateHold
{
    EGateMode Mode = EGateMode::Read; ///< meaningful while Depth is not 0
    std::uint32_t Depth = 0;
    std::uint64_t ChangeId = 0; ///< of the state that is read; for a writer, of the commit that it will make
};

/// A fair gate between the readers and the writers of a store. Many readers or one commit are inside at a time; a
/// writer stages beside the readers of its group and waits for them only when it commits. Writers run one at a time
/// in the order in which they came, and whoever comes while a commit waits goes in after that commit.
/// The store owns the gate and lends it the mutex that guards it. The holds are each one thread's own; a thread that is
/// inside only moves its depth and takes no mutex. All operations from any thread.
class VTicketGate
{
public:
    explicit VTicketGate(std::mutex& i_rMutex) : m_rMutex(i_rMutex) {}
    VTicketGate(const VTicketGate&) = delete;
    VTicketGate& operator=(const VTicketGate&) = delete;

    /// Waits while a commit is due. Inside a write of the same thread the mode stays Write.
    void BeginRead(GateHold& io_rHold);
    /// True when the thread holds nothing any more. Only for a hold whose mode is Read or whose depth is above 1.
    bool EndRead(GateHold& io_rHold);
    /// Waits for the turn. False, without waiting, on a thread that reads: there is no upgrade.
    [[nodiscard]] bool BeginWrite(GateHold& io_rHold);
    /// The last end waits until the readers of the group have left and calls i_rCommit(changeId) with the mutex held.
    /// True when the thread holds nothing any more; then the mutex is free again. A commit that throws counts as made.
    template <typename TCommit>
    bool EndWrite(GateHold& io_rHold, const TCommit& i_rCommit)
    {
        if (io_rHold.Depth > 1)
        {
            --io_rHold.Depth;
            return false;
        }
        const TurnEnd wakeOthers{m_TicketMoved};
        std::unique_lock lock(m_rMutex);
        const std::uint64_t changeId = WaitForReaders(lock);
        io_rHold.Depth = 0;
        i_rCommit(changeId);
        return true;
    }

private:
    /// Wakes those who wait for their ticket, after the mutex that was taken later is free again.
    struct TurnEnd
    {
        std::condition_variable& rTicketMoved;
        ~TurnEnd() { rTicketMoved.notify_all(); }
    };

    void WaitForTurn(std::unique_lock<std::mutex>& io_rLock, std::uint64_t i_Ticket);
    std::uint64_t WaitForReaders(std::unique_lock<std::mutex>& io_rLock);

    std::mutex& m_rMutex;
    TicketGateState m_State; // guarded by m_rMutex
    std::condition_variable m_ReadersLeft;
    std::condition_variable m_TicketMoved;
};

} // namespace Store
