#pragma once

#include <QtCore/QObject>

#include <cstdint>

/// How many of the plotted channels are pinned.
namespace TQL::SubplotPinStates
{

Q_NAMESPACE

enum ESubplotPinState : std::int32_t
{
    AllPinned = 0,
    AllUnpinned = 1, ///< also when nothing is plotted
    Mixed = 2
};
Q_ENUM_NS(ESubplotPinState)

} // namespace TQL::SubplotPinStates

namespace GraphPlotUI
{

using ESubplotPinState = TQL::SubplotPinStates::ESubplotPinState;

} // namespace GraphPlotUI
