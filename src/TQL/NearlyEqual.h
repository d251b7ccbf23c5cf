#pragma once

#include <algorithm>
#include <cmath>
#include <utility>

namespace TQL
{

/// Equal to within one part in 1e12 of the smaller magnitude; where one of the two is 0, to within 1e-12.
inline bool NearlyEqual(double i_A, double i_B) noexcept
{
    const double difference = std::abs(i_A - i_B);
    if (i_A != 0.0 && i_B != 0.0)
        return difference * 1e12 <= std::min(std::abs(i_A), std::abs(i_B));
    return difference <= 1e-12;
}

/// A range as (minimum, maximum).
using FrameRange = std::pair<double, double>;

inline bool NearlyEqual(const FrameRange& i_rA, const FrameRange& i_rB) noexcept
{
    return NearlyEqual(i_rA.first, i_rB.first) && NearlyEqual(i_rA.second, i_rB.second);
}

} // namespace TQL
