#include "GraphPlotSystem/VExtendedGraphPlotSystem.h"

#include "NotificationSystem/VDispatchCollapsers.h"
#include "NotificationSystem/WeakCallback.h"

namespace GraphPlotUI
{

VExtendedGraphPlotSystem::VExtendedGraphPlotSystem(std::shared_ptr<VGraphPlotContext> i_pContext,
                                                   std::shared_ptr<VTraceManager> i_pTraceManager,
                                                   std::shared_ptr<VBaseGraphPlotTime> i_pPlotTime,
                                                   VSelectedChannels* i_pSelectedChannels,
                                                   VPlainSubplotModel* i_pSubplotModel,
                                                   std::shared_ptr<TQL::IPostalService> i_pUiPostalService)
    : VGraphPlotSystem(std::move(i_pContext), std::move(i_pTraceManager), std::move(i_pPlotTime))
    , m_pSelectedChannels(i_pSelectedChannels)
    , m_pSubplotModel(i_pSubplotModel)
    , m_pUiPostalService(std::move(i_pUiPostalService))
{
}

void VExtendedGraphPlotSystem::OnPostCreation()
{
    m_pSelectedChannels->ChannelsChanged()->Add(
        NotificationSystem::MakeWeakCallback(WeakSelf(this), &VExtendedGraphPlotSystem::OnChannelsChanged),
        NotificationSystem::MakeCollapserDontPost(m_pUiPostalService));
}

void VExtendedGraphPlotSystem::OnChannelsChanged()
{
    if (m_pSelectedChannels)
        GetTraceManager()->SetChannels(m_pSelectedChannels->GetChannels());
}

void VExtendedGraphPlotSystem::SetContext(const std::string& i_rName)
{
    VGraphPlotSystem::SetContext(i_rName);
    if (m_pSelectedChannels)
        m_pSelectedChannels->SetContext(i_rName);
}

void VExtendedGraphPlotSystem::Reset()
{
    VGraphPlotSystem::Reset();
    if (m_pSelectedChannels)
        m_pSelectedChannels->SetContext({});
}

} // namespace GraphPlotUI
