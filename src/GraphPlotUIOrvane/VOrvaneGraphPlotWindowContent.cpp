#include "GraphPlotUIOrvane/VOrvaneGraphPlotWindowContent.h"

#include "ChannelSystem/IChannelContext.h"
#include "ChannelSystem/IChannelService.h"
#include "GraphPlotSystem/VActiveChannelModel.h"
#include "GraphPlotSystem/VExtendedGraphPlotSystem.h"
#include "GraphPlotSystem/WeakObjectCallback.h"
#include "GraphPlotUI/VGraphPlotWidget.h"
#include "GraphPlotUIOrvane/VOrvaneGraphPlotWindowContentFactory.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "OrvanePluginInterface/IHostUiServices.h"
#include "OrvanePluginInterface/ITimeController.h"
#include "TQL/Log.h"

#include <QtWidgets/QVBoxLayout>

namespace GraphPlotUI
{
namespace
{

/// A context that spans all others: its channels can be plotted, but it has no time of its own.
constexpr const char* s_pGlobalContext = "GlobalItems";

} // namespace

VOrvaneGraphPlotWindowContent::VOrvaneGraphPlotWindowContent(
    QWidget* i_pFrame, const GraphPlotServices& i_rServices,
    std::shared_ptr<OrvanePluginInterface::ITimeController> i_pWindowContext,
    std::shared_ptr<VExtendedGraphPlotSystem> i_pSystem, const QString& i_rName)
    : VWindowFrameContent(i_pFrame, nullptr)
    , m_pChannelService(i_rServices.pChannelService)
    , m_pWindowContext(std::move(i_pWindowContext))
    , m_pSystem(std::move(i_pSystem))
    , m_pWidget(new VGraphPlotWidget(m_pSystem, i_rServices.pEngineHost->GetEngine(), i_rServices.bChannelBrowser))
{
    setWindowTitle(i_rName);
    auto* pLayout = new QVBoxLayout(this);
    pLayout->setContentsMargins(0, 0, 0, 0);
    pLayout->setSpacing(0);
    pLayout->addWidget(m_pWidget);
    SubscribeViewHandler(i_rServices.pUiPostalService);
}

VOrvaneGraphPlotWindowContent::~VOrvaneGraphPlotWindowContent()
{
    delete m_pWidget; // the scene first, then what it shows
}

void VOrvaneGraphPlotWindowContent::SubscribeViewHandler(std::shared_ptr<TQL::IPostalService> i_pUiPostalService)
{
    const auto pCollapser = NotificationSystem::MakeCollapserDontDispatch(std::move(i_pUiPostalService));
    const auto handler =
        MakeWeakObjectCallback(this, [](VOrvaneGraphPlotWindowContent& i_rSelf) { i_rSelf.OnViewChanged(); });
    for (const auto& rpSignal : {m_pWindowContext->SourceListChanged(), m_pWindowContext->CurrentSourceChanged(),
                                 m_pWindowContext->GetSourceMap()->Changed(), m_pChannelService->ContextListChanged()})
        m_Subscriptions.Subscribe<void()>(rpSignal, handler, pCollapser);
    pCollapser->Post(handler);
}

VOrvaneGraphPlotWindowContent::View VOrvaneGraphPlotWindowContent::GetPresentView() const
{
    View view;
    m_pWindowContext->GetCurrentSourceName(view.ContextName);
    const auto pSource = m_pWindowContext->GetCurrentSource();
    view.bLive = !pSource || pSource->GetMode() != OrvanePluginInterface::ETimeMode::Review;
    view.pContext = m_pChannelService->GetContextByName(view.ContextName);
    return view;
}

void VOrvaneGraphPlotWindowContent::OnViewChanged()
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

void VOrvaneGraphPlotWindowContent::ApplyStateOf(const View& i_rView)
{
    TQL::IResult result;
    m_pSystem->ApplyState(result, i_rView.bLive ? m_LiveState : m_ReviewState);
    if (result.IsError())
        TQL::Log::Format(TQL::Log::GetCategory("GraphPlot"), TQL::ELogSeverity::Error,
                         "GraphPlotUIOrvane/VOrvaneGraphPlotWindowContent", __LINE__,
                         "Failed to load graph plot state: %1%", std::string(result.Description()));
}

} // namespace GraphPlotUI
