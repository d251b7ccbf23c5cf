#pragma once

#include "TQL/ITraceId.h"

#include <array>
#include <cstdint>
#include <optional>

namespace TQL
{

/// A rectangle that a subplot shows behind or in front of its traces, in axis units. A plain value. An infinite or NaN
/// coordinate stands for the edge of what the axis shows.
struct IGraphPlotOverlay
{
    static constexpr std::uint32_t EdgeYMax = 1;
    static constexpr std::uint32_t EdgeXMin = 2;
    static constexpr std::uint32_t EdgeXMax = 4;
    static constexpr std::uint32_t EdgeYMin = 8;

    std::optional<ITraceId> Trace;
    float XMin = 0.0f;
    float XMax = 0.0f;
    float YMin = 0.0f;
    float YMax = 0.0f;
    std::array<float, 4> FillColour{};
    std::array<float, 4> OutlineColour{};
    std::uint32_t EdgeFlags = 0; ///< which edges get an outline
    bool bInFrontOfTraces = false;

    friend bool operator==(const IGraphPlotOverlay&, const IGraphPlotOverlay&) = default;
};

} // namespace TQL
