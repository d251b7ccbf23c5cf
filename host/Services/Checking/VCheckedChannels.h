#pragma once

#include "ChannelSystem/IChannel.h"
#include "Services/Checking/VUseLedger.h"
#include "Services/Common/VFaultList.h"

#include <map>
#include <memory>
#include <mutex>
#include <vector>

namespace Services
{

class VCheckedChannel;

/// Stands a checked channel before each channel that a plug-in gets. What the plug-in takes through it (the channel,
/// its outputs and blocks, leases on their samples, subscriptions to its changes) is noted until it is given back.
/// While the plug-in holds a checked channel it gets the same one again. Owned by the checked channel service; any
/// thread.
class VCheckedChannels : public std::enable_shared_from_this<VCheckedChannels>
{
public:
    using ChannelPointer = std::shared_ptr<TQL::IChannel>;

    VCheckedChannels(std::shared_ptr<VUseLedger> i_pLedger, std::shared_ptr<VFaultList> i_pFaults);

    ChannelPointer Wrap(const ChannelPointer& i_rpChannel); ///< null for null
    /// The host's own channel behind a checked one; any other pointer comes back as it is.
    static ChannelPointer Unwrap(const ChannelPointer& i_rpChannel);
    static std::vector<ChannelPointer> UnwrapAll(const std::vector<ChannelPointer>& i_rChannels);

    const std::shared_ptr<VUseLedger>& Ledger() const { return m_pLedger; }

    void NoteLease(const void* i_pStore, std::uint64_t i_Token, const std::string& i_rName);
    /// Records a fault when no such lease is held.
    void NoteRelease(const void* i_pStore, std::uint64_t i_Token, const std::string& i_rName);

    /// A checked channel is gone.
    void Forget(const TQL::IChannel* i_pChannel);

private:
    using Lease = std::pair<const void*, std::uint64_t>; ///< store and token

    const std::shared_ptr<VUseLedger> m_pLedger;
    const std::shared_ptr<VFaultList> m_pFaults;
    std::mutex m_Mutex;
    std::map<const TQL::IChannel*, std::weak_ptr<VCheckedChannel>> m_Channels; // guarded by m_Mutex
    std::multimap<Lease, std::shared_ptr<void>> m_Leases;                      // guarded by m_Mutex
};

} // namespace Services
