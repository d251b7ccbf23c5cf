#pragma once

#include <array>

/// How the states of a graph window lie in a store: `GraphPlot/Live/ActiveChannelState/ShowKey`. These names stand in
/// graph files.
namespace GraphPlotUI::StateTree
{

inline constexpr const char* DataRoot = "GraphPlot";

/// Each view has a state of its own below the data root.
inline constexpr std::array Views{"Live", "Review"};

/// The parts of one view's state, which are its children in this order.
enum EPart
{
    WidgetProperties,
    ActiveChannelState,
    SubplotState,
    TraceState,
    PinnedChannels
};

inline constexpr std::array Parts{"WidgetProperties", "ActiveChannelState", "SubplotState", "TraceState",
                                  "PinnedChannels"};

// Keys of the active channel state.
inline constexpr const char* SelectedChannelType = "SelectedChannelType";
inline constexpr const char* GlobalChannelType = "GlobalChannelType";
inline constexpr const char* SelectionLinked = "SelectionLinked";

// What the two channel types say when none is chosen.
inline constexpr const char* AutomaticChannelType = "Auto";
inline constexpr const char* NoGlobalChannelType = "None";

} // namespace GraphPlotUI::StateTree
