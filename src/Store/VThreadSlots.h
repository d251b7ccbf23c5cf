#pragma once

#include "Store/VTicketGate.h"

#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <vector>

namespace Store
{

struct CommitNotices;

/// What one thread keeps about one store. Only that thread touches it.
struct ThreadSlot
{
    std::uint64_t StoreSerial = 0;
    GateHold Hold;
    std::vector<std::function<void()>> Deferred;             ///< run when the thread holds no access any more
    std::deque<std::shared_ptr<const CommitNotices>> ToPost; ///< of this thread's commits, in their order
    bool bPosting = false;
    std::deque<std::function<void()>> DirectCalls; ///< notices of this thread's commits, in their order
    bool bCalling = false;                         ///< while direct calls run
};

/// Gives each thread its slot for one store. The store owns it. Stores number themselves by the lowest free number, so
/// that a slot is found by one index; a serial that is never used twice tells a slot that an earlier store left behind.
/// Any thread; the reference stays valid on its thread while the store lives.
class VThreadSlots
{
public:
    VThreadSlots();
    ~VThreadSlots();
    VThreadSlots(const VThreadSlots&) = delete;
    VThreadSlots& operator=(const VThreadSlots&) = delete;

    ThreadSlot& OfThisThread() const;

private:
    std::size_t m_Number = 0;
    std::uint64_t m_Serial = 0;
};

} // namespace Store
