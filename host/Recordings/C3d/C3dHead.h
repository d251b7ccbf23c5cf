#pragma once

#include "Recordings/C3d/C3dWritePlan.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <vector>

namespace Recordings
{

// What stands before the frames of a C3D file, and a point of one. No state.

inline constexpr std::uint16_t FirstC3dParameterBlock = 2; ///< counted from 1, behind the header

/// The parameter section of a file whose frames begin at a block, counted from 1. Nothing when the names and events are
/// more than the format can say. It is as long whatever the block is.
std::optional<std::vector<std::byte>> MakeC3dParameters(const std::vector<RecordedEvent>& i_rEvents,
                                                        const C3dWritePlan& i_rPlan, std::uint16_t i_DataBlock);

/// The first block.
std::vector<std::byte> MakeC3dHeader(const C3dWritePlan& i_rPlan, std::uint16_t i_DataBlock);

/// Three coordinates and their residual. A missing point is zeros with a residual of -1; one that lacks only some of
/// its components keeps the others.
void AppendC3dPoint(std::span<const float> i_Position, std::vector<std::byte>& o_rBytes);

} // namespace Recordings
