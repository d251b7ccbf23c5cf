#include "Services/Common/VHostSubscriptions.h"

namespace Services
{

void VHostSubscriptionLedger::Add(const void* i_pSignal)
{
    const std::lock_guard lock(m_Mutex);
    ++m_Counts[i_pSignal];
}

void VHostSubscriptionLedger::Remove(const void* i_pSignal)
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Counts.find(i_pSignal);
    if (found != m_Counts.end() && --found->second == 0)
        m_Counts.erase(found);
}

std::size_t VHostSubscriptionLedger::Count(const void* i_pSignal) const
{
    const std::lock_guard lock(m_Mutex);
    const auto found = m_Counts.find(i_pSignal);
    return found == m_Counts.end() ? 0 : found->second;
}

VHostSubscriptions::VHostSubscriptions(std::shared_ptr<VHostSubscriptionLedger> i_pLedger)
    : m_pLedger(std::move(i_pLedger))
{
}

VHostSubscriptions::~VHostSubscriptions()
{
    Drain();
}

void VHostSubscriptions::Drain()
{
    // The ledger first: a signal that is freed by the drain may lend its address to another.
    if (m_pLedger)
        for (const void* pSignal : m_Signals)
            m_pLedger->Remove(pSignal);
    m_Signals.clear();
    m_Subscriptions.Drain();
}

void VHostSubscriptions::Enter(const void* i_pSignal)
{
    m_Signals.push_back(i_pSignal);
    if (m_pLedger)
        m_pLedger->Add(i_pSignal);
}

} // namespace Services
