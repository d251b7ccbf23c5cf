#pragma once

#include "Channels/Samples/Lanes.h"

#include <cstddef>
#include <cstdint>
#include <type_traits>

/// The reduction of a few rows of interleaved components, for the files of the summary kernels. A sink takes records:
/// From(index) gives the sink of those from there on, Put(index, {mean, maximum, minimum, count as an integer}) takes
/// one, PutFull(reduced, used) those of up to four components of which no sample is missing.
namespace Channels::Detail
{

/// A few samples of one component, i_Width values apart.
template <std::size_t TSamples>
Floats SummariseColumn(const float* i_pValues, std::size_t i_Width)
{
    double sum = 0.0;
    float maximum = -Infinity;
    float minimum = Infinity;
    std::int32_t count = 0;
    for (std::size_t i = 0; i < TSamples; ++i)
    {
        const float value = i_pValues[i * i_Width];
        const bool bValid = value == value;
        sum += bValid ? static_cast<double>(value) : 0.0;
        maximum = value > maximum ? value : maximum;
        minimum = value < minimum ? value : minimum;
        count += bValid ? 1 : 0;
    }
    const double mean = count == TSamples ? sum * (1.0 / TSamples) : count == 0 ? 0.0 : sum / count;
    Words words = reinterpret_cast<Words>(Floats{static_cast<float>(mean), maximum, minimum, 0.0f});
    words[3] = count;
    return reinterpret_cast<Floats>(words);
}

inline bool AreAllFinite(Floats i_Values)
{
    const auto halves = reinterpret_cast<LongWords>(i_Values - i_Values == Floats{});
    return (halves[0] & halves[1]) == -1;
}

/// What a few rows of four components gave.
struct Reduced
{
    Floats Mean;
    Floats Maximum;
    Floats Minimum;
    Words Count;
};

/// Puts the records of up to four components.
template <typename TSink>
void PutFour(const Reduced& i_rReduced, std::size_t i_Used, const TSink& i_rSink)
{
    const Floats counts = reinterpret_cast<Floats>(i_rReduced.Count);
    const Floats frontLow = __builtin_shufflevector(i_rReduced.Mean, i_rReduced.Maximum, 0, 4, 1, 5);
    const Floats frontHigh = __builtin_shufflevector(i_rReduced.Mean, i_rReduced.Maximum, 2, 6, 3, 7);
    const Floats backLow = __builtin_shufflevector(i_rReduced.Minimum, counts, 0, 4, 1, 5);
    const Floats backHigh = __builtin_shufflevector(i_rReduced.Minimum, counts, 2, 6, 3, 7);
    i_rSink.Put(0, __builtin_shufflevector(frontLow, backLow, 0, 1, 4, 5));
    if (i_Used > 1)
        i_rSink.Put(1, __builtin_shufflevector(frontLow, backLow, 2, 3, 6, 7));
    if (i_Used > 2)
        i_rSink.Put(2, __builtin_shufflevector(frontHigh, backHigh, 0, 1, 4, 5));
    if (i_Used > 3)
        i_rSink.Put(3, __builtin_shufflevector(frontHigh, backHigh, 2, 3, 6, 7));
}

/// A few vectors of four values, i_Width values apart, lane by lane.
template <std::size_t TRows>
Reduced ReduceWithGaps(const float* i_pRows, std::size_t i_Width)
{
    constexpr float share = 1.0f / TRows; // taken before adding, so that no sum leaves the range of float
    Lanes lanes;
    Floats mean{};
    for (std::size_t row = 0; row < TRows; ++row)
    {
        const Floats values = Load(i_pRows + row * i_Width);
        lanes.Extend(values);
        mean += reinterpret_cast<Floats>(reinterpret_cast<Words>(values * share) & (values == values));
    }
    const Words counts = lanes.Count == 0 ? lanes.Count + 1 : lanes.Count;
    return {mean / (share * __builtin_convertvector(counts, Floats)), lanes.Maximum, lanes.Minimum, lanes.Count};
}

/// The same where nearly always nothing is missing and no sum is too large: then there is less to do. False where it is
/// not so.
template <std::size_t TRows>
bool ReduceFull(const float* i_pRows, std::size_t i_Width, Reduced& o_rReduced)
{
    constexpr std::size_t groupRows = TRows < 4 ? TRows : 4; // sums of sums stay nearer to the truth than a long sum
    Floats maximum = Load(i_pRows);
    Floats minimum = maximum;
    Floats sum{};
    for (std::size_t group = 0; group < TRows; group += groupRows)
    {
        Floats part{};
        for (std::size_t row = group; row < group + groupRows; ++row)
        {
            const Floats values = Load(i_pRows + row * i_Width);
            part += values;
            maximum = values > maximum ? values : maximum;
            minimum = values < minimum ? values : minimum;
        }
        sum += part;
    }
    o_rReduced = {sum * (1.0f / TRows), maximum, minimum, Words{} + static_cast<std::int32_t>(TRows)};
    return AreAllFinite(sum);
}

/// i_Records bins of TRows rows each, one record a component and bin.
template <std::size_t TRows, typename TSink>
void SummariseRows(const float* i_pRows, std::size_t i_Components, std::size_t i_Records, const TSink& i_rSink)
{
    std::size_t index = 0;
    for (std::size_t i = 0; i < i_Records; ++i, i_pRows += TRows * i_Components, index += i_Components)
    {
        const bool bMoreFollows = i + 1 < i_Records; // then it does no harm to read beyond the last component
        std::size_t c = 0;
        for (; i_Components > 1 && c < i_Components && (bMoreFollows || c + LaneCount <= i_Components); c += LaneCount)
        {
            Reduced reduced;
            if (ReduceFull<TRows>(i_pRows + c, i_Components, reduced)) [[likely]]
                i_rSink.From(index + c).PutFull(reduced, i_Components - c);
            else
                PutFour(ReduceWithGaps<TRows>(i_pRows + c, i_Components), i_Components - c, i_rSink.From(index + c));
        }
        for (; c < i_Components; ++c)
            i_rSink.Put(index + c, SummariseColumn<TRows>(i_pRows + c, i_Components));
    }
}

} // namespace Channels::Detail
