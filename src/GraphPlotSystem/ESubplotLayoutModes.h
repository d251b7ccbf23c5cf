#pragma once

#include <cstdint>

namespace GraphPlotUI
{

/// How traces are spread over subplots. The numbers are written to files.
enum class ESubplotLayoutModes : std::int32_t
{
    SubplotPerTraceType = 0,
    SingleSubplot = 1
};

} // namespace GraphPlotUI
