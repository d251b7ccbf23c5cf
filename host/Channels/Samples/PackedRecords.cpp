#include "Channels/Samples/PackedRecords.h"

#include "Channels/Samples/FewRows.h"

#include <algorithm>
#include <cstring>
#include <type_traits>

namespace Channels
{

namespace
{

using namespace Detail;

template <typename TCount>
TCount LoadCount(const std::uint8_t* i_pCounts, std::size_t i_Index)
{
    TCount count;
    std::memcpy(&count, i_pCounts + i_Index * sizeof(TCount), sizeof(count));
    return count;
}

template <typename TCount>
void StoreCount(std::uint8_t* o_pCounts, std::size_t i_Index, TCount i_Count)
{
    std::memcpy(o_pCounts + i_Index * sizeof(TCount), &i_Count, sizeof(i_Count));
}

/// Calls with a value of the type that counts on a level.
template <typename TFunction>
void WithCountType(std::uint32_t i_Level, const TFunction& i_rFunction)
{
    switch (CountBytesOf(i_Level))
    {
    case 1:
        return i_rFunction(std::uint8_t{});
    case 2:
        return i_rFunction(std::uint16_t{});
    default:
        return i_rFunction(std::uint32_t{});
    }
}

/// The three numbers of a record and, in the last lane, whatever follows it in memory.
Floats LoadFront(const PackedRecord* i_pRecord)
{
    return Load(&i_pRecord->Mean);
}

void StoreFront(Floats i_Record, PackedRecord* o_pRecord)
{
    std::memcpy(static_cast<void*>(o_pRecord), &i_Record, sizeof(PackedRecord));
}

struct SixteenSink
{
    PackedRun Run;

