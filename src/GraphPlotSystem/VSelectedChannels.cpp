#include "GraphPlotSystem/VSelectedChannels.h"

#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelSelectionManager.h"
#include "GraphPlotSystem/WeakObjectCallback.h"
#include "NotificationSystem/VDispatchCollapsers.h"

namespace GraphPlotUI
{
namespace
{

/// Leaves out the types that are never plotted and those that only developers see.
constexpr std::uint64_t s_TypeMask = 6;

} // namespace

VSelectedChannels::VSelectedChannels(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                                     std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                                     QObject* i_pParent)
    : QObject(i_pParent)
    , m_pChannelService(std::move(i_pChannelService))
    , m_pChannelsChanged(std::make_shared<NotificationSystem::VChangeSignal>())
{
    const auto pCollapser = NotificationSystem::MakeCollapserDontPost(std::move(i_pUiPostalService));
    const auto rebuild =
        MakeWeakObjectCallback(this, [](VSelectedChannels& i_rSelf, const auto&...) { i_rSelf.Rebuild(); });
    if (const auto pManager = m_pChannelService->GetSelectionManager())
        m_Subscriptions.Subscribe<void(bool)>(pManager->SelectionChanged(), rebuild, pCollapser);
    m_Subscriptions.Subscribe<void()>(m_pChannelService->ContextListChanged(), rebuild, pCollapser);
    m_Subscriptions.Subscribe<void()>(m_pChannelService->TypeListChanged(), rebuild, pCollapser);
}

void VSelectedChannels::SetContext(const std::string& i_rName)
{
    m_ContextName = i_rName;
    Rebuild();
}

void VSelectedChannels::Rebuild()
{
    ChannelList channels = FindSelectedChannels();
    if (channels == m_Channels)
        return;
    m_Channels = std::move(channels);
    m_pChannelsChanged->Invoke();
    Q_EMIT CountChanged();
}

VSelectedChannels::ChannelList VSelectedChannels::FindSelectedChannels() const
{
    ChannelList channels;
    const auto pManager = m_pChannelService->GetSelectionManager();
    if (m_ContextName.empty() || !pManager)
        return channels;
    std::vector<TQL::IChannelInstanceId> ids;
    for (const std::string& rType : m_pChannelService->GetChannelTypes(s_TypeMask, m_ContextName))
    {
        pManager->GetSelectedChannelIds(m_ContextName, rType, ids);
        for (const TQL::IChannelInstanceId& rId : ids)
            if (auto pChannel = m_pChannelService->GetChannel(rId))
                channels.push_back(std::move(pChannel));
    }
    return channels;
}

} // namespace GraphPlotUI
