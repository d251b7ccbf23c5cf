#pragma once

#include <boost/circular_buffer.hpp>

#include <cstdint>
#include <span>

namespace GraphPlotUI
{

/// Mean and standard deviation over the newest samples of a series, kept up to date at a constant cost a sample, in
/// single precision. Owned by the inspector of one trace.
class RollingStatistics
{
public:
    /// Throws std::length_error where the window is longer than memory could ever be.
    explicit RollingStatistics(std::int64_t i_WindowSamples);

    /// NaN and infinite samples do not count.
    void Push(std::span<const float> i_Samples);

    float Mean() const { return m_Mean; }
    float StandardDeviation() const; ///< 0 with fewer than two samples in the window

private:
    void PushOne(float i_Sample);

    boost::circular_buffer<float> m_Samples; ///< one more than the window: the front has just left a full one
    float m_Mean = 0.0f;
    float m_PreviousMean = 0.0f;
    float m_SumOfSquares = 0.0f;
};

} // namespace GraphPlotUI
