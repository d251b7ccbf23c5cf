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
class IQmlEngineHost;
}

namespace TQL
{
class IAsioPostalService;
class IPostalService;
class IStore;
} // namespace TQL

namespace GraphPlotUI
{

class IGraphPlotPreferences;
class VExtendedGraphPlotSystem;
class VGraphPlotContext;

/// The host's services that a graph window is built from.
struct GraphPlotServices
{
    std::shared_ptr<TQL::IPostalService> pUiPostalService;
    std::shared_ptr<TQL::IAsioPostalService> pWorkerPostalService;
    std::shared_ptr<ChannelSystem::IChannelService> pChannelService;
    std::shared_ptr<TQL::IStore> pPreferencesStore;
    std::shared_ptr<CoreGraphics::Resources> pResources;
    std::shared_ptr<OrvanePluginInterface::IQmlEngineHost> pEngineHost;
    bool bChannelBrowser = false; ///< also the developer mode of the window
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

    const GraphPlotServices m_Services;
    const std::shared_ptr<IGraphPlotPreferences> m_pPreferences;
};

} // namespace GraphPlotUI
