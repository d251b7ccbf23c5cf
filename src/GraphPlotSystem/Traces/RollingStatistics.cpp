#include "GraphPlotSystem/Traces/RollingStatistics.h"

#include <algorithm>
#include <cmath>

namespace GraphPlotUI
{

RollingStatistics::RollingStatistics(std::int64_t i_WindowSamples)
    : m_Samples(static_cast<boost::circular_buffer<float>::capacity_type>(std::max<std::int64_t>(i_WindowSamples, 1)) +
                1)
{
}

void RollingStatistics::Push(std::span<const float> i_Samples)
{
    for (const float sample : i_Samples)
        if (std::isfinite(sample))
            PushOne(sample);
}

void RollingStatistics::PushOne(float i_Sample)
{
    m_Samples.push_back(i_Sample);
    const bool bFull = m_Samples.full();
    const float gone = m_Samples.front();
    const float reference = bFull ? gone : m_Mean;
    const auto count = static_cast<float>(bFull ? m_Samples.size() - 1 : m_Samples.size());
    if (i_Sample < reference)
        m_Mean -= (reference - i_Sample) / count;
    else if (i_Sample > reference)
        m_Mean += (i_Sample - reference) / count;
    m_SumOfSquares += (i_Sample - m_PreviousMean) * (i_Sample - m_Mean);
    if (bFull)
    {
        m_SumOfSquares -= (gone - m_Mean) * (gone - m_PreviousMean);
        if (!(m_SumOfSquares >= 0.0f))
            m_SumOfSquares = 0.0f;
    }
    m_PreviousMean = m_Mean;
}

float RollingStatistics::StandardDeviation() const
{
    const std::size_t count = m_Samples.full() ? m_Samples.size() - 1 : m_Samples.size();
    return count >= 2 ? std::sqrt(m_SumOfSquares / static_cast<float>(count - 1)) : 0.0f;
}

} // namespace GraphPlotUI