    SixteenSink From(std::size_t i_Index) const { return {{Run.pRecords + i_Index, Run.pCounts + i_Index}}; }
    void Put(std::size_t i_Index, Floats i_Record) const
    {
        StoreFront(i_Record, Run.pRecords + i_Index);
        Run.pCounts[i_Index] = static_cast<std::uint8_t>(reinterpret_cast<Words>(i_Record)[3]);
    }
    void PutFull(const Reduced& i_rReduced, std::size_t i_Used) const { PutFour(i_rReduced, i_Used, *this); }
};

/// 16 rows of one component: four vectors.
Floats SummariseSixteen(const float* i_pValues)
{
    Reduced reduced;
    if (!ReduceFull<LaneCount>(i_pValues, LaneCount, reduced))
        reduced = ReduceWithGaps<LaneCount>(i_pValues, LaneCount);
    const auto& [means, maxima, minima, counts] = reduced;
    const std::int32_t count = (counts[0] + counts[1]) + (counts[2] + counts[3]);
    float mean = 0.25f * means[0] + 0.25f * means[1] + (0.25f * means[2] + 0.25f * means[3]);
    if (count != 16) // then the four weigh as much as they have samples
    {
        const Floats weighed = means * __builtin_convertvector(counts, Floats) * (1.0f / 16);
        const float part = (weighed[0] + weighed[1]) + (weighed[2] + weighed[3]);
        mean = count == 0 ? 0.0f : part * (16.0f / static_cast<float>(count));
    }
    const float maximum = std::max(std::max(maxima[0], maxima[1]), std::max(maxima[2], maxima[3]));
    const float minimum = std::min(std::min(minima[0], minima[1]), std::min(minima[2], minima[3]));
    Words words = reinterpret_cast<Words>(Floats{mean, maximum, minimum, 0.0f});
    words[3] = count;
    return reinterpret_cast<Floats>(words);
}

/// Two records that summarise equally many samples. The last lane is nobody's.
Floats CombineEqual(Floats i_A, Floats i_B)
{
    const Floats mean = i_A * 0.5f + i_B * 0.5f;
    const Floats maximum = i_A > i_B ? i_A : i_B;
    const Floats minimum = i_A < i_B ? i_A : i_B;
    const Floats front = __builtin_shufflevector(mean, maximum, 0, 5, 0, 5);
    return __builtin_shufflevector(front, minimum, 0, 1, 6, 7);
}

PackedRecord CombineWeighed(const PackedRecord& i_rA, std::uint32_t i_CountA, const PackedRecord& i_rB,
                            std::uint32_t i_CountB)
{
    if (i_CountA == 0 || i_CountB == 0)
        return i_CountA == 0 ? i_rB : i_rA;
    const double sum = static_cast<double>(i_rA.Mean) * i_CountA + static_cast<double>(i_rB.Mean) * i_CountB;
    return {static_cast<float>(sum / (static_cast<double>(i_CountA) + i_CountB)), std::max(i_rA.Maximum, i_rB.Maximum),
            std::min(i_rA.Minimum, i_rB.Minimum)};
}

template <typename TCount>
bool AreFull(const std::uint8_t* i_pCounts, std::size_t i_Count, TCount i_Full)
{
    TCount differing = 0;
    for (std::size_t i = 0; i < i_Count; ++i)
        differing = static_cast<TCount>(differing | (LoadCount<TCount>(i_pCounts, i) ^ i_Full));
    return differing == 0;
}

/// One row of records from two rows of the level below.
template <typename TBelow, typename TCount>
void CombineRow(const ConstPackedRun& i_rBelow, std::size_t i_Components, const PackedRun& o_rRun, std::size_t i_Row)
{
    const std::size_t first = 2 * i_Row * i_Components;
    for (std::size_t c = 0; c < i_Components; ++c)
    {
        const std::size_t a = first + c;
        const std::size_t b = a + i_Components;
        const std::size_t target = i_Row * i_Components + c;
        const TBelow countA = LoadCount<TBelow>(i_rBelow.pCounts, a);
        const TBelow countB = LoadCount<TBelow>(i_rBelow.pCounts, b);
        o_rRun.pRecords[target] = CombineWeighed(i_rBelow.pRecords[a], countA, i_rBelow.pRecords[b], countB);
        StoreCount(o_rRun.pCounts, target, static_cast<TCount>(std::uint32_t{countA} + countB));
    }
}

/// Rows of records that are all full.
void CombineFullRows(const PackedRecord* i_pBelow, std::size_t i_Components, std::size_t i_Rows,
                     PackedRecord* o_pRecords)
{
    for (std::size_t row = 0; row < i_Rows; ++row, i_pBelow += 2 * i_Components)
        for (std::size_t c = 0; c < i_Components; ++c)
            StoreFront(CombineEqual(LoadFront(i_pBelow + c), LoadFront(i_pBelow + c + i_Components)), o_pRecords++);
}

/// By pieces, since gaps stand together: most pieces have none and need no counts.
template <typename TBelow, typename TCount>
void CombineRows(const ConstPackedRun& i_rBelow, std::uint32_t i_Level, std::size_t i_Components, std::size_t i_Rows,
                 const PackedRun& o_rRun)
{
    constexpr std::size_t pieceRows = 32;
    const auto full = static_cast<TBelow>(TBelow{1} << i_Level);
    for (std::size_t row = 0; row < i_Rows;)
    {
        const std::size_t source = 2 * row * i_Components;
        const std::size_t target = row * i_Components;
        const std::size_t last = std::min(row + pieceRows, i_Rows);
        if (AreFull<TBelow>(i_rBelow.pCounts + source * sizeof(TBelow), 2 * (last - row) * i_Components, full))
        {
            CombineFullRows(i_rBelow.pRecords + source, i_Components, last - row, o_rRun.pRecords + target);
            for (std::size_t i = target; i < last * i_Components; ++i)
                StoreCount(o_rRun.pCounts, i, static_cast<TCount>(2u * full));
            row = last;
        }
        for (; row < last; ++row)
            CombineRow<TBelow, TCount>(i_rBelow, i_Components, o_rRun, row);
    }
}

} // namespace

void SummariseSixteens(const float* i_pRows, std::size_t i_Components, std::size_t i_Records, const PackedRun& o_rRun)
{
    const SixteenSink sink{o_rRun};
    if (i_Components != 1)
        return SummariseRows<16>(i_pRows, i_Components, i_Records, sink);
    for (std::size_t i = 0; i < i_Records; ++i)
        sink.Put(i, SummariseSixteen(i_pRows + 16 * i));
}

void CombinePairs(const ConstPackedRun& i_rBelow, std::uint32_t i_Level, std::size_t i_Components,
                  std::size_t i_Records, const PackedRun& o_rRun)
{
    WithCountType(i_Level - 1,
                  [&]<typename TBelow>(TBelow)
                  {
                      if (CountBytesOf(i_Level) == sizeof(TBelow))
                          return CombineRows<TBelow, TBelow>(i_rBelow, i_Level, i_Components, i_Records, o_rRun);
                      using TWider = std::conditional_t<sizeof(TBelow) == 1, std::uint16_t, std::uint32_t>;
                      CombineRows<TBelow, TWider>(i_rBelow, i_Level, i_Components, i_Records, o_rRun);
                  });
}

void Unpack(const ConstPackedRun& i_rRun, std::uint32_t i_Level, std::size_t i_Count, LodRecord* o_pRecords)
{
    WithCountType(
        i_Level,
        [&]<typename TCount>(TCount)
        {
            for (std::size_t i = 0; i < i_Count; ++i)
            {
                const Words front = reinterpret_cast<Words>(LoadFront(i_rRun.pRecords + i)) & Words{-1, -1, -1, 0};
                std::memcpy(static_cast<void*>(o_pRecords + i), &front, sizeof(front));
                o_pRecords[i].Count = LoadCount<TCount>(i_rRun.pCounts, i);
            }
        });
}

} // namespace Channels
