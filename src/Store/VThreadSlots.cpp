#include "Store/VThreadSlots.h"

#include <algorithm>
#include <mutex>

namespace Store
{
namespace
{

struct SlotNumbers
{
    std::mutex Mutex;
    std::vector<bool> Used;       // guarded by Mutex
    std::uint64_t LastSerial = 0; // guarded by Mutex
};

/// Never destroyed: a store may outlive the end of main.
SlotNumbers& Numbers()
{
    static auto* const s_pNumbers = new SlotNumbers;
    return *s_pNumbers;
}

} // namespace

VThreadSlots::VThreadSlots()
{
    SlotNumbers& rNumbers = Numbers();
    const std::lock_guard lock(rNumbers.Mutex);
    const auto free = std::find(rNumbers.Used.begin(), rNumbers.Used.end(), false);
    m_Number = static_cast<std::size_t>(free - rNumbers.Used.begin());
    if (free == rNumbers.Used.end())
        rNumbers.Used.push_back(true);
    else
        *free = true;
    m_Serial = ++rNumbers.LastSerial;
}

VThreadSlots::~VThreadSlots()
{
    SlotNumbers& rNumbers = Numbers();
    const std::lock_guard lock(rNumbers.Mutex);
    rNumbers.Used[m_Number] = false;
}

ThreadSlot& VThreadSlots::OfThisThread() const
{
    // A deque: references to its slots stay valid when a callable on this thread makes another store.
    thread_local std::deque<ThreadSlot> s_Slots;
    if (s_Slots.size() <= m_Number)
        s_Slots.resize(m_Number + 1);
    ThreadSlot& rSlot = s_Slots[m_Number];
    if (rSlot.StoreSerial != m_Serial)
    {
        rSlot = ThreadSlot{};
        rSlot.StoreSerial = m_Serial;
    }
    return rSlot;
}

} // namespace Store
