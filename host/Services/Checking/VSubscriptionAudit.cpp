#include "Services/Checking/VSubscriptionAudit.h"

#include "NotificationSystem/VMultiCallbackPostal.h"
#include "Services/Common/VHostSubscriptions.h"

#include <algorithm>

namespace Services
{

VSubscriptionAudit::VSubscriptionAudit(std::shared_ptr<const VHostSubscriptionLedger> i_pLedger)
    : m_pLedger(std::move(i_pLedger))
{
}

template <typename TSignal, typename... Args>
void VSubscriptionAudit::WatchSignal(const std::string& i_rName, const std::shared_ptr<TSignal>& i_rpSignal,
                                     Args... i_Args)
{
    const auto isSame = [&](const Watched& i_rWatched)
    {
        return i_rWatched.pSignal == i_rpSignal.get();
    };
    if (!i_rpSignal || std::ranges::any_of(m_Watched, isSame))
        return;
    const auto raise = [i_rpSignal, i_Args...]
    {
        if (auto* pSignal = dynamic_cast<NotificationSystem::VMultiCallbackPostal<void(Args...)>*>(i_rpSignal.get()))
            pSignal->Invoke(i_Args...);
    };
    // No subscriber has the handle 0, but asking for its removal makes the signal forget its empty lists.
    m_Watched.push_back({i_rName, i_rpSignal.get(), [i_rpSignal] { return i_rpSignal->Count(); }, raise,
                         [i_rpSignal]
                         {
                             i_rpSignal->Remove(0);
                         }});
}

void VSubscriptionAudit::Watch(const std::string& i_rName, const std::shared_ptr<TQL::IChangeSignal>& i_rpSignal)
{
    WatchSignal(i_rName, i_rpSignal);
}

void VSubscriptionAudit::Watch(const std::string& i_rName,
                               const std::shared_ptr<TQL::IMultiCallbackPostal<void(bool)>>& i_rpSignal)
{
    WatchSignal(i_rName, i_rpSignal, false);
}

void VSubscriptionAudit::Sweep()
{
    for (const Watched& rWatched : m_Watched)
        rWatched.Raise();
}

void VSubscriptionAudit::Purge()
{
    for (const Watched& rWatched : m_Watched)
        rWatched.Purge();
}

std::vector<std::string> VSubscriptionAudit::Leaks() const
{
    std::vector<std::string> leaks;
    for (const Watched& rWatched : m_Watched)
    {
        const std::size_t count = rWatched.Count();
        const std::size_t own = m_pLedger ? m_pLedger->Count(rWatched.pSignal) : 0;
        if (count > own)
            leaks.push_back(rWatched.Name + " still has " + std::to_string(count - own) +
                            " subscriber(s) of the plug-in");
    }
    return leaks;
}

} // namespace Services
