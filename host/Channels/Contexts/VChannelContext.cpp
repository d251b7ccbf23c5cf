#include "Channels/Contexts/VChannelContext.h"

#include <utility>

namespace Channels
{

VChannelContext::VChannelContext(std::string i_Name, ChannelSystem::EContextType i_Type, std::int64_t i_FramePeriod,
                                 std::shared_ptr<VSubTypeTable> i_pSubTypes)
    : m_Name(std::move(i_Name))
    , m_Type(i_Type)
    , m_FramePeriod(i_FramePeriod)
    , m_pSubTypes(std::move(i_pSubTypes))
    , m_pRangeChanged(std::make_shared<NotificationSystem::VChangeSignal>())
{
}

TQL::IResult VChannelContext::AddChannel(const ChannelDefinition& i_rDefinition,
                                         std::shared_ptr<VSampleStore> i_pSamples,
                                         std::shared_ptr<VSourceChannel>& o_rpChannel)
{
    auto pChannel = std::make_shared<VSourceChannel>(m_Name, i_rDefinition, *m_pSubTypes, std::move(i_pSamples));
    const std::lock_guard lock(m_Mutex);
    if (!m_ById.emplace(pChannel->GetInstanceId(), pChannel).second)
        return TQL::Result::AlreadyPresent;
    m_Channels.push_back(pChannel);
    m_pSnapshot = nullptr;
    o_rpChannel = std::move(pChannel);
    return TQL::Result::Ok;
}

std::shared_ptr<VSourceChannel> VChannelContext::FindChannel(const TQL::IChannelInstanceId& i_rId) const
{
    const std::lock_guard lock(m_Mutex);
    const auto channel = m_ById.find(i_rId);
    return channel == m_ById.end() ? nullptr : channel->second;
}

std::shared_ptr<const VChannelContext::ChannelList> VChannelContext::GetChannels() const
{
    const std::lock_guard lock(m_Mutex);
    if (!m_pSnapshot)
        m_pSnapshot = std::make_shared<const ChannelList>(m_Channels);
    return m_pSnapshot;
}

void VChannelContext::Retire()
{
    const std::shared_ptr<const ChannelList> pChannels = GetChannels();
    for (const std::shared_ptr<VSourceChannel>& rpChannel : *pChannels)
        rpChannel->Retire();
}

} // namespace Channels
