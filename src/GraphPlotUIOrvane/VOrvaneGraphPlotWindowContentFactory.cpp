#include "GraphPlotUIOrvane/VOrvaneGraphPlotWindowContentFactory.h"

#include "GraphPlotSystem/SharedObject.h"
#include "GraphPlotSystem/VExtendedGraphPlotSystem.h"
#include "GraphPlotSystem/VOrvaneGraphPlotTime.h"
#include "GraphPlotSystem/VPlainChannelComponentControls.h"
#include "GraphPlotSystem/VPlainChannelTextProvider.h"
#include "GraphPlotSystem/VTraceDataProvider.h"
#include "GraphPlotUIOrvane/VGraphPlotStorePreferences.h"
#include "GraphPlotUIOrvane/VOrvaneGraphPlotWindowContent.h"

namespace GraphPlotUI
{

VOrvaneGraphPlotWindowContentFactory::VOrvaneGraphPlotWindowContentFactory(GraphPlotServices i_Services)
    : m_Services(std::move(i_Services))
    , m_pPreferences(std::make_shared<VGraphPlotStorePreferences>(m_Services.pPreferencesStore))
{
}

VOrvaneGraphPlotWindowContentFactory::~VOrvaneGraphPlotWindowContentFactory() = default;

const std::string& VOrvaneGraphPlotWindowContentFactory::Name()
{
    static const std::string s_Name = "Graph Plots";
    return s_Name;
}

void VOrvaneGraphPlotWindowContentFactory::CreateContent(
    QPointer<QWidget>& o_rpWidget, std::shared_ptr<OrvanePluginInterface::ITimeController> i_pWindowContext,
    QPointer<QWidget> i_pFrame)
{
    const auto pProvider = std::make_shared<VTraceDataProvider>(m_Services.pUiPostalService);
    auto pContext = MakeSharedObject<VGraphPlotContext>(m_Services.pResources, pProvider);
    auto pSystem = BuildGraphPlotSystem(std::move(pContext), i_pWindowContext);
    o_rpWidget = new VOrvaneGraphPlotWindowContent(i_pFrame, m_Services, std::move(i_pWindowContext),
                                                   std::move(pSystem), QString::fromStdString(Name()));
}

std::shared_ptr<VExtendedGraphPlotSystem> VOrvaneGraphPlotWindowContentFactory::BuildGraphPlotSystem(
    std::shared_ptr<VGraphPlotContext> i_pContext,
    std::shared_ptr<OrvanePluginInterface::ITimeController> i_pWindowContext) const
{
    const auto pStorage = std::dynamic_pointer_cast<TQL::ITraceDataStorage>(i_pContext->GetTraceDataProvider());
    const auto pTextProvider =
        std::make_shared<VPlainChannelTextProvider>(m_Services.pChannelService, m_Services.pUiPostalService);
    const auto pControls = std::make_shared<VPlainChannelComponentControls>(pTextProvider, m_Services.pUiPostalService);
    const auto pPlotTime =
        MakeSharedObject<VOrvaneGraphPlotTime>(m_Services.pUiPostalService, std::move(i_pWindowContext));
    auto* pChannels = new VSelectedChannels(m_Services.pUiPostalService, m_Services.pChannelService, i_pContext.get());
    const auto pTraceManager = MakeSharedObject<VTraceManager>(
        m_Services.pUiPostalService, m_Services.pWorkerPostalService, m_Services.pChannelService, m_pPreferences,
        pTextProvider, pControls, pPlotTime, pStorage, true, false);
    auto* pSubplots =
        new VPlainSubplotModel(m_Services.pUiPostalService, pStorage, pTextProvider, m_pPreferences, i_pContext.get());
    return TQL::MakeShared<VExtendedGraphPlotSystem>(std::move(i_pContext), pTraceManager, pPlotTime, pChannels,
                                                     pSubplots, m_Services.pUiPostalService);
}

} // namespace GraphPlotUI
