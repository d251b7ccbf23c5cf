#include "Channels/Blocks/VChannelOutput.h"

#include <algorithm>
#include <utility>

namespace Channels
{

VChannelOutput::VChannelOutput(std::weak_ptr<TQL::IChannel> i_pChannel,
                               std::shared_ptr<ChannelSystem::IChannelBlock> i_pBlock,
                               TQL::ComponentDescription i_Description,
                               std::vector<std::shared_ptr<TQL::IChannelOutput>> i_Inputs,
                               std::shared_ptr<const VSampleStore> i_pSamples)
    : m_pChannel(std::move(i_pChannel))
    , m_pBlock(std::move(i_pBlock))
    , m_Inputs(std::move(i_Inputs))
    , m_pSamples(std::move(i_pSamples))
    , m_Description(std::move(i_Description))
    , m_Token(m_pSamples ? m_pSamples->GetToken() : 0)
{
}

std::shared_ptr<TQL::IChannelOutput> VChannelOutput::HandOut(std::shared_ptr<VChannelOutput> i_pOutput,
                                                             std::shared_ptr<TQL::IChannel> i_pChannel)
{
    if (!i_pOutput)
        return nullptr;
    // The channel keeps its output, so the output cannot keep the channel; a pointer to both can.
    VChannelOutput* pOutput = i_pOutput.get();
    const auto pBoth = std::make_shared<std::pair<std::shared_ptr<VChannelOutput>, std::shared_ptr<TQL::IChannel>>>(
        std::move(i_pOutput), std::move(i_pChannel));
    return std::shared_ptr<TQL::IChannelOutput>(pBoth, pOutput);
}

bool VChannelOutput::IsStale() const
{
    return m_bRetired.load(std::memory_order_acquire) || (m_pSamples && m_pSamples->GetToken() != m_Token) ||
           std::ranges::any_of(m_Inputs, [](const auto& i_rpInput) { return i_rpInput->IsStale(); });
}

} // namespace Channels
