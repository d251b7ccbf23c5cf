#pragma once

#include "GraphPlotSystem/GraphPlotState.h"
#include "GraphPlotUIOrvane/VWindowFrameContent.h"
#include "NotificationSystem/VSubscriptions.h"

#include <string>

namespace ChannelSystem
{
class IChannelContext;
class IChannelService;
} // namespace ChannelSystem

namespace OrvanePluginInterface
{
class ITimeController;
}

namespace GraphPlotUI
{

struct GraphPlotServices;
class VExtendedGraphPlotSystem;
class VGraphPlotWidget;

/// The content of one "Graph Plots" window: owns the window's graph plot system and its widget, and follows the host
/// between live and review and from one data context to the next. Owned by the host's frame. UI thread. A burst of the
/// host's notices makes one run of the view handler, with the latest state.
class VOrvaneGraphPlotWindowContent : public VWindowFrameContent
{
    Q_OBJECT

public:
    VOrvaneGraphPlotWindowContent(QWidget* i_pFrame, const GraphPlotServices& i_rServices,
                                  std::shared_ptr<OrvanePluginInterface::ITimeController> i_pWindowContext,
                                  std::shared_ptr<VExtendedGraphPlotSystem> i_pSystem, const QString& i_rName);
    ~VOrvaneGraphPlotWindowContent() override;

private:
    /// What the last completed run of the view handler was for.
    struct View
    {
        bool bLive = true;
        std::string ContextName;
        std::shared_ptr<ChannelSystem::IChannelContext> pContext;

        friend bool operator==(const View&, const View&) = default;
    };

    void SubscribeViewHandler(std::shared_ptr<TQL::IPostalService> i_pUiPostalService);
    void OnViewChanged();
    void ApplyStateOf(const View& i_rView);
    View GetPresentView() const;

    const std::shared_ptr<ChannelSystem::IChannelService> m_pChannelService;
    const std::shared_ptr<OrvanePluginInterface::ITimeController> m_pWindowContext;
    std::shared_ptr<VExtendedGraphPlotSystem> m_pSystem;
    VGraphPlotWidget* m_pWidget = nullptr; // child of this widget
    View m_View;                           // in force; without a context until the first run
    GraphPlotState m_LiveState;
    GraphPlotState m_ReviewState;
    NotificationSystem::VSubscriptions m_Subscriptions;
};

} // namespace GraphPlotUI
