#pragma once

#include "ChannelSystem/IChannel.h"
#include "Channels/Samples/VSampleStore.h"

#include <atomic>
#include <cstdint>
#include <memory>
#include <vector>

namespace Channels
{

/// The data of a channel as long as they are the same series. The channel owns it; a pointer that the channel hands out
/// also keeps the channel, so whoever holds only the output still has both. Any thread.
class VChannelOutput : public TQL::IChannelOutput
{
public:
    /// i_Inputs are the outputs that this one is made from. New contents of i_pSamples, which may be null, make it
    /// stale, and so does an input that is.
    VChannelOutput(std::weak_ptr<TQL::IChannel> i_pChannel, std::shared_ptr<ChannelSystem::IChannelBlock> i_pBlock,
                   TQL::ComponentDescription i_Description, std::vector<std::shared_ptr<TQL::IChannelOutput>> i_Inputs,
                   std::shared_ptr<const VSampleStore> i_pSamples);

    /// Stale from now on.
    void Retire() { m_bRetired.store(true, std::memory_order_release); }

    /// A pointer to i_pOutput that keeps i_pChannel as well. Null for null.
    static std::shared_ptr<TQL::IChannelOutput> HandOut(std::shared_ptr<VChannelOutput> i_pOutput,
                                                        std::shared_ptr<TQL::IChannel> i_pChannel);

    // IChannelOutput
    std::shared_ptr<TQL::IChannel> GetChannel() const override { return m_pChannel.lock(); }
    bool IsStale() const override;
    std::shared_ptr<ChannelSystem::IChannelBlock> GetBlock() const override { return m_pBlock; }
    TQL::ComponentDescription GetDescription() const override { return m_Description; }

private:
    const std::weak_ptr<TQL::IChannel> m_pChannel;
    const std::shared_ptr<ChannelSystem::IChannelBlock> m_pBlock;
    const std::vector<std::shared_ptr<TQL::IChannelOutput>> m_Inputs;
    const std::shared_ptr<const VSampleStore> m_pSamples;
    const TQL::ComponentDescription m_Description;
    const std::uint64_t m_Token;
    std::atomic<bool> m_bRetired{false};
};

} // namespace Channels
