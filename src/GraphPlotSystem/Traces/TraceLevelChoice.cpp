#include "GraphPlotSystem/Traces/TraceLevelChoice.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace GraphPlotUI
{

std::uint8_t ChooseLevel(std::int64_t i_FramePeriod, std::int64_t i_SamplePeriod, const TQL::FrameRange& i_rTimeRange,
                         int i_SubplotWidth)
{
    constexpr double globalBias = 0.0;
    const double samplesPerFrame = static_cast<double>(i_FramePeriod) / static_cast<double>(i_SamplePeriod);
    const double perPixel = samplesPerFrame * (i_rTimeRange.second - i_rTimeRange.first + 1.0) / i_SubplotWidth;
    const double level = std::log2(perPixel) + globalBias;
    if (std::isnan(level))
        return 0;
    return static_cast<std::uint8_t>(std::clamp(level, 0.0, 255.0));
}

std::uint8_t RaiseLevelToFit(std::uint8_t i_Level, const TQL::TickRange& i_rRead, std::int64_t i_SamplePeriod,
                             std::int64_t i_GridOffset)
{
    // Beyond this shift a row would be longer than the clock, so nothing can be left to raise.
    constexpr std::int64_t longestStride = std::numeric_limits<std::int64_t>::max() / 4;
    while (i_Level < 62 && i_SamplePeriod <= (longestStride >> i_Level))
    {
        const std::int64_t stride = i_SamplePeriod << i_Level;
        const std::int64_t firstRow = TQL::FloorDivide(i_rRead.First - i_GridOffset, stride);
        const std::int64_t lastRow = TQL::FloorDivide(i_rRead.Last - i_GridOffset - 1, stride);
        if (lastRow - firstRow + 1 <= TraceRowCapacity)
            break;
        ++i_Level;
    }
    return i_Level;
}

} // namespace GraphPlotUI
