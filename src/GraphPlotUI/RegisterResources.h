#pragma once

namespace GraphPlotUI
{

/// Makes the QML of Zarvo.GraphPlot and the trace shaders (":/VertexShaders", ":/FragmentShaders") available, and takes
/// them away again. Needed because a static library's resources do not register themselves. UI thread; calls pair up.
void RegisterGraphPlotResources();
void UnregisterGraphPlotResources();

} // namespace GraphPlotUI
