#include "GraphPlotUI/RegisterResources.h"

#include <QtCore/QtGlobal>

// The macros declare functions of the global namespace, so they cannot stand inside a namespace.
static void Initialise()
{
    Q_INIT_RESOURCE(GraphPlotShaders);
    Q_INIT_RESOURCE(GraphPlotQml);
}

static void CleanUp()
{
    Q_CLEANUP_RESOURCE(GraphPlotQml);
    Q_CLEANUP_RESOURCE(GraphPlotShaders);
}

namespace GraphPlotUI
{

void RegisterGraphPlotResources()
{
    Initialise();
}
void UnregisterGraphPlotResources()
{
    CleanUp();
}

} // namespace GraphPlotUI
