#pragma once

#include "ChannelSystem/IChannelContext.h"
#include "Channels/Blocks/VSourceChannel.h"
#include "Channels/Common/ChannelTypes.h"
#include "Channels/Common/VSubTypeTable.h"
#include "NotificationSystem/VMultiCallbackPostal.h"

#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

namespace Channels
{

/// What the live and the recorded context share: a name, a frame period and source channels. The service holds it as
/// long as it is listed. Any thread.
class VChannelContext : public ChannelSystem::IChannelContext
{
public:
    using ChannelList = std::vector<std::shared_ptr<VSourceChannel>>;

    std::shared_ptr<VSourceChannel> FindChannel(const TQL::IChannelInstanceId& i_rId) const;

    /// All channels in the order of adding, as they stand now.
    std::shared_ptr<const ChannelList> GetChannels() const;

    /// The context has left the host: every output is stale for ever, and no channel has one any more.
    void Retire();

    // IChannelContext
    const std::string& GetName() const override { return m_Name; }
    ChannelSystem::EContextType GetType() const override { return m_Type; }
    std::int64_t GetFramePeriod() const override { return m_FramePeriod; }
    std::shared_ptr<TQL::IChangeSignal> RangeChanged() const override { return m_pRangeChanged; }

protected:
    VChannelContext(std::string i_Name, ChannelSystem::EContextType i_Type, std::int64_t i_FramePeriod,
                    std::shared_ptr<VSubTypeTable> i_pSubTypes);

    /// AlreadyPresent when there is a channel of that id.
    TQL::IResult AddChannel(const ChannelDefinition& i_rDefinition, std::shared_ptr<VSampleStore> i_pSamples,
                            std::shared_ptr<VSourceChannel>& o_rpChannel);

    void InvokeRangeChanged() { m_pRangeChanged->Invoke(); }

private:
    const std::string m_Name;
    const ChannelSystem::EContextType m_Type;
    const std::int64_t m_FramePeriod;
    const std::shared_ptr<VSubTypeTable> m_pSubTypes;
    const std::shared_ptr<NotificationSystem::VChangeSignal> m_pRangeChanged;
    mutable std::mutex m_Mutex;
    mutable std::shared_ptr<const ChannelList> m_pSnapshot; // guarded by m_Mutex; null after a change
    ChannelList m_Channels;                                 // guarded by m_Mutex
    std::map<TQL::IChannelInstanceId, std::shared_ptr<VSourceChannel>> m_ById; // guarded by m_Mutex
};

} // namespace Channels
