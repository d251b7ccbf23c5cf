#pragma once

#include "GraphPlotSystem/Common/IGraphPlotPreferences.h"
#include "GraphPlotSystem/Traces/TraceRenderInfo.h"

#include <span>

namespace GraphPlotUI
{

/// One set of trace colours that an operator can choose.
struct TraceColourSet
{
    ETraceColourSet Set;
    const char* pName;                 ///< of the enumerator, as files hold it
    const char* pDisplayName;          ///< as a choice
    std::span<const Colour4f> Colours; ///< opaque, in the order in which they are given out
};

/// All sets, in the order of their values.
std::span<const TraceColourSet> GetTraceColourSets();

/// The colours of a set; of the standard one for a number that is no set's.
std::span<const Colour4f> GetTracePalette(std::int32_t i_Set);

} // namespace GraphPlotUI
