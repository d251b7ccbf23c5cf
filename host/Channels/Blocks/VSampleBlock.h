#pragma once

#include "ChannelSystem/IChannelBlock.h"
#include "Channels/Samples/VSampleStore.h"

#include <atomic>
#include <cstdint>
#include <memory>
#include <mutex>

namespace Channels
{

class VCacheFeed;
struct RotationPart;

/// How much of the newest samples a block shows; set by a parameter of the channel while others read.
struct BlockWindow
{
    std::atomic<std::int64_t> Ticks{0}; ///< 0: everything
};

/// How much a feed takes over when a block is asked for its range.
enum class EFollow
{
    Everything,
    ByStep ///< for a reader that asks again and again: the range grows until it has everything
};

/// A store as the readers of a channel see it: all of it, or the newest part that a window asks for. What GetRange has
/// reported can be read until it is asked again, although the window moves on with every sample. Any thread.
class VSampleBlock : public ChannelSystem::IChannelBlock, public std::enable_shared_from_this<VSampleBlock>
{
public:
    /// i_Levels is from 1 to VSummaryPyramid::LevelCount; above 1 the store has to keep summaries. i_pWindow and
    /// i_pFeed may be null; a feed is asked to follow its source before a range is reported.
    VSampleBlock(std::shared_ptr<VSampleStore> i_pSamples, std::uint32_t i_Levels,
                 std::shared_ptr<const BlockWindow> i_pWindow = nullptr, std::shared_ptr<VCacheFeed> i_pFeed = nullptr,
                 EFollow i_Follow = EFollow::Everything);

    const std::shared_ptr<VSampleStore>& GetSamples() const { return m_pSamples; }
    const std::shared_ptr<VCacheFeed>& GetFeed() const { return m_pFeed; } ///< null where the store fills itself
    /// The feed that keeps all of its samples with rotations made continuous: one for all who ask while one of them
    /// has it. The rotation is that of the channel whose block it is.
    std::shared_ptr<VCacheFeed> GetContinuous(const RotationPart& i_rRotation);
    bool ShowsAll() const { return m_pWindow == nullptr; }

    /// Whether a reader that looks again and again has read what it wants: there is nothing, or it has read, and then
    /// looked at the range some times without reading more. Since ForgetReads, if that was called.
    bool IsReadEnough() const;
    void ForgetReads() { m_LooksSinceRead.store(0, std::memory_order_relaxed); }

    // IChannelBlock
    const ChannelSystem::ChannelBlockShape& GetShape() const override { return m_Shape; }
    const std::shared_ptr<ChannelSystem::IChannelStore>& GetStore() const override { return m_pStore; }
    void GetRange(TQL::TickRange& o_rRange) const override;
    TQL::IResult ReadSamples(const TQL::TickRange& i_rRange, std::span<float> o_Samples,
                             std::uint32_t i_Flag = 0) const override;
    std::size_t ReadSummary(const TQL::TickRange& i_rRange, std::uint32_t i_Level, std::span<LodRecord> o_Records,
                            std::uint32_t i_Flag = 1) const override;
    TQL::IResult ReadComponent(const TQL::TickRange& i_rRange, std::span<float> o_Samples, std::uint32_t i_Component,
                               std::uint32_t i_Flag = 0) const override;
    TQL::IResult Summarise(const TQL::TickRange& i_rRange, std::span<LodRecord> o_Records) const override;

private:
    void Follow() const;
    void NoteRead() const;
    std::int64_t Floor() const;

    const std::shared_ptr<VSampleStore> m_pSamples;
    const std::shared_ptr<ChannelSystem::IChannelStore> m_pStore; // the same object
    const std::shared_ptr<const BlockWindow> m_pWindow;
    const std::shared_ptr<VCacheFeed> m_pFeed;
    const EFollow m_Follow;
    ChannelSystem::ChannelBlockShape m_Shape;
    mutable std::atomic<std::int64_t> m_ReportedFirst;
    mutable std::atomic<std::uint32_t> m_LooksSinceRead{0};
    mutable std::atomic<bool> m_bWasRead{false};
    std::mutex m_Mutex;
    std::weak_ptr<VCacheFeed> m_pContinuous; // guarded by m_Mutex
};

} // namespace Channels
