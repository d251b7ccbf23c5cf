#pragma once

#include "OrvanePluginInterface/IPlugin.h"

#include <memory>

namespace GraphPlotUI
{

class VOrvaneGraphPlotTime;

/// The plug-in object: registers the QML modules and the window kind "Graph Plots", and makes the objects that live as
/// long as the plug-in. Made by CreatePlugin, freed by DestroyPlugin. UI thread. A getter of the host that fails throws
/// through LoadQmlModules and Initialise.
class VOrvanePluginGraphPlot : public OrvanePluginInterface::IPlugin
{
public:
    VOrvanePluginGraphPlot();
    ~VOrvanePluginGraphPlot() override;

    const std::string& QueryText1() const override;
    const std::string& QueryText2() const override;
    bool LoadQmlModules(OrvanePluginInterface::IHostCoreServices& i_rCore,
                        OrvanePluginInterface::IHostUiServices& i_rUi) override;
    bool Initialise(OrvanePluginInterface::IHostCoreServices& i_rCore,
                    OrvanePluginInterface::IHostUiServices& i_rUi) override;
    void UnloadResources() override;
    void Shutdown() override;

private:
    std::shared_ptr<VOrvaneGraphPlotTime> m_pPlotTime; ///< of the host's "default" controller; null before Initialise
};

} // namespace GraphPlotUI
