#include "Channels/Samples/Summary.h"
#include "Channels/Samples/Lanes.h"

#include <array>
#include <cmath>

namespace Channels
{

namespace
{

using namespace Detail;

/// What one block gave for one component.
struct BlockResult
{
    double Sum = 0.0;
    float Maximum = -Infinity;
    float Minimum = Infinity;
    std::uint64_t Count = 0;

    void AddLane(const Lanes& i_rLanes, std::size_t i_Lane)
    {
        Sum += static_cast<double>(i_rLanes.Sum[i_Lane]);
        Maximum = std::max(Maximum, i_rLanes.Maximum[i_Lane]);
        Minimum = std::min(Minimum, i_rLanes.Minimum[i_Lane]);
        Count += static_cast<std::uint64_t>(i_rLanes.Count[i_Lane]);
    }

    /// Finite samples whose sum left the range of float.
    bool HasOverflown() const { return !std::isfinite(Sum) && std::isfinite(Maximum) && std::isfinite(Minimum); }

    void AddTo(Accumulator& o_rAccumulator) const
    {
        if (Count != 0)
            o_rAccumulator.AddRun(Sum, Maximum, Minimum, Count);
    }
};

void ReduceScalar(const float* i_pRows, std::size_t i_RowCount, std::size_t i_Width, Accumulator& o_rAccumulator)
{
    for (std::size_t row = 0; row < i_RowCount; ++row)
        o_rAccumulator.Add(i_pRows[row * i_Width]);
}

/// Rows of TComponents values, a block of vectors at a time: lane n of a block is component n modulo TComponents.
template <std::size_t TComponents>
void ReduceVectors(const float* i_pRows, std::size_t i_RowCount, std::span<Accumulator> o_Accumulators)
{
    constexpr std::size_t vectors = TComponents <= 2 ? 4 : TComponents;
    constexpr std::size_t rowsPerStep = vectors * LaneCount / TComponents;
    constexpr std::size_t rowsPerBlock = 256;
    while (i_RowCount >= rowsPerStep)
    {
        const std::size_t steps = std::min(rowsPerBlock, i_RowCount) / rowsPerStep;
        std::array<Lanes, vectors> lanes;
        for (std::size_t step = 0; step < steps; ++step)
            for (std::size_t v = 0; v < vectors; ++v)
                lanes[v].Add(Load(i_pRows + (step * vectors + v) * LaneCount));
        if constexpr (TComponents == 1)
        {
            lanes[0].Add(lanes[1]);
            lanes[2].Add(lanes[3]);
            lanes[0].Add(lanes[2]);
        }
        std::array<BlockResult, TComponents> results;
        for (std::size_t n = 0; n < (TComponents == 1 ? 1 : vectors) * LaneCount; ++n)
            results[n % TComponents].AddLane(lanes[n / LaneCount], n % LaneCount);
        const std::size_t rows = steps * rowsPerStep;
        for (std::size_t c = 0; c < TComponents; ++c)
        {
            if (results[c].HasOverflown())
                ReduceScalar(i_pRows + c, rows, TComponents, o_Accumulators[c]);
            else
                results[c].AddTo(o_Accumulators[c]);
        }
        i_pRows += rows * TComponents;
        i_RowCount -= rows;
    }
    for (std::size_t c = 0; c < TComponents; ++c)
        ReduceScalar(i_pRows + c, i_RowCount, TComponents, o_Accumulators[c]);
}

} // namespace

void Reduce(const float* i_pRows, std::size_t i_RowCount, std::size_t i_Width, std::span<Accumulator> o_Accumulators)
{
    if (o_Accumulators.size() == i_Width)
    {
        switch (i_Width)
        {
        case 1:
            return ReduceVectors<1>(i_pRows, i_RowCount, o_Accumulators);
        case 2:
            return ReduceVectors<2>(i_pRows, i_RowCount, o_Accumulators);
        case 3:
            return ReduceVectors<3>(i_pRows, i_RowCount, o_Accumulators);
        case 4:
            return ReduceVectors<4>(i_pRows, i_RowCount, o_Accumulators);
        case 6:
            return ReduceVectors<6>(i_pRows, i_RowCount, o_Accumulators);
        default:
            break;
        }
    }
    for (std::size_t c = 0; c < o_Accumulators.size(); ++c)
        ReduceScalar(i_pRows + c, i_RowCount, i_Width, o_Accumulators[c]);
}

void Reduce(std::span<const float> i_Samples, Accumulator& o_rAccumulator)
{
    ReduceVectors<1>(i_Samples.data(), i_Samples.size(), std::span(&o_rAccumulator, 1));
}

void ReduceBuckets(std::span<const float> i_Samples, std::size_t i_Bucket, std::span<LodRecord> o_Records)
{
    for (LodRecord& rRecord : o_Records)
    {
        Accumulator accumulator;
        Reduce(i_Samples.first(std::min(i_Bucket, i_Samples.size())), accumulator);
        rRecord = accumulator.Result();
        i_Samples = i_Samples.subspan(std::min(i_Bucket, i_Samples.size()));
    }
}

LodRecord Combine(std::span<const LodRecord> i_Records)
{
    Accumulator accumulator;
    for (const LodRecord& rRecord : i_Records)
        accumulator.Add(rRecord);
    return accumulator.Result();
}

} // namespace Channels
