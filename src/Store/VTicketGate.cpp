#include "Store/VTicketGate.h"

#include <cassert>

namespace Store
{

std::uint64_t TicketGateState::JoinAsReader()
{
    if (Groups.empty())
        return PushReader(Ticket);
    if (!bCommitting)
    {
        ++Groups.front().MemberCount;
        return Ticket;
    }
    if (Groups.size() == 1)
        return PushReader(Ticket + 1);
    ++Groups[1].MemberCount;
    return Groups[1].Ticket;
}

std::uint64_t TicketGateState::JoinAsWriter()
{
    if (!Groups.empty() && !bWriterInTail)
        ++Groups.back().MemberCount;
    else
        Groups.push_back({Ticket + Groups.size(), 1});
    bWriterInTail = true;
    return Groups.back().Ticket;
}

bool TicketGateState::LeaveAsReader()
{
    if (--Groups.front().MemberCount > 0)
        return false;
    if (!bCommitting)
        PopHead();
    return bCommitting;
}

void TicketGateState::StartCommit()
{
    --Groups.front().MemberCount;
    bCommitting = true;
}

std::uint64_t TicketGateState::TakeCommit()
{
    PopHead();
    bCommitting = false;
    return Ticket++;
}

std::uint64_t TicketGateState::PushReader(std::uint64_t i_Ticket)
{
    Groups.push_back({i_Ticket, 1});
    bWriterInTail = false;
    return i_Ticket;
}

void TicketGateState::PopHead()
{
    Groups.pop_front();
    if (Groups.empty())
        bWriterInTail = false;
}

void VTicketGate::BeginRead(GateHold& io_rHold)
{
    if (io_rHold.Depth > 0)
    {
        ++io_rHold.Depth;
        return;
    }
    std::unique_lock lock(m_rMutex);
    WaitForTurn(lock, m_State.JoinAsReader());
    io_rHold = {EGateMode::Read, 1, m_State.Ticket - 1};
}

bool VTicketGate::EndRead(GateHold& io_rHold)
{
    assert(io_rHold.Depth > 1 || (io_rHold.Depth == 1 && io_rHold.Mode == EGateMode::Read));
    if (--io_rHold.Depth > 0)
        return false;
    std::unique_lock lock(m_rMutex);
    const bool bWriterMayCommit = m_State.LeaveAsReader();
    lock.unlock();
    if (bWriterMayCommit)
        m_ReadersLeft.notify_all();
    return true;
}

bool VTicketGate::BeginWrite(GateHold& io_rHold)
{
    if (io_rHold.Depth > 0)
    {
        if (io_rHold.Mode == EGateMode::Read)
            return false;
        ++io_rHold.Depth;
        return true;
    }
    std::unique_lock lock(m_rMutex);
    WaitForTurn(lock, m_State.JoinAsWriter());
    io_rHold = {EGateMode::Write, 1, m_State.Ticket};
    return true;
}

void VTicketGate::WaitForTurn(std::unique_lock<std::mutex>& io_rLock, std::uint64_t i_Ticket)
{
    m_TicketMoved.wait(io_rLock, [&] { return m_State.Ticket == i_Ticket; });
}

std::uint64_t VTicketGate::WaitForReaders(std::unique_lock<std::mutex>& io_rLock)
{
    m_State.StartCommit();
    m_ReadersLeft.wait(io_rLock, [&] { return m_State.MayCommit(); });
    return m_State.TakeCommit();
}

} // namespace Store
