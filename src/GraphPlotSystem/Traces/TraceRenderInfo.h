#pragma once

#include <array>
#include <cstdint>
#include <vector>

namespace GraphPlotUI
{

/// Red, green, blue, alpha in 0..1.
using Colour4f = std::array<float, 4>;

/// What a renderer needs of one channel, as it was at the last upload: row i of the ring stands at
/// OriginTick + i x (TicksPerSample << Level) and lies in texture row (CircularStart + i) modulo CircularCapacity.
struct TraceRenderInfo
{
    std::int64_t OriginTick = 0;
    std::int64_t TicksPerSample = 0; ///< at level 0
    std::uint32_t SampleCount = 0;   ///< rows
    std::uint32_t CircularStart = 0;
    std::uint32_t CircularCapacity = 4096;
    std::vector<Colour4f> Colours; ///< one per component
    /// One per component: no row with data has a distance to its previous data above this, so 1 says that there are no
    /// gaps. It may be too large but never too small; an entry that is missing or 0 says that nothing is known. Rows
    /// without data do not count.
    std::vector<std::uint32_t> LongestSteps;
    std::uint8_t Level = 0;
};

/// The lowest and highest value that an axis shows.
struct ValueRange
{
    double Minimum = 0.0;
    double Maximum = 1.0;
};

struct TraceInspectionValues
{
    float Value = 0.0f;
    float Mean = 0.0f;
    float StandardDeviation = 0.0f;
    bool bValid = false;
};

} // namespace GraphPlotUI
