#pragma once

#include "GraphPlotSystem/Channels/ActiveChannelState.h"
#include "GraphPlotSystem/Subplots/SubplotState.h"
#include "GraphPlotSystem/Traces/TraceState.h"

#include <memory>
#include <vector>

namespace TQL
{
class IChannel;
}

namespace GraphPlotUI
{

/// The whole state of one view of a window, as it is saved and restored.
struct GraphPlotState
{
    ActiveChannelState ActiveChannels;
    SubplotState Subplots;
    TraceState Trace;
    std::vector<std::shared_ptr<TQL::IChannel>> PinnedChannels; ///< none is null

    friend bool operator==(const GraphPlotState&, const GraphPlotState&) = default;
};

} // namespace GraphPlotUI
