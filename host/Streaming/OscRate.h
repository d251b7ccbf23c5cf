#pragma once

#include "Streaming/VOscReceiver.h"

namespace Streaming
{

/// Fewer samples than these do not tell a rate.
inline constexpr std::size_t FewestForRate = 3;

/// The rate of the fastest channel with enough samples, rounded to one that people use where one lies within half a
/// percent; 0 when no channel has enough, or all its samples have the same time.
double MeasureRate(const OscSamples& i_rSamples, std::size_t i_Channels);

} // namespace Streaming
