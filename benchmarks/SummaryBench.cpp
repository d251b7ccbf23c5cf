#include "Bench.h"

#include "Channels/Samples/Summary.h"

#include <array>
#include <cmath>
#include <cstddef>
#include <limits>
#include <string>
#include <vector>

namespace Bench
{

namespace
{

constexpr std::size_t BucketSize = 256;

/// A walk's worth of values with a gap here and there.
std::vector<float> MakeSamples(std::size_t i_Count)
{
    std::vector<float> samples(i_Count);
    for (std::size_t i = 0; i < i_Count; ++i)
        samples[i] = i % 1000 < 30 ? std::numeric_limits<float>::quiet_NaN()
                                   : 1000.0f + 100.0f * std::sin(static_cast<float>(i % 4096) * 0.01f);
    return samples;
}

float PlainSum(const std::vector<float>& i_rSamples)
{
    float sum = 0.0f;
    for (const float sample : i_rSamples)
        sum += sample;
    return sum;
}

/// As fast as one core adds: sixteen sums side by side, which the compiler turns into vectors.
float WideSum(const std::vector<float>& i_rSamples)
{
    std::array<float, 16> sums{};
    for (std::size_t i = 0; i + sums.size() <= i_rSamples.size(); i += sums.size())
        for (std::size_t lane = 0; lane < sums.size(); ++lane)
            sums[lane] += i_rSamples[i + lane];
    float sum = 0.0f;
    for (const float lane : sums)
        sum += lane;
    return sum;
}

template <typename TSum>
void AddFigure(Table& o_rTable, std::size_t i_Count, const std::string& i_rYardstick, EGoal i_Goal, const TSum& i_rSum)
{
    const std::vector<float> samples = MakeSamples(i_Count);
    std::vector<Channels::LodRecord> records((i_Count + BucketSize - 1) / BucketSize);
    const auto [ours, plain] = BestSecondsPaired(
        20,
        [&]
        {
            Channels::ReduceBuckets(samples, BucketSize, records);
            Keep(records.front());
        },
        [&] { Keep(i_rSum(samples)); });
    const double scale = 1e9 / static_cast<double>(i_Count);
    o_rTable.push_back({"min, max, mean, count over float samples with NaN, buckets of 256, " +
                            std::to_string(i_Count >> 20) + " Mi samples (ratio: speed of the yardstick reached)",
                        ours * scale, "ns a sample", i_rYardstick, plain * scale, plain / ours, i_Goal, 0.5});
}

} // namespace

void RunSummary(Table& o_rTable)
{
    constexpr std::size_t inCache = std::size_t{1} << 20;
    constexpr std::size_t inMemory = std::size_t{1} << 24;
    AddFigure(o_rTable, inMemory, "plain float sum over the same memory", EGoal::AtLeast, PlainSum);
    AddFigure(o_rTable, inCache, "plain float sum over the same memory", EGoal::AtLeast, PlainSum);
    AddFigure(o_rTable, inMemory, "float sum in sixteen lanes over the same memory", EGoal::Report, WideSum);
    AddFigure(o_rTable, inCache, "float sum in sixteen lanes over the same memory", EGoal::Report, WideSum);
}

} // namespace Bench
