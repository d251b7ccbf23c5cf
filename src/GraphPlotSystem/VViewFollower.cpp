#include "GraphPlotSystem/VViewFollower.h"

#include "ChannelSystem/IChannelContext.h"
#include "ChannelSystem/IChannelService.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/VExtendedGraphPlotSystem.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "NotificationSystem/WeakCallback.h"
#include "OrvanePluginInterface/ITimeController.h"
#include "TQL/Log.h"

#include <utility>

namespace GraphPlotUI
{
namespace
{

/// A context that spans all others: its channels can be plotted, but it has no time of its own.
constexpr const char* s_pGlobalContext = "GlobalItems";

} // namespace

VViewFollower::VViewFollower(std::shared_ptr<TQL::IPostalService> i_pUiPostalService,
                             std::shared_ptr<ChannelSystem::IChannelService> i_pChannelService,
                             std::shared_ptr<OrvanePluginInterface::ITimeController> i_pWindowContext,
                             std::shared_ptr<VExtendedGraphPlotSystem> i_pSystem)
    : m_pUiPostalService(std::move(i_pUiPostalService))
    , m_pChannelService(std::move(i_pChannelService))
    , m_pWindowContext(std::move(i_pWindowContext))
    , m_pSystem(std::move(i_pSystem))
{
}

VViewFollower::~VViewFollower() = default;

void VViewFollower::OnPostCreation()
{
    const auto pCollapser = NotificationSystem::MakeCollapserDontDispatch(m_pUiPostalService);
    const auto handler = NotificationSystem::MakeWeakCallback(WeakSelf(this), &VViewFollower::OnViewChanged);
    for (const auto& rpSignal : {m_pWindowContext->SourceListChanged(), m_pWindowContext->CurrentSourceChanged(),
                                 m_pWindowContext->GetSourceMap()->Changed(), m_pChannelService->ContextListChanged()})
        m_Subscriptions.Subscribe<void()>(rpSignal, handler, pCollapser);
    pCollapser->Post(handler);
}

VViewFollower::View VViewFollower::GetPresentView() const
{
    View view;
    m_pWindowContext->GetCurrentSourceName(view.ContextName);
    const auto pSource = m_pWindowContext->GetCurrentSource();
    view.bLive = !pSource || pSource->GetMode() != OrvanePluginInterface::ETimeMode::Review;
    view.pContext = m_pChannelService->GetContextByName(view.ContextName);
    return view;
}

void VViewFollower::OnViewChanged()
{
    View view = GetPresentView();
    if (!view.pContext)
        return;
    // A notice that changes neither view nor context must not throw away what the operator has set up since.
    if (view != m_View)
        ApplyStateOf(view);
    // What could not follow is gone from the list and told in the log.
    (void)m_pSystem->GetActiveChannelModel()->SwitchContext(view.ContextName,
                                                            m_pWindowContext->GetSourceMap()->GetNames());
    if (view.ContextName != s_pGlobalContext)
        m_pSystem->SetContext(view.ContextName);
    m_View = std::move(view);
}

void VViewFollower::ApplyStateOf(const View& i_rView)
{
    TQL::IResult result;
    m_pSystem->ApplyState(result, i_rView.bLive ? m_LiveState : m_ReviewState);
    if (result.IsError())
        TQL::Log::Format(TQL::Log::GetCategory("GraphPlot"), TQL::ELogSeverity::Error,
                         "Failed to load graph plot state: %1%", std::string(result.Description()));
}

} // namespace GraphPlotUI
