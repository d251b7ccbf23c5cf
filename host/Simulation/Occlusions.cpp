#include "Simulation/Occlusions.h"

#include "Simulation/GaitCurves.h"
#include "Simulation/Noise.h"
#include "TQL/ITick.h"

#include <algorithm>
#include <cmath>

namespace Simulation
{

namespace
{

constexpr std::int64_t windowFrames = 240;
constexpr std::int64_t margin = 2; // frames at both ends of a window in which every marker is seen

double BurstChance(EOcclusion i_Kind)
{
    switch (i_Kind)
    {
    case EOcclusion::Crossing:
        return 0.5;
    case EOcclusion::Often:
        return 0.4;
    case EOcclusion::Rare:
        break;
    }
    return 0.08;
}

/// The first frame at or after i_Frame at which the limbs pass each other, twice in a gait cycle.
std::int64_t NextCrossing(const OcclusionSource& i_rSource, std::int64_t i_Frame)
{
    constexpr double crossing = 0.25; // gait cycles after the heel strike
    if (i_rSource.PhasePerFrame <= 0.0)
        return i_Frame;
    const double phase = i_rSource.PhaseAtZero + i_rSource.PhasePerFrame * static_cast<double>(i_Frame);
    const double halfCyclesToGo = 1.0 - CyclePosition(2.0 * (phase - crossing));
    return i_Frame + static_cast<std::int64_t>(std::floor(0.5 * halfCyclesToGo / i_rSource.PhasePerFrame));
}

} // namespace

OcclusionBurst BurstOfWindow(const OcclusionSource& i_rSource, std::int64_t i_Window)
{
    if (Uniform(Word(i_rSource.Seed, 0, i_Window)) >= BurstChance(i_rSource.Kind))
        return {};
    // Short gaps are common, long ones rare.
    const double spread = Uniform(Word(i_rSource.Seed, 1, i_Window));
    const std::int64_t count =
        ShortestOcclusion + static_cast<std::int64_t>(spread * spread * (LongestOcclusion - ShortestOcclusion + 1));
    const std::int64_t first = i_Window * windowFrames + margin;
    const std::int64_t last = (i_Window + 1) * windowFrames - margin - count;
    std::int64_t start = first + static_cast<std::int64_t>(Uniform(Word(i_rSource.Seed, 2, i_Window)) *
                                                           static_cast<double>(last - first + 1));
    if (i_rSource.Kind == EOcclusion::Crossing)
        start = NextCrossing(i_rSource, start) - count / 2;
    return {std::clamp(start, first, last), count};
}

bool IsOccluded(const OcclusionSource& i_rSource, std::int64_t i_Frame)
{
    const OcclusionBurst burst = BurstOfWindow(i_rSource, TQL::FloorDivide(i_Frame, windowFrames));
    return i_Frame >= burst.First && i_Frame < burst.First + burst.Count;
}

} // namespace Simulation
