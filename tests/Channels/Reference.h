#pragma once

#include "ChannelSystem/LodRecord.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <random>
#include <span>
#include <tuple>
#include <vector>

namespace ChannelsTest
{

using ChannelSystem::LodRecord;

inline constexpr float NaN = std::numeric_limits<float>::quiet_NaN();
inline constexpr float Infinity = std::numeric_limits<float>::infinity();

/// The summary of every i_Stride-th value, sample by sample in double.
inline LodRecord SlowSummary(std::span<const float> i_Values, std::size_t i_Stride = 1)
{
    LodRecord record;
    double sum = 0.0;
    for (std::size_t i = 0; i < i_Values.size(); i += i_Stride)
    {
        const float value = i_Values[i];
        if (std::isnan(value))
            continue;
        sum += static_cast<double>(value);
        record.Maximum = std::max(record.Maximum, value);
        record.Minimum = std::min(record.Minimum, value);
        ++record.Count;
    }
    if (record.Count != 0)
        record.Mean = static_cast<float>(sum / static_cast<double>(record.Count));
    return record;
}

/// Equal but for the rounding of the mean, which is a few parts in 10^6 of the values.
inline ::testing::AssertionResult IsSame(const LodRecord& i_rActual, const LodRecord& i_rExpected)
{
    const bool bSameMean = [&]
    {
        if (!std::isfinite(i_rExpected.Mean))
            return std::isnan(i_rActual.Mean) == std::isnan(i_rExpected.Mean) &&
                   (std::isnan(i_rActual.Mean) || i_rActual.Mean == i_rExpected.Mean);
        const float extreme = std::max(std::abs(i_rExpected.Maximum), std::abs(i_rExpected.Minimum));
        return std::abs(i_rActual.Mean - i_rExpected.Mean) <= (i_rExpected.Count == 0 ? 0.0f : 3e-6f * extreme);
    }();
    if (bSameMean && i_rActual.Maximum == i_rExpected.Maximum && i_rActual.Minimum == i_rExpected.Minimum &&
        i_rActual.Count == i_rExpected.Count && i_rActual.Padding == 0)
        return ::testing::AssertionSuccess();
    const auto text = [](const LodRecord& i_rRecord)
    {
        return ::testing::PrintToString(
            std::make_tuple(i_rRecord.Mean, i_rRecord.Maximum, i_rRecord.Minimum, i_rRecord.Count));
    };
    return ::testing::AssertionFailure() << text(i_rActual) << " instead of " << text(i_rExpected);
}

/// Values around 1000 with gaps of many lengths.
inline std::vector<float> RandomSamples(std::size_t i_Count, std::uint32_t i_Seed)
{
    std::mt19937 random(i_Seed);
    std::uniform_real_distribution<float> value(900.0f, 1100.0f);
    std::vector<float> samples(i_Count);
    std::size_t gap = 0;
    for (float& rSample : samples)
    {
        if (gap == 0 && random() % 50 == 0)
            gap = 1 + random() % 40;
        rSample = gap > 0 ? NaN : value(random);
        gap -= gap > 0 ? 1 : 0;
    }
    return samples;
}

} // namespace ChannelsTest
