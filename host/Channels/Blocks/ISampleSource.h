#pragma once

#include "ChannelSystem/IChannelBlock.h"
#include "TQL/IResult.h"
#include "TQL/ITick.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>

namespace Channels
{

/// Where samples stand, and how wide a row of them is.
struct SampleGrid
{
    std::int64_t Period = 1; ///< ticks, above 0
    std::int64_t Offset = 0; ///< samples stand at Offset + n x Period
    std::uint32_t Components = 1;

    friend bool operator==(const SampleGrid&, const SampleGrid&) = default;
};

/// Rows of samples that a feed copies or an operation computes from. Any number of threads.
class ISampleSource
{
public:
    virtual ~ISampleSource() = default;

    virtual const SampleGrid& GetGrid() const = 0;

    /// First sample to last sample + period, on the grid. Empty while there are none.
    virtual TQL::TickRange GetRange() const = 0;

    /// Rows x components. The range lies on the grid and inside a range that GetRange has reported; an error when its
    /// samples are gone meanwhile, and what the span holds then means nothing.
    virtual TQL::IResult Read(const TQL::TickRange& i_rRange, std::span<float> o_Rows) const = 0;
};

/// The samples of a block.
class VBlockSource : public ISampleSource
{
public:
    explicit VBlockSource(std::shared_ptr<const ChannelSystem::IChannelBlock> i_pBlock);

    const SampleGrid& GetGrid() const override { return m_Grid; }
    TQL::TickRange GetRange() const override;
    TQL::IResult Read(const TQL::TickRange& i_rRange, std::span<float> o_Rows) const override;

private:
    const std::shared_ptr<const ChannelSystem::IChannelBlock> m_pBlock;
    const SampleGrid m_Grid;
};

/// The samples of a block by the shortest way: where the block only keeps what is computed, that computation itself, so
/// that nothing is kept for the sake of a reader in between.
std::shared_ptr<const ISampleSource> SourceOf(const std::shared_ptr<ChannelSystem::IChannelBlock>& i_rpBlock);

} // namespace Channels
