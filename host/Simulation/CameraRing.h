#pragma once

#include <array>
#include <cstdint>
#include <string>

namespace Simulation
{

/// The calibrated cameras of the simulated volume: they hang around it, high and low in turn, and never move.
inline constexpr std::uint32_t CameraCount = 8;

std::string CameraName(std::uint32_t i_Camera);

/// Angle-axis rotation in radians (rx ry rz), its length at most pi, then position in millimetres (x y z), in the
/// world: z up, the floor at 0. A camera looks along its own -z at the middle of the volume, its y points up in the
/// picture.
std::array<float, 6> CameraPoseOf(std::uint32_t i_Camera);

} // namespace Simulation
