#include "Channels/Lanes.h"
#include "Channels/Summary.h"

#include <algorithm>
#include <cstring>

// The records of the summary levels: those of a few rows, those of two records, and their two forms.
namespace Channels
{

namespace
{

using namespace Detail;

Words LoadWords(const PackedRecord* i_pRecord)
{
    Words words;
    std::memcpy(&words, i_pRecord, sizeof(words));
    return words;
}

/// A few samples of one component, i_Width values apart.
template <typename TRecord, std::size_t TSamples>
void SummariseColumn(const float* i_pValues, std::size_t i_Width, TRecord& o_rRecord)
{
    double sum = 0.0;
    float maximum = -Infinity;
    float minimum = Infinity;
    std::uint32_t count = 0;
    for (std::size_t i = 0; i < TSamples; ++i)
    {
        const float value = i_pValues[i * i_Width];
        const bool bValid = value == value;
        sum += bValid ? static_cast<double>(value) : 0.0;
        maximum = value > maximum ? value : maximum;
        minimum = value < minimum ? value : minimum;
        count += bValid ? 1 : 0;
    }
    o_rRecord.Mean = static_cast<float>(count == TSamples ? sum * (1.0 / TSamples) : count == 0 ? 0.0 : sum / count);
    o_rRecord.Maximum = maximum;
    o_rRecord.Minimum = minimum;
    o_rRecord.Count = count;
}

void Store(Floats i_Record, PackedRecord* o_pRecord)
{
    std::memcpy(static_cast<void*>(o_pRecord), &i_Record, sizeof(PackedRecord));
}

void Store(Floats i_Record, LodRecord* o_pRecord)
{
    const Words words = reinterpret_cast<Words>(i_Record);
    const Words front = words & Words{-1, -1, -1, 0};
    std::memcpy(static_cast<void*>(o_pRecord), &front, sizeof(front));
    o_pRecord->Count = static_cast<std::uint32_t>(words[3]);
}

bool AreAllFinite(Floats i_Values)
{
    const auto halves = reinterpret_cast<LongWords>(i_Values - i_Values == Floats{});
    return (halves[0] & halves[1]) == -1;
}

/// Stores the records of up to four components.
template <typename TRecord>
void StoreFour(Floats i_Mean, const Lanes& i_rLanes, std::size_t i_Used, TRecord* o_pRecords)
{
    const Floats counts = reinterpret_cast<Floats>(i_rLanes.Count);
    const Floats frontLow = __builtin_shufflevector(i_Mean, i_rLanes.Maximum, 0, 4, 1, 5);
    const Floats frontHigh = __builtin_shufflevector(i_Mean, i_rLanes.Maximum, 2, 6, 3, 7);
    const Floats backLow = __builtin_shufflevector(i_rLanes.Minimum, counts, 0, 4, 1, 5);
    const Floats backHigh = __builtin_shufflevector(i_rLanes.Minimum, counts, 2, 6, 3, 7);
    Store(__builtin_shufflevector(frontLow, backLow, 0, 1, 4, 5), o_pRecords);
    if (i_Used > 1)
        Store(__builtin_shufflevector(frontLow, backLow, 2, 3, 6, 7), o_pRecords + 1);
    if (i_Used > 2)
        Store(__builtin_shufflevector(frontHigh, backHigh, 0, 1, 4, 5), o_pRecords + 2);
    if (i_Used > 3)
        Store(__builtin_shufflevector(frontHigh, backHigh, 2, 3, 6, 7), o_pRecords + 3);
}

/// A few vectors of four values, i_Width values apart, lane by lane. Gives their means.
template <std::size_t TRows>
Floats ReduceWithGaps(const float* i_pRows, std::size_t i_Width, Lanes& o_rLanes)
{
    constexpr float share = 1.0f / TRows; // taken before adding, so that no sum leaves the range of float
    Floats mean{};
    for (std::size_t row = 0; row < TRows; ++row)
    {
        const Floats values = Load(i_pRows + row * i_Width);
        o_rLanes.Extend(values);
        mean += reinterpret_cast<Floats>(reinterpret_cast<Words>(values * share) & (values == values));
    }
    if constexpr (TRows == 2) // without a division: one missing sample leaves half the mean
        return mean + reinterpret_cast<Floats>(reinterpret_cast<Words>(mean) & (o_rLanes.Count == 1));
    return mean / (share * __builtin_convertvector(o_rLanes.Count == 0 ? o_rLanes.Count + 1 : o_rLanes.Count, Floats));
}

/// The same where nearly always nothing is missing and no sum is too large: then there is less to do.
template <std::size_t TRows>
Floats ReduceFew(const float* i_pRows, std::size_t i_Width, Lanes& o_rLanes)
{
    if constexpr (TRows == 2)
        return ReduceWithGaps<TRows>(i_pRows, i_Width, o_rLanes);
    constexpr std::size_t groupRows = 4; // sums of sums stay nearer to the truth than one long sum
    Floats sum{};
    for (std::size_t group = 0; group < TRows; group += groupRows)
    {
        Floats part{};
        for (std::size_t row = group; row < group + groupRows; ++row)
        {
            const Floats values = Load(i_pRows + row * i_Width);
            part += values;
            o_rLanes.Maximum = values > o_rLanes.Maximum ? values : o_rLanes.Maximum;
            o_rLanes.Minimum = values < o_rLanes.Minimum ? values : o_rLanes.Minimum;
        }
        sum += part;
    }
    if (AreAllFinite(sum)) [[likely]]
    {
        o_rLanes.Count = Words{} + static_cast<std::int32_t>(TRows);
        return sum * (1.0f / TRows);
    }
    o_rLanes = {};
    return ReduceWithGaps<TRows>(i_pRows, i_Width, o_rLanes);
}

/// The records of up to four components that stand side by side in a few rows. Reads four values of each row.
template <std::size_t TRows, typename TRecord>
void SummariseFour(const float* i_pRows, std::size_t i_Width, std::size_t i_Used, TRecord* o_pRecords)
{
    Lanes lanes;
    const Floats mean = ReduceFew<TRows>(i_pRows, i_Width, lanes);
    StoreFour(mean, lanes, i_Used, o_pRecords);
}

template <std::size_t TRows, typename TRecord>
void SummariseRows(const float* i_pRows, std::size_t i_Components, std::size_t i_Records, TRecord* o_pRecords)
{
    for (std::size_t i = 0; i < i_Records; ++i, i_pRows += TRows * i_Components, o_pRecords += i_Components)
    {
        const bool bMoreFollows = i + 1 < i_Records; // then it does no harm to read beyond the last component
        std::size_t c = 0;
        for (; i_Components > 1 && c < i_Components && (bMoreFollows || c + LaneCount <= i_Components); c += LaneCount)
            SummariseFour<TRows>(i_pRows + c, i_Components, i_Components - c, o_pRecords + c);
        for (; c < i_Components; ++c)
            SummariseColumn<TRecord, TRows>(i_pRows + c, i_Components, o_pRecords[c]);
    }
}

Floats CombineUnequal(Floats i_A, Floats i_B)
{
    PackedRecord a, b;
    Store(i_A, &a);
    Store(i_B, &b);
    const std::uint32_t count = a.Count + b.Count; // above 0
    const double sum = static_cast<double>(a.Mean) * a.Count + static_cast<double>(b.Mean) * b.Count;
    const double mean = a.Count == 0   ? static_cast<double>(b.Mean)
                        : b.Count == 0 ? static_cast<double>(a.Mean)
                                       : sum / count;
    const PackedRecord both{static_cast<float>(mean), std::max(a.Maximum, b.Maximum), std::min(a.Minimum, b.Minimum),
                            count};
    return reinterpret_cast<Floats>(LoadWords(&both));
}

/// Two packed records, each as a vector.
Floats CombineTwo(Floats i_A, Floats i_B)
{
    const Words a = reinterpret_cast<Words>(i_A);
    const Words b = reinterpret_cast<Words>(i_B);
    if (a[3] != b[3]) [[unlikely]]
        return CombineUnequal(i_A, i_B);
    // A count that is taken for a number is a denormal one, and those are slow.
    constexpr Words numbers{-1, -1, -1, 0};
    const Floats first = reinterpret_cast<Floats>(a & numbers);
    const Floats second = reinterpret_cast<Floats>(b & numbers);
    const Floats mean = first * 0.5f + second * 0.5f;
    const Floats maximum = first > second ? first : second;
    const Floats minimum = first < second ? first : second;
    const Floats count = reinterpret_cast<Floats>((a & ~numbers) + (b & ~numbers));
    const Floats front = __builtin_shufflevector(mean, maximum, 0, 5, 0, 5);
    const Floats back = __builtin_shufflevector(minimum, count, 2, 7, 2, 7);
    return __builtin_shufflevector(front, back, 0, 1, 4, 5);
}

Floats LoadRecord(const PackedRecord* i_pRecord)
{
    return reinterpret_cast<Floats>(LoadWords(i_pRecord));
}

/// 16 rows of one component: four vectors.
PackedRecord SummariseSixteen(const float* i_pValues)
{
    Lanes lanes;
    const Floats means = ReduceFew<LaneCount>(i_pValues, LaneCount, lanes);
    const auto count =
        static_cast<std::uint32_t>((lanes.Count[0] + lanes.Count[1]) + (lanes.Count[2] + lanes.Count[3]));
    float mean = 0.25f * means[0] + 0.25f * means[1] + (0.25f * means[2] + 0.25f * means[3]);
    if (count != 16) // then the four weigh as much as they have samples
    {
        const Floats weighed = means * __builtin_convertvector(lanes.Count, Floats) * (1.0f / 16);
        const float part = (weighed[0] + weighed[1]) + (weighed[2] + weighed[3]);
        mean = count == 0 ? 0.0f : part * (16.0f / static_cast<float>(count));
    }
    return {mean, std::max(std::max(lanes.Maximum[0], lanes.Maximum[1]), std::max(lanes.Maximum[2], lanes.Maximum[3])),
            std::min(std::min(lanes.Minimum[0], lanes.Minimum[1]), std::min(lanes.Minimum[2], lanes.Minimum[3])),
            count};
}

} // namespace

void SummariseFew(const float* i_pRows, std::size_t i_Components, std::size_t i_RowsEach, std::size_t i_Records,
                  LodRecord* o_pRecords)
{
    if (i_RowsEach == 2)
        SummariseRows<2>(i_pRows, i_Components, i_Records, o_pRecords);
    else if (i_RowsEach == 4)
        SummariseRows<4>(i_pRows, i_Components, i_Records, o_pRecords);
    else
        SummariseRows<8>(i_pRows, i_Components, i_Records, o_pRecords);
}

void SummariseSixteens(const float* i_pRows, std::size_t i_Components, std::size_t i_Records, PackedRecord* o_pRecords)
{
    if (i_Components != 1)
        return SummariseRows<16>(i_pRows, i_Components, i_Records, o_pRecords);
    for (std::size_t i = 0; i < i_Records; ++i)
        o_pRecords[i] = SummariseSixteen(i_pRows + 16 * i);
}

void CombinePairs(const PackedRecord* i_pRecords, std::size_t i_Components, std::size_t i_Records,
                  LodRecord* o_pRecords)
{
    for (std::size_t i = 0; i < i_Records; ++i, i_pRecords += 2 * i_Components)
        for (std::size_t c = 0; c < i_Components; ++c)
            Store(CombineTwo(LoadRecord(i_pRecords + c), LoadRecord(i_pRecords + c + i_Components)), o_pRecords++);
}

void CombineFours(const PackedRecord* i_pRecords, std::size_t i_Components, std::size_t i_Records,
                  PackedRecord* o_pRecords)
{
    for (std::size_t i = 0; i < i_Records; ++i, i_pRecords += 4 * i_Components)
        for (std::size_t c = 0; c < i_Components; ++c)
        {
            const PackedRecord* pRecord = i_pRecords + c;
            const Floats front = CombineTwo(LoadRecord(pRecord), LoadRecord(pRecord + i_Components));
            const Floats back =
                CombineTwo(LoadRecord(pRecord + 2 * i_Components), LoadRecord(pRecord + 3 * i_Components));
            Store(CombineTwo(front, back), o_pRecords++);
        }
}

void Unpack(const PackedRecord* i_pRecords, std::size_t i_Count, LodRecord* o_pRecords)
{
    // Two records are two vectors here and three there, which is the fewest stores.
    std::size_t i = 0;
    for (; i + 2 <= i_Count; i += 2)
    {
        const Words a = LoadWords(i_pRecords + i);
        const Words b = LoadWords(i_pRecords + i + 1);
        const Words first = a & Words{-1, -1, -1, 0};
        const Words countOfFirst = __builtin_shufflevector(a, Words{}, 3, 4, 4, 4);
        const Words second = __builtin_shufflevector(countOfFirst, b, 0, 1, 4, 5);
        const Words third = __builtin_shufflevector(b, Words{}, 2, 4, 3, 4);
        std::byte* pTarget = reinterpret_cast<std::byte*>(o_pRecords + i);
        std::memcpy(pTarget, &first, sizeof(first));
        std::memcpy(pTarget + sizeof(first), &second, sizeof(second));
        std::memcpy(pTarget + 2 * sizeof(first), &third, sizeof(third));
    }
    for (; i < i_Count; ++i)
        o_pRecords[i] = {i_pRecords[i].Mean, i_pRecords[i].Maximum, i_pRecords[i].Minimum, 0, i_pRecords[i].Count};
}

} // namespace Channels
