#pragma once

#include "ChannelSystem/LodRecord.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <span>

/// The reduction of samples into summary records: minimum, maximum, mean and count of the samples that are not NaN.
/// Infinite samples are samples. Sums run in float over short blocks and in double over the blocks, so a mean stays
/// right over any number of samples. Pure functions; no thread, no allocation.
namespace Channels
{

using ChannelSystem::LodRecord;

/// Gathers samples and records into one record.
class Accumulator
{
public:
    void Add(float i_Sample)
    {
        if (i_Sample != i_Sample)
            return;
        AddRun(i_Sample, i_Sample, i_Sample, 1);
    }

    void Add(const LodRecord& i_rRecord)
    {
        if (i_rRecord.Count != 0)
            AddRun(static_cast<double>(i_rRecord.Mean) * static_cast<double>(i_rRecord.Count), i_rRecord.Maximum,
                   i_rRecord.Minimum, i_rRecord.Count);
    }

    /// i_Count samples with that sum and those extremes; i_Count is above 0.
    void AddRun(double i_Sum, float i_Maximum, float i_Minimum, std::uint64_t i_Count)
    {
        m_Sum += i_Sum;
        m_Maximum = std::max(m_Maximum, i_Maximum);
        m_Minimum = std::min(m_Minimum, i_Minimum);
        m_Count += i_Count;
    }

    LodRecord Result() const
    {
        if (m_Count == 0)
            return {};
        return {static_cast<float>(m_Sum / static_cast<double>(m_Count)), m_Maximum, m_Minimum, 0, m_Count};
    }

private:
    double m_Sum = 0.0;
    float m_Maximum = -std::numeric_limits<float>::infinity();
    float m_Minimum = std::numeric_limits<float>::infinity();
    std::uint64_t m_Count = 0;
};

/// One component, contiguous.
void Reduce(std::span<const float> i_Samples, Accumulator& o_rAccumulator);

/// Rows of interleaved components, i_Width values apart, into one accumulator for each of the first components.
/// Quickest for at most six components that fill the rows.
void Reduce(const float* i_pRows, std::size_t i_RowCount, std::size_t i_Width, std::span<Accumulator> o_Accumulators);

/// One component in buckets of i_Bucket samples, the last bucket maybe shorter. o_Records holds one for each bucket.
void ReduceBuckets(std::span<const float> i_Samples, std::size_t i_Bucket, std::span<LodRecord> o_Records);

/// The summary of everything that the records summarise.
LodRecord Combine(std::span<const LodRecord> i_Records);

/// Records of i_RowsEach rows each, 2, 4 or 8, from rows of interleaved components: one record a component and so many
/// rows.
void SummariseFew(const float* i_pRows, std::size_t i_Components, std::size_t i_RowsEach, std::size_t i_Records,
                  LodRecord* o_pRecords);

} // namespace Channels
