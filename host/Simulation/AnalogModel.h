#pragma once

#include "Simulation/WalkerPose.h"

#include <cstdint>
#include <span>

namespace Simulation
{

/// One output of the analog device.
struct AnalogRow
{
    const char* pName;
    const char* pUnits;
};

/// Two force plates (Fx Fy Fz in N, Mx My Mz in Nmm: plate 1 carries the left foot, plate 2 the right one) and four
/// muscles in V.
std::span<const AnalogRow> GetAnalogTable();

/// The value of every output at one sample. Depends on its arguments alone.
void AnalogAt(const WalkerStyle& i_rStyle, std::uint64_t i_Seed, std::int64_t i_Sample, double i_SamplesPerSecond,
              std::span<float> o_Values);

} // namespace Simulation
