#include "Channels/Samples/FewRows.h"
#include "Channels/Samples/Summary.h"

#include <cstring>

// The summary records of a few rows, in the form for readers.
namespace Channels
{

namespace
{

using namespace Detail;

/// Records of 24 bytes: three numbers, a word of 0, the count in two words.
struct LodSink
{
    LodRecord* pRecords;

    LodSink From(std::size_t i_Index) const { return {pRecords + i_Index}; }

    void Put(std::size_t i_Index, Floats i_Record) const
    {
        const Words words = reinterpret_cast<Words>(i_Record);
        StoreWords(words & Words{-1, -1, -1, 0}, i_Index * sizeof(LodRecord));
        pRecords[i_Index].Count = static_cast<std::uint32_t>(words[3]);
    }

    /// Two records are three vectors: one store less than two records by themselves.
    void PutFull(const Reduced& i_rReduced, std::size_t i_Used) const
    {
        if (i_Used < 3)
            return PutFour(i_rReduced, i_Used, *this);
        const Floats count = reinterpret_cast<Floats>(i_rReduced.Count & Words{-1, 0, -1, 0});
        const Floats frontLow = __builtin_shufflevector(i_rReduced.Mean, i_rReduced.Maximum, 0, 4, 1, 5);
        const Floats frontHigh = __builtin_shufflevector(i_rReduced.Mean, i_rReduced.Maximum, 2, 6, 3, 7);
        const Floats backLow = __builtin_shufflevector(i_rReduced.Minimum, Floats{}, 0, 4, 1, 5);
        const Floats backHigh = __builtin_shufflevector(i_rReduced.Minimum, Floats{}, 2, 6, 3, 7);
        StoreTwo(frontLow, backLow, count, 0);
        if (i_Used > 3)
            return StoreTwo(frontHigh, backHigh, count, 2);
        StoreWords(reinterpret_cast<Words>(__builtin_shufflevector(frontHigh, backHigh, 0, 1, 4, 5)),
                   2 * sizeof(LodRecord));
        pRecords[2].Count = static_cast<std::uint32_t>(i_rReduced.Count[0]);
    }

private:
    void StoreWords(Words i_Words, std::size_t i_Offset) const
    {
        std::memcpy(reinterpret_cast<std::byte*>(pRecords) + i_Offset, &i_Words, sizeof(i_Words));
    }

    void StoreTwo(Floats i_Front, Floats i_Back, Floats i_Count, std::size_t i_Index) const
    {
        const std::size_t offset = i_Index * sizeof(LodRecord);
        StoreWords(reinterpret_cast<Words>(__builtin_shufflevector(i_Front, i_Back, 0, 1, 4, 5)), offset);
        StoreWords(reinterpret_cast<Words>(__builtin_shufflevector(i_Count, i_Front, 0, 1, 6, 7)), offset + 16);
        StoreWords(reinterpret_cast<Words>(__builtin_shufflevector(i_Back, i_Count, 2, 3, 4, 5)), offset + 32);
    }
};

} // namespace

void SummariseFew(const float* i_pRows, std::size_t i_Components, std::size_t i_RowsEach, std::size_t i_Records,
                  LodRecord* o_pRecords)
{
    const LodSink sink{o_pRecords};
    if (i_RowsEach == 2)
        SummariseRows<2>(i_pRows, i_Components, i_Records, sink);
    else if (i_RowsEach == 4)
        SummariseRows<4>(i_pRows, i_Components, i_Records, sink);
    else
        SummariseRows<8>(i_pRows, i_Components, i_Records, sink);
}

} // namespace Channels
