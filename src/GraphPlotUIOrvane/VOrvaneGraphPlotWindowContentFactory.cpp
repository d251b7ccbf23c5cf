#include "GraphPlotUIOrvane/VOrvaneGraphPlotWindowContentFactory.h"

#include "GraphPlotSystem/Channels/VActiveChannelManager.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Common/SharedObject.h"
#include "GraphPlotSystem/Subplots/VKeyModel.h"
#include "GraphPlotSystem/Subplots/VSubplotManager.h"
#include "GraphPlotSystem/Texts/VBaseChannelTextProvider.h"
#include "GraphPlotSystem/Texts/VChannelComponentControls.h"
#include "GraphPlotSystem/Texts/VChannelComponentModel.h"
#include "GraphPlotSystem/Time/VOrvaneGraphPlotTime.h"
#include "GraphPlotSystem/Traces/VTraceDataProvider.h"
#include "GraphPlotSystem/VExtendedGraphPlotSystem.h"
#include "GraphPlotUIOrvane/Preferences/VGraphPlotStorePreferences.h"
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
    const GraphPlotServices& r = m_Services;
    const auto pStorage = std::dynamic_pointer_cast<TQL::ITraceDataStorage>(i_pContext->GetTraceDataProvider());
    const auto pTextProvider = std::make_shared<VBaseChannelTextProvider>(r.pChannelService, r.pUiPostalService);
    const auto pPlotTime = MakeSharedObject<VOrvaneGraphPlotTime>(r.pUiPostalService, std::move(i_pWindowContext));
    GraphPlotModels models = BuildModels(pStorage, pTextProvider, i_pContext.get());
    const auto pTraceManager =
        MakeSharedObject<VTraceManager>(r.pUiPostalService, r.pWorkerPostalService, r.pChannelService, m_pPreferences,
                                        pTextProvider, models.pComponentControls, pPlotTime, pStorage, true, false);
    models.pSubplotManager = MakeSharedObject<VSubplotManager>(r.pUiPostalService, models.pActiveChannelModel.data(),
                                                               pTextProvider, models.pComponentControls, pTraceManager,
                                                               pStorage, m_pPreferences, r.bChannelBrowser);
    return TQL::MakeShared<VExtendedGraphPlotSystem>(std::move(i_pContext), pTraceManager, pPlotTime, std::move(models),
                                                     r.pUiPostalService);
}

/// All but the subplot manager, which needs the trace manager.
GraphPlotModels
VOrvaneGraphPlotWindowContentFactory::BuildModels(const std::shared_ptr<TQL::ITraceDataStorage>& i_rpStorage,
                                                  const std::shared_ptr<TQL::IChannelTextProvider>& i_rpTextProvider,
                                                  VGraphPlotContext* i_pContext) const
{
    const GraphPlotServices& r = m_Services;
    GraphPlotModels models;
    models.pComponentControls = std::make_shared<VChannelComponentControls>(i_rpTextProvider, r.pUiPostalService);
    models.pActiveChannelModel =
        new VActiveChannelModel(r.pUiPostalService, i_rpTextProvider, r.pMigrationService, i_pContext);
    models.pKeyModel = new VKeyModel(r.pUiPostalService, i_rpTextProvider, models.pComponentControls, i_rpStorage,
                                     models.pActiveChannelModel, i_pContext);
    models.pComponentModel =
        new VChannelComponentModel(r.pUiPostalService, i_rpTextProvider, models.pComponentControls, i_pContext);
    models.pActiveChannelManager =
        MakeSharedObject<VActiveChannelManager>(r.pUiPostalService, r.pChannelService, r.pTypeRegistry,
                                                models.pActiveChannelModel.data(), r.bObjectWord, r.bChannelBrowser);
    return models;
}

} // namespace GraphPlotUI
