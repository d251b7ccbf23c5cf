#pragma once

#include "GraphPlotSystem/TraceRenderInfo.h"

#include <span>

namespace GraphPlotUI
{

/// The 22 trace colours for standard colour vision, in the order in which they are given out.
std::span<const Colour4f> GetStandardTracePalette();

} // namespace GraphPlotUI
