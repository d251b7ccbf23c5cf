#pragma once

#include "OrvanePluginInterface/IPlugin.h"

namespace GraphPlotUI
{

/// The plug-in object: registers the QML modules and the window kind "Graph Plots", and makes the objects that live as
/// long as the plug-in. Made by CreatePlugin, freed by DestroyPlugin. UI thread. A getter of the host that fails throws
/// through LoadQmlModules and Initialise.
class VOrvanePluginGraphPlot : public OrvanePluginInterface::IPlugin
{
public:
    const std::string& QueryText1() const override;
    const std::string& QueryText2() const override;
    bool LoadQmlModules(OrvanePluginInterface::IHostCoreServices& i_rCore,
                        OrvanePluginInterface::IHostUiServices& i_rUi) override;
    bool Initialise(OrvanePluginInterface::IHostCoreServices& i_rCore,
                    OrvanePluginInterface::IHostUiServices& i_rUi) override;
    void UnloadResources() override;
};

} // namespace GraphPlotUI
