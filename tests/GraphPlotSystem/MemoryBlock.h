#pragma once

#include "ChannelSystem/IChannelBlock.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>
#include <memory>
#include <span>
#include <string>
#include <utility>
#include <vector>

namespace TestSupport
{

inline constexpr float Gap = std::numeric_limits<float>::quiet_NaN();

/// The memory behind a MemoryBlock: counts leases, so that a test sees when one was not given back.
class MemoryStore : public ChannelSystem::IChannelStore
{
public:
    std::uint64_t AcquireLease(std::int64_t) override
    {
        ++Open;
        ++Acquired;
        return Token;
    }
    void ReleaseLease(std::uint64_t i_Token) override
    {
        if (i_Token == Token)
            --Open;
    }

    std::uint64_t Token = 1;
    int Open = 0;
    int Acquired = 0;
};

/// A block over samples in plain memory, as strict as a host may be: reads off the grid or outside the range fail, and
/// a summary holds nothing but the samples of the range that was asked for. One thread.
class MemoryBlock : public ChannelSystem::IChannelBlock
{
public:
    explicit MemoryBlock(std::uint32_t i_Components = 1, std::int64_t i_Period = 10, std::uint32_t i_Levels = 4,
                         std::int64_t i_GridOffset = 0)
        : m_Components(i_Components)
    {
        m_Shape.FormatTag = 7;
        m_Shape.SamplePeriod = i_Period;
        m_Shape.GridOffset = i_GridOffset;
        for (std::uint32_t k = 0; k < i_Levels; ++k)
            m_Shape.SummaryPeriods.push_back(i_Period << (k + 1));
        m_Shape.pLayout = std::make_shared<ChannelSystem::ChannelLayout>(ChannelSystem::ChannelLayout{0, i_Components});
    }

    // What a test does to the data. Sample numbers count from the grid offset.
    void Append(const std::vector<float>& i_rValues)
    {
        m_Values.insert(m_Values.end(), i_rValues.begin(), i_rValues.end());
    }
    void Prepend(const std::vector<float>& i_rValues)
    {
        m_Values.insert(m_Values.begin(), i_rValues.begin(), i_rValues.end());
        m_First -= static_cast<std::int64_t>(i_rValues.size()) / m_Components;
    }
    void TrimHead(std::int64_t i_Samples)
    {
        m_Values.erase(m_Values.begin(), m_Values.begin() + i_Samples * m_Components);
        m_First += i_Samples;
    }
    void TrimEnd(std::int64_t i_Samples)
    {
        m_Values.resize(m_Values.size() - static_cast<std::size_t>(i_Samples * m_Components));
    }
    void Replace(std::int64_t i_First, std::vector<float> i_Values)
    {
        m_First = i_First;
        m_Values = std::move(i_Values);
        ++m_pMemory->Token;
    }
    void SetFormatTag(std::uint32_t i_Tag) { m_Shape.FormatTag = i_Tag; }

    std::int64_t First() const { return m_First; }
    std::int64_t End() const { return m_First + static_cast<std::int64_t>(m_Values.size()) / m_Components; }
    std::int64_t TickOf(std::int64_t i_Sample) const { return m_Shape.GridOffset + i_Sample * m_Shape.SamplePeriod; }
    TQL::TickRange Ticks(std::int64_t i_First, std::int64_t i_End) const { return {TickOf(i_First), TickOf(i_End)}; }
    TQL::TickRange Range() const { return Ticks(First(), End()); }
    float Value(std::int64_t i_Sample, std::uint32_t i_Component) const
    {
        return m_Values[static_cast<std::size_t>((i_Sample - m_First) * m_Components + i_Component)];
    }
    MemoryStore& Store() { return *m_pMemory; }

    /// What one component holds in the ticks of a range.
    ChannelSystem::LodRecord Record(const TQL::TickRange& i_rRange, std::uint32_t i_Component) const
    {
        ChannelSystem::LodRecord record;
        double sum = 0.0;
        for (std::int64_t n = std::max(First(), SampleAtOrAfter(i_rRange.First)); n < End(); ++n)
        {
            if (TickOf(n) >= i_rRange.Last)
                break;
            const float value = Value(n, i_Component);
            if (std::isnan(value))
                continue;
            record.Maximum = std::max(record.Maximum, value);
            record.Minimum = std::min(record.Minimum, value);
            sum += static_cast<double>(value);
            ++record.Count;
        }
        if (record.Count != 0)
            record.Mean = static_cast<float>(sum / static_cast<double>(record.Count));
        return record;
    }

    // IChannelBlock
    const ChannelSystem::ChannelBlockShape& GetShape() const override { return m_Shape; }
    const std::shared_ptr<ChannelSystem::IChannelStore>& GetStore() const override { return m_pStore; }
    void GetRange(TQL::TickRange& o_rRange) const override { o_rRange = Range(); }

