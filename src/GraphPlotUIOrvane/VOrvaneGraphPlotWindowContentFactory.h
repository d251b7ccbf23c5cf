#pragma once

#include "OrvanePluginInterface/IWorkspaceContent.h"
#include "TQL/VShared.h"

#include <memory>
#include <string>

namespace ChannelSystem
{
class IChannelService;
}

namespace CoreGraphics
{
class Resources;
}

namespace OrvanePluginInterface
{
class IChannelMigrationService;
class IQmlEngineHost;
} // namespace OrvanePluginInterface

namespace TQL
{
class IAsioPostalService;
class IChannelTypeRegistry;
class IChannelTextProvider;
class IPostalService;
class IStore;
class ITraceDataStorage;
} // namespace TQL

namespace GraphPlotUI
{

class IGraphPlotPreferences;
class VExtendedGraphPlotSystem;
class VGraphPlotContext;
struct GraphPlotModels;

/// The host's services that a graph window is built from.
struct GraphPlotServices
{
    std::shared_ptr<TQL::IPostalService> pUiPostalService;
    std::shared_ptr<TQL::IAsioPostalService> pWorkerPostalService;
    std::shared_ptr<ChannelSystem::IChannelService> pChannelService;
    std::shared_ptr<TQL::IChannelTypeRegistry> pTypeRegistry;                           ///< may be null
    std::shared_ptr<OrvanePluginInterface::IChannelMigrationService> pMigrationService; ///< may be null
    std::shared_ptr<TQL::IStore> pPreferencesStore;
    std::shared_ptr<CoreGraphics::Resources> pResources;
    std::shared_ptr<OrvanePluginInterface::IQmlEngineHost> pEngineHost;
    bool bChannelBrowser = false; ///< also the developer mode of the window
    bool bObjectWord = false;     ///< help texts say "object", not "subject" and "segment"
};

/// Makes the content of each "Graph Plots" window and assembles its graph plot system. Kept alive by the host's content
/// registry alone; outlives all windows. UI thread.
class VOrvaneGraphPlotWindowContentFactory : public OrvanePluginInterface::IWorkspaceContentFactory, public TQL::VShared
{
public:
    explicit VOrvaneGraphPlotWindowContentFactory(GraphPlotServices i_Services);
    ~VOrvaneGraphPlotWindowContentFactory() override;

    /// The name under which windows are registered and shown: "Graph Plots".
    static const std::string& Name();

    void CreateContent(QPointer<QWidget>& o_rpWidget,
                       std::shared_ptr<OrvanePluginInterface::ITimeController> i_pWindowContext,
                       QPointer<QWidget> i_pFrame) override;

private:
    std::shared_ptr<VExtendedGraphPlotSystem>
    BuildGraphPlotSystem(std::shared_ptr<VGraphPlotContext> i_pContext,
                         std::shared_ptr<OrvanePluginInterface::ITimeController> i_pWindowContext) const;
    GraphPlotModels BuildModels(const std::shared_ptr<TQL::ITraceDataStorage>& i_rpStorage,
                                const std::shared_ptr<TQL::IChannelTextProvider>& i_rpTextProvider,
                                VGraphPlotContext* i_pContext) const;

    const GraphPlotServices m_Services;
    const std::shared_ptr<IGraphPlotPreferences> m_pPreferences;
};

} // namespace GraphPlotUI
