#pragma once

#include "ChannelSystem/LodRecord.h"
#include "TQL/IResult.h"
#include "TQL/ITick.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>
#include <vector>

namespace ChannelSystem
{

/// The memory behind a block. A lease says "the same series as before": tokens are equal as long as appending and
/// trimming is all that happened, and new when the contents were replaced (loop, reload, new parameter). Thread-safe.
class IChannelStore
{
public:
    virtual std::uint64_t AcquireLease(std::int64_t i_Tick) = 0; ///< a token, never 0
    virtual void ReleaseLease(std::uint64_t i_Token) = 0;
    virtual ~IChannelStore() = default;
};

struct ChannelLayout
{
    std::uint32_t Kind = 0;
    std::uint32_t ComponentCount = 1; ///< values of one sample, at least 1
};

/// What never changes during a block's life.
struct ChannelBlockShape
{
    std::uint32_t FormatTag = 0;
    std::int64_t SamplePeriod = 0;            ///< ticks, above 0
    std::int64_t GridOffset = 0;              ///< ticks; samples stand at GridOffset + n x SamplePeriod
    std::vector<std::int64_t> SummaryPeriods; ///< ticks of summary level k, which is SamplePeriod << (k + 1)
    std::shared_ptr<const ChannelLayout> pLayout;
};

/// The samples of a channel as a reader sees them: level 0 as they are, and summary levels k = 0, 1, ... whose records
/// each cover 2^(k+1) samples. Components are interleaved, a missing sample is NaN, tick ranges exclude their last
/// tick. Every operation is thread-safe against the writer of the data and does not throw.
class IChannelBlock
{
public:
    virtual const ChannelBlockShape& GetShape() const = 0;
    virtual const std::shared_ptr<IChannelStore>& GetStore() const = 0;

    /// The ticks available: first sample to last sample + period. First is on the grid. Empty when there are none.
    virtual void GetRange(TQL::TickRange& o_rRange) const = 0;

    /// Level 0. The range lies on the grid and inside GetRange, the span holds exactly rows x components; otherwise
    /// InvalidArgument (0x8000000F) and nothing is written. i_Flag is 0.
    virtual TQL::IResult ReadSamples(const TQL::TickRange& i_rRange, std::span<float> o_Samples,
                                     std::uint32_t i_Flag = 0) const = 0;

    /// Summary level k. The start lies on the grid of that level, up to one bin before the first sample; the end may
    /// fall inside the last bin. Records at both borders summarise the samples that exist. Returns the records written
    /// (rows x components), 0 when the level is not held. i_Flag is 1.
    virtual std::size_t ReadSummary(const TQL::TickRange& i_rRange, std::uint32_t i_Level,
                                    std::span<LodRecord> o_Records, std::uint32_t i_Flag = 1) const = 0;

    /// One component at level 0, with the rules of ReadSamples.
    virtual TQL::IResult ReadComponent(const TQL::TickRange& i_rRange, std::span<float> o_Samples,
                                       std::uint32_t i_Component, std::uint32_t i_Flag = 0) const = 0;

    /// One record per component over the whole range, cheap for any length: it comes from the summary levels.
    virtual TQL::IResult Summarise(const TQL::TickRange& i_rRange, std::span<LodRecord> o_Records) const = 0;

    virtual ~IChannelBlock() = default;
};

} // namespace ChannelSystem
