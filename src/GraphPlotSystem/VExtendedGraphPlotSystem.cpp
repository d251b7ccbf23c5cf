#include "GraphPlotSystem/VExtendedGraphPlotSystem.h"

#include "ChannelSystem/IChannel.h"
#include "GraphPlotSystem/Channels/VActiveChannelManager.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Common/StateResults.h"
#include "GraphPlotSystem/Subplots/VKeyModel.h"
#include "GraphPlotSystem/Subplots/VSubplotManager.h"
#include "GraphPlotSystem/Texts/IChannelComponentControls.h"
#include "GraphPlotSystem/Texts/VChannelComponentModel.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "NotificationSystem/WeakCallback.h"

#include <array>

namespace GraphPlotUI
{

VExtendedGraphPlotSystem::VExtendedGraphPlotSystem(std::shared_ptr<VGraphPlotContext> i_pContext,
                                                   std::shared_ptr<VTraceManager> i_pTraceManager,
                                                   std::shared_ptr<VBaseGraphPlotTime> i_pPlotTime,
                                                   GraphPlotModels i_Models,
                                                   std::shared_ptr<TQL::IPostalService> i_pUiPostalService)
    : VGraphPlotSystem(std::move(i_pContext), std::move(i_pTraceManager), std::move(i_pPlotTime))
    , m_Models(std::move(i_Models))
    , m_pUiPostalService(std::move(i_pUiPostalService))
{
}

VExtendedGraphPlotSystem::~VExtendedGraphPlotSystem() = default;

VActiveChannelModel* VExtendedGraphPlotSystem::GetActiveChannelModel() const
{
    return m_Models.pActiveChannelModel;
}

VChannelComponentModel* VExtendedGraphPlotSystem::GetChannelComponentModel() const
{
    return m_Models.pComponentModel;
}

VKeyModel* VExtendedGraphPlotSystem::GetKeyModel() const
{
    return m_Models.pKeyModel;
}

void VExtendedGraphPlotSystem::OnPostCreation()
{
    m_Models.pActiveChannelModel->ChannelsChanged()->Add(
        NotificationSystem::MakeWeakCallback(WeakSelf(this), &VExtendedGraphPlotSystem::OnChannelsChanged),
        NotificationSystem::MakeCollapserDontPost(m_pUiPostalService));
}

void VExtendedGraphPlotSystem::OnChannelsChanged()
{
    if (!m_Models.pActiveChannelModel)
        return;
    const VActiveChannelModel::ChannelList channels = m_Models.pActiveChannelModel->GetChannels();
    GetTraceManager()->SetChannels(channels);
    std::vector<TQL::IChannelInstanceId> ids;
    ids.reserve(channels.size());
    for (const std::shared_ptr<TQL::IChannel>& rpChannel : channels)
        ids.push_back(rpChannel->GetInstanceId());
    m_Models.pComponentModel->SetChannels(std::move(ids));
}

void VExtendedGraphPlotSystem::BuildState(GraphPlotState& o_rState)
{
    VGraphPlotSystem::BuildState(o_rState);
    o_rState.PinnedChannels = m_Models.pActiveChannelModel->GetPinnedChannels();
    o_rState.ActiveChannels.DisabledComponents = m_Models.pComponentControls->GetDisabledTable();
    o_rState.ActiveChannels.bShowKey = m_Models.pKeyModel->GetShowKey();
    m_Models.pActiveChannelManager->SaveState(o_rState.ActiveChannels);
    m_Models.pSubplotManager->SaveState(o_rState.Subplots);
}

void VExtendedGraphPlotSystem::ApplyState(TQL::IResult& o_rResult, const GraphPlotState& i_rState)
{
    std::array<TQL::IResult, 6> results; // one a part; those that cannot fail count as done
    VGraphPlotSystem::ApplyState(results[0], i_rState);
    m_Models.pActiveChannelModel->Restore(i_rState.PinnedChannels);
    m_Models.pComponentControls->SetDisabledTable(i_rState.ActiveChannels.DisabledComponents);
    m_Models.pKeyModel->SetShowKey(i_rState.ActiveChannels.bShowKey);
    results[4] = m_Models.pActiveChannelManager->LoadState(i_rState.ActiveChannels);
    m_Models.pSubplotManager->LoadState(i_rState.Subplots);
    o_rResult = CombineStateResults(results);
}

void VExtendedGraphPlotSystem::SetContext(const std::string& i_rName)
{
    VGraphPlotSystem::SetContext(i_rName);
    m_Models.pActiveChannelManager->SetDataContext(i_rName);
}

void VExtendedGraphPlotSystem::Reset()
{
    VGraphPlotSystem::Reset();
    m_Models.pActiveChannelManager->ClearContext();
    if (m_Models.pActiveChannelModel)
        m_Models.pActiveChannelModel->clear();
}

} // namespace GraphPlotUI
