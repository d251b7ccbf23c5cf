#include "GraphPlotUIOrvane/VOrvanePluginGraphPlot.h"

#include <new>

// The three functions that a host resolves by name.
extern "C"
{
    __attribute__((visibility("default"))) OrvanePluginInterface::IPlugin* CreatePlugin()
    {
        return new (std::nothrow) GraphPlotUI::VOrvanePluginGraphPlot;
    }

    __attribute__((visibility("default"))) void DestroyPlugin(OrvanePluginInterface::IPlugin* i_pPlugin)
    {
        delete i_pPlugin;
    }

    __attribute__((visibility("default"))) std::uint64_t PluginBuildRevision()
    {
        return 158731;
    }
}