    TQL::IResult ReadSamples(const TQL::TickRange& i_rRange, std::span<float> o_Samples,
                             std::uint32_t = 0) const override
    {
        Note("samples", i_rRange);
        if (!CanRead(i_rRange, o_Samples.size(), m_Components))
            return TQL::Result::InvalidArgument;
        const auto offset = static_cast<std::ptrdiff_t>((SampleAtOrAfter(i_rRange.First) - m_First) * m_Components);
        std::copy_n(m_Values.begin() + offset, o_Samples.size(), o_Samples.begin());
        return TQL::Result::Ok;
    }

    std::size_t ReadSummary(const TQL::TickRange& i_rRange, std::uint32_t i_Level,
                            std::span<ChannelSystem::LodRecord> o_Records, std::uint32_t = 1) const override
    {
        Note("summary " + std::to_string(i_Level), i_rRange);
        if (bFail || SummaryReadsLeft-- == 0 || i_Level >= m_Shape.SummaryPeriods.size())
            return 0;
        const std::int64_t stride = m_Shape.SummaryPeriods[i_Level];
        if (TQL::AlignDown(i_rRange.First, stride, m_Shape.GridOffset) != i_rRange.First ||
            i_rRange.First + stride <= Range().First || i_rRange.Last > Range().Last)
            return 0;
        std::size_t written = 0;
        for (std::int64_t tick = i_rRange.First; tick < i_rRange.Last; tick += stride)
            for (std::uint32_t c = 0; c < m_Components && written < o_Records.size(); ++c)
                o_Records[written++] = Record({tick, std::min(tick + stride, i_rRange.Last)}, c);
        return written;
    }

    TQL::IResult ReadComponent(const TQL::TickRange& i_rRange, std::span<float> o_Samples, std::uint32_t i_Component,
                               std::uint32_t = 0) const override
    {
        Note("component " + std::to_string(i_Component), i_rRange);
        if (!CanRead(i_rRange, o_Samples.size(), 1) || i_Component >= m_Components)
            return TQL::Result::InvalidArgument;
        const std::int64_t first = SampleAtOrAfter(i_rRange.First);
        for (std::size_t i = 0; i < o_Samples.size(); ++i)
            o_Samples[i] = Value(first + static_cast<std::int64_t>(i), i_Component);
        return TQL::Result::Ok;
    }

    TQL::IResult Summarise(const TQL::TickRange& i_rRange, std::span<ChannelSystem::LodRecord> o_Records) const override
    {
        if (o_Records.size() != m_Components)
            return TQL::Result::InvalidArgument;
        for (std::uint32_t c = 0; c < m_Components; ++c)
            o_Records[c] = Record(i_rRange, c);
        return TQL::Result::Ok;
    }

    /// The reads since the last call, one line each, in sample numbers.
    std::string TakeReads() const { return std::exchange(m_Reads, {}); }

    bool bFail = false;                ///< every read fails
    mutable int SummaryReadsLeft = -1; ///< the summary read after as many fails; negative: none

private:
    std::int64_t SampleAtOrAfter(std::int64_t i_Tick) const
    {
        return TQL::FloorDivide(i_Tick - m_Shape.GridOffset + m_Shape.SamplePeriod - 1, m_Shape.SamplePeriod);
    }
    bool CanRead(const TQL::TickRange& i_rRange, std::size_t i_Values, std::uint32_t i_Components) const
    {
        const auto onGrid = [this](std::int64_t i_Tick)
        {
            return TickOf(SampleAtOrAfter(i_Tick)) == i_Tick;
        };
        return !bFail && onGrid(i_rRange.First) && onGrid(i_rRange.Last) && i_rRange.First >= Range().First &&
               i_rRange.Last <= Range().Last && i_rRange.First < i_rRange.Last &&
               i_Values ==
                   static_cast<std::size_t>((i_rRange.Last - i_rRange.First) / m_Shape.SamplePeriod) * i_Components;
    }
    void Note(const std::string& i_rWhat, const TQL::TickRange& i_rRange) const
    {
        m_Reads += i_rWhat + " [" + std::to_string(SampleAtOrAfter(i_rRange.First)) + ", " +
                   std::to_string(SampleAtOrAfter(i_rRange.Last)) + ")\n";
    }

    ChannelSystem::ChannelBlockShape m_Shape;
    const std::uint32_t m_Components;
    std::int64_t m_First = 0;
    std::vector<float> m_Values;
    const std::shared_ptr<MemoryStore> m_pMemory = std::make_shared<MemoryStore>();
    const std::shared_ptr<ChannelSystem::IChannelStore> m_pStore = m_pMemory;
    mutable std::string m_Reads;
};

/// Samples i_First and on: the value of sample n is n, or a gap where i_rIsGap says so.
template <typename TIsGap>
std::vector<float> Ramp(std::int64_t i_First, std::int64_t i_End, const TIsGap& i_rIsGap)
{
    std::vector<float> values;
    for (std::int64_t n = i_First; n < i_End; ++n)
        values.push_back(i_rIsGap(n) ? Gap : static_cast<float>(n));
    return values;
}
inline std::vector<float> Ramp(std::int64_t i_First, std::int64_t i_End)
{
    return Ramp(i_First, i_End, [](std::int64_t) { return false; });
}

} // namespace TestSupport
