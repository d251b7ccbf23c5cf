#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <limits>

/// Vectors of four floats, as every processor of the baseline has them: the tools of the summary kernels, not for
/// others. Written with the vector types of the compiler, so the same text serves any processor.
namespace Channels::Detail
{

using Floats = float __attribute__((vector_size(16)));
using Words = std::int32_t __attribute__((vector_size(16)));
using LongWords = std::int64_t __attribute__((vector_size(16)));

inline constexpr std::size_t LaneCount = 4;
inline constexpr float Infinity = std::numeric_limits<float>::infinity();

inline Floats Load(const float* i_pValues)
{
    Floats values;
    std::memcpy(&values, i_pValues, sizeof(values));
    return values;
}

/// Four running reductions side by side. A comparison with NaN is false, so a NaN never becomes an extreme.
struct Lanes
{
    Floats Sum{};
    Floats Maximum = Floats{} - Infinity;
    Floats Minimum = Floats{} + Infinity;
    Words Count{};

    void Add(Floats i_Values)
    {
        const Words valid = i_Values == i_Values;
        Sum += reinterpret_cast<Floats>(reinterpret_cast<Words>(i_Values) & valid);
        Maximum = i_Values > Maximum ? i_Values : Maximum;
        Minimum = i_Values < Minimum ? i_Values : Minimum;
        Count -= valid;
    }

    /// All but the sum.
    void Extend(Floats i_Values)
    {
        Maximum = i_Values > Maximum ? i_Values : Maximum;
        Minimum = i_Values < Minimum ? i_Values : Minimum;
        Count -= i_Values == i_Values;
    }

    void Add(const Lanes& i_rOther)
    {
        Sum += i_rOther.Sum;
        Maximum = i_rOther.Maximum > Maximum ? i_rOther.Maximum : Maximum;
        Minimum = i_rOther.Minimum < Minimum ? i_rOther.Minimum : Minimum;
        Count += i_rOther.Count;
    }
};

} // namespace Channels::Detail
