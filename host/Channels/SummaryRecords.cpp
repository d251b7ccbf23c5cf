#include "Channels/Lanes.h"
#include "Channels/Summary.h"

#include <array>
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

constexpr std::array<double, 5> Inverse{0.0, 1.0, 1.0 / 2.0, 1.0 / 3.0, 1.0 / 4.0};

/// A few samples of one component, i_Width values apart.
template <typename TRecord, std::size_t TSamples>
void SummariseFew(const float* i_pValues, std::size_t i_Width, TRecord& o_rRecord)
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
    o_rRecord.Mean = static_cast<float>(sum * Inverse[count]);
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

/// The records of up to four components that stand side by side in a few rows. Reads four values of each row.
template <std::size_t TRows, typename TRecord>
void SummariseFour(const float* i_pRows, std::size_t i_Width, std::size_t i_Used, TRecord* o_pRecords)
{
    constexpr float share = 1.0f / TRows; // taken before adding, so that no sum leaves the range of float
    Lanes lanes;
    Floats mean{};
    for (std::size_t row = 0; row < TRows; ++row)
    {
        const Floats values = Load(i_pRows + row * i_Width);
        lanes.Add(values);
        mean += reinterpret_cast<Floats>(reinterpret_cast<Words>(values * share) & (values == values));
    }
    if constexpr (TRows == 2) // without a division: one missing sample leaves half the mean
        mean += reinterpret_cast<Floats>(reinterpret_cast<Words>(mean) & (lanes.Count == 1));
    else
        mean /= share * __builtin_convertvector(lanes.Count == 0 ? lanes.Count + 1 : lanes.Count, Floats);
    const Floats counts = reinterpret_cast<Floats>(lanes.Count);
    const Floats frontLow = __builtin_shufflevector(mean, lanes.Maximum, 0, 4, 1, 5);
    const Floats frontHigh = __builtin_shufflevector(mean, lanes.Maximum, 2, 6, 3, 7);
    const Floats backLow = __builtin_shufflevector(lanes.Minimum, counts, 0, 4, 1, 5);
    const Floats backHigh = __builtin_shufflevector(lanes.Minimum, counts, 2, 6, 3, 7);
    Store(__builtin_shufflevector(frontLow, backLow, 0, 1, 4, 5), o_pRecords);
    if (i_Used > 1)
        Store(__builtin_shufflevector(frontLow, backLow, 2, 3, 6, 7), o_pRecords + 1);
    if (i_Used > 2)
        Store(__builtin_shufflevector(frontHigh, backHigh, 0, 1, 4, 5), o_pRecords + 2);
    if (i_Used > 3)
        Store(__builtin_shufflevector(frontHigh, backHigh, 2, 3, 6, 7), o_pRecords + 3);
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
            SummariseFew<TRecord, TRows>(i_pRows + c, i_Components, o_pRecords[c]);
    }
}

PackedRecord CombineTwo(const PackedRecord& i_rA, const PackedRecord& i_rB)
{
    const std::uint32_t count = i_rA.Count + i_rB.Count;
    double mean = 0.0;
    if (i_rA.Count == i_rB.Count) // nearly always; both empty too
        mean = 0.5 * (static_cast<double>(i_rA.Mean) + static_cast<double>(i_rB.Mean));
    else if (i_rA.Count == 0)
        mean = static_cast<double>(i_rB.Mean);
    else if (i_rB.Count == 0)
        mean = static_cast<double>(i_rA.Mean);
    else
        mean = (static_cast<double>(i_rA.Mean) * i_rA.Count + static_cast<double>(i_rB.Mean) * i_rB.Count) / count;
    return {static_cast<float>(mean), std::max(i_rA.Maximum, i_rB.Maximum), std::min(i_rA.Minimum, i_rB.Minimum),
            count};
}

} // namespace

void SummarisePairs(const float* i_pRows, std::size_t i_Components, std::size_t i_Records, LodRecord* o_pRecords)
{
    SummariseRows<2>(i_pRows, i_Components, i_Records, o_pRecords);
}

void SummariseFours(const float* i_pRows, std::size_t i_Components, std::size_t i_Records, PackedRecord* o_pRecords)
{
    SummariseRows<4>(i_pRows, i_Components, i_Records, o_pRecords);
}

void CombinePairs(const PackedRecord* i_pRecords, std::size_t i_Components, std::size_t i_Records,
                  PackedRecord* o_pRecords)
{
    for (std::size_t i = 0; i < i_Records; ++i, i_pRecords += 2 * i_Components, o_pRecords += i_Components)
        for (std::size_t c = 0; c < i_Components; ++c)
            o_pRecords[c] = CombineTwo(i_pRecords[c], i_pRecords[c + i_Components]);
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
