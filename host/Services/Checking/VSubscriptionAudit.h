#pragma once

#include "TQL/IMultiCallback.h"

#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace Services
{

class VHostSubscriptionLedger;

/// Looks for subscribers that a plug-in left behind. A subscriber whose target has died goes away only when its signal
/// is raised, so Sweep raises every watched signal; what then still counts more than the host's own is a leak. Made for
/// one unloading. UI thread.
class VSubscriptionAudit
{
public:
    explicit VSubscriptionAudit(std::shared_ptr<const VHostSubscriptionLedger> i_pLedger);

    /// Watches a signal under a name for people, for example "ITimeController::SourceListChanged". Null is ignored; a
    /// signal that is watched already keeps its first name.
    void Watch(const std::string& i_rName, const std::shared_ptr<TQL::IChangeSignal>& i_rpSignal);
    void Watch(const std::string& i_rName, const std::shared_ptr<TQL::IMultiCallbackPostal<void(bool)>>& i_rpSignal);

    /// Raises every signal, so that dead subscribers are dropped. The posted calls run when the services are drained.
    void Sweep();

    /// Forgets the postal services of subscribers that are gone. To be called after the drain that follows Sweep.
    void Purge();

    /// One sentence for each signal that still has subscribers which are not the host's.
    std::vector<std::string> Leaks() const;

private:
    struct Watched
    {
        std::string Name;
        const void* pSignal;
        std::function<std::size_t()> Count;
        std::function<void()> Raise;
        std::function<void()> Purge;
    };

    template <typename TSignal, typename... Args>
    void WatchSignal(const std::string& i_rName, const std::shared_ptr<TSignal>& i_rpSignal, Args... i_Args);

    const std::shared_ptr<const VHostSubscriptionLedger> m_pLedger;
    std::vector<Watched> m_Watched;
};

} // namespace Services
