#include "Streaming/OscRate.h"

#include "Recordings/Time/TimeGrid.h"

#include <algorithm>

namespace Streaming
{

namespace
{

constexpr double LowestRate = 0.1;
constexpr double HighestRate = 100'000.0;

/// Sums for the straight line through the times of a channel's samples. Single late arrivals bear little on it.
struct Line
{
    double Count = 0.0;
    double SumTime = 0.0;
    double SumIndexTime = 0.0;

    void Add(double i_Seconds)
    {
        SumTime += i_Seconds;
        SumIndexTime += Count * i_Seconds;
        Count += 1.0;
    }

    /// Seconds from sample to sample.
    double Step() const
    {
        const double middle = (Count - 1.0) / 2.0;
        const double spread = Count * (Count * Count - 1.0) / 12.0;
        return (SumIndexTime - middle * SumTime) / spread;
    }
};

} // namespace

double MeasureRate(const OscSamples& i_rSamples, std::size_t i_Channels)
{
    if (i_rSamples.Samples.empty())
        return 0.0;
    std::vector<Line> lines(i_Channels);
    const LocalTime origin = i_rSamples.Samples.front().Time;
    for (const OscSamples::Sample& rSample : i_rSamples.Samples)
        lines[rSample.Channel].Add(std::chrono::duration<double>(rSample.Time - origin).count());
    double rate = 0.0;
    for (const Line& rLine : lines)
        if (rLine.Count >= static_cast<double>(FewestForRate) && rLine.Step() > 0.0)
            rate = std::max(rate, 1.0 / rLine.Step());
    if (rate < LowestRate || rate > HighestRate)
        return 0.0;
    return Recordings::RoundRate(rate * 0.995, rate * 1.005, rate);
}

} // namespace Streaming
