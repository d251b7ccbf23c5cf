#pragma once

#include "GraphPlotUIOrvane/VWindowFrameContent.h"

#include <memory>

namespace OrvanePluginInterface
{
class ITimeController;
}

namespace GraphPlotUI
{

struct GraphPlotServices;
class VExtendedGraphPlotSystem;
class VGraphPlotWidget;
class VViewFollower;

/// The content of one "Graph Plots" window: owns the window's graph plot system, its widget and what takes the plot
/// along with the host. Owned by the host's frame. UI thread.
class VOrvaneGraphPlotWindowContent : public VWindowFrameContent
{
    Q_OBJECT

public:
    VOrvaneGraphPlotWindowContent(QWidget* i_pFrame, const GraphPlotServices& i_rServices,
                                  std::shared_ptr<OrvanePluginInterface::ITimeController> i_pWindowContext,
                                  std::shared_ptr<VExtendedGraphPlotSystem> i_pSystem, const QString& i_rName);
    ~VOrvaneGraphPlotWindowContent() override;

private:
    const std::shared_ptr<VExtendedGraphPlotSystem> m_pSystem;
    const std::shared_ptr<VViewFollower> m_pViewFollower;
    VGraphPlotWidget* const m_pWidget; // child of this widget
};

} // namespace GraphPlotUI
