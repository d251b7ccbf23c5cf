#pragma once

#include "ChannelSystem/IChannel.h"
#include "Channels/VSampleBlock.h"

#include <atomic>
#include <cstdint>
#include <memory>

namespace Channels
{

/// The data of a channel as long as they are the same series. The channel owns it; a pointer that the channel hands out
/// also keeps the channel, so whoever holds only the output still has both. Any thread.
class VChannelOutput : public TQL::IChannelOutput
{
public:
    /// i_pInput, the output that this one is made from, may be null.
    VChannelOutput(std::weak_ptr<TQL::IChannel> i_pChannel, std::shared_ptr<VSampleBlock> i_pBlock,
                   TQL::ComponentDescription i_Description, std::shared_ptr<TQL::IChannelOutput> i_pInput = nullptr);

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
    const std::shared_ptr<VSampleBlock> m_pBlock;
    const std::shared_ptr<TQL::IChannelOutput> m_pInput;
    const TQL::ComponentDescription m_Description;
    const std::uint64_t m_Token;
    std::atomic<bool> m_bRetired{false};
};

} // namespace Channels
