#pragma once

#include "Simulation/BodyTables.h"

#include <cstdint>

namespace Simulation
{

/// A run of frames in which a marker is not seen; empty when Count is 0.
struct OcclusionBurst
{
    std::int64_t First = 0;
    std::int64_t Count = 0;
};

inline constexpr std::int64_t ShortestOcclusion = 3; ///< frames
inline constexpr std::int64_t LongestOcclusion = 60;

/// What decides the occlusions of one marker.
struct OcclusionSource
{
    std::uint64_t Seed = 0; ///< of the marker of this subject
    EOcclusion Kind = EOcclusion::Rare;
    double PhaseAtZero = 0.0; ///< gait cycles of the limb that hides it, at frame 0
    double PhasePerFrame = 0.0;
};

/// Time is cut into windows of two seconds, each with at most one burst that keeps clear of both ends of its window. So
/// whether a frame is occluded follows from the source and the frame alone, and two bursts never join.
OcclusionBurst BurstOfWindow(const OcclusionSource& i_rSource, std::int64_t i_Window);

bool IsOccluded(const OcclusionSource& i_rSource, std::int64_t i_Frame);

} // namespace Simulation
