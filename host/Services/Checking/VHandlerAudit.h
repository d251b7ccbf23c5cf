#pragma once

#include <memory>
#include <set>
#include <string>
#include <vector>

namespace TQL
{
class IStore;
}

namespace Services
{

class VHostSubscriptionLedger;

/// Looks for handlers that a plug-in left in the preferences store: those that came since this was made and that the
/// ledger does not know as the host's. A handler lives while somebody holds it, and with it all that subscribed.
/// Nothing is found in a store of another class than the studio's. One life of a plug-in; UI thread.
class VHandlerAudit
{
public:
    VHandlerAudit(std::shared_ptr<TQL::IStore> i_pStore, std::shared_ptr<const VHostSubscriptionLedger> i_pLedger);

    /// One sentence for each handler.
    std::vector<std::string> Leftovers() const;

private:
    const std::shared_ptr<TQL::IStore> m_pStore;
    const std::shared_ptr<const VHostSubscriptionLedger> m_pLedger;
    std::set<const void*> m_Before;
};

} // namespace Services
