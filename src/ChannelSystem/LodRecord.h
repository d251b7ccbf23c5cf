#pragma once

#include <cstdint>
#include <limits>

namespace ChannelSystem
{

/// The summary of one component over a run of samples. 24 bytes, plain memory. NaN samples do not count.
struct LodRecord
{
    float Mean = 0.0f;
    float Maximum = -std::numeric_limits<float>::infinity();
    float Minimum = std::numeric_limits<float>::infinity();
    std::uint32_t Padding = 0;
    std::uint64_t Count = 0; ///< valid samples; 0 leaves the other fields at (0, -infinity, +infinity)
};

static_assert(sizeof(LodRecord) == 24);

} // namespace ChannelSystem
