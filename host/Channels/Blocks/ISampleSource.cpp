#include "Channels/Blocks/ISampleSource.h"

#include "Channels/Blocks/VCacheFeed.h"
#include "Channels/Blocks/VSampleBlock.h"

#include <utility>

namespace Channels
{

VBlockSource::VBlockSource(std::shared_ptr<const ChannelSystem::IChannelBlock> i_pBlock)
    : m_pBlock(std::move(i_pBlock))
    , m_Grid{m_pBlock->GetShape().SamplePeriod, m_pBlock->GetShape().GridOffset,
             m_pBlock->GetShape().pLayout->ComponentCount}
{
}

TQL::TickRange VBlockSource::GetRange() const
{
    TQL::TickRange range;
    m_pBlock->GetRange(range);
    return range;
}

TQL::IResult VBlockSource::Read(const TQL::TickRange& i_rRange, std::span<float> o_Rows) const
{
    return m_pBlock->ReadSamples(i_rRange, o_Rows);
}

std::shared_ptr<const ISampleSource> SourceOf(const std::shared_ptr<ChannelSystem::IChannelBlock>& i_rpBlock)
{
    const auto pSamples = std::dynamic_pointer_cast<const VSampleBlock>(i_rpBlock);
    if (pSamples && pSamples->ShowsAll() && pSamples->GetFeed())
        if (auto pSource = pSamples->GetFeed()->GetPlainSource())
            return pSource;
    return std::make_shared<VBlockSource>(i_rpBlock);
}

} // namespace Channels
