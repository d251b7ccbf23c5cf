#pragma once

#include "ChannelSystem/IChannel.h"
#include "Channels/Blocks/VChannelOutput.h"
#include "Channels/Common/VChannelParameters.h"

#include <memory>
#include <mutex>

namespace Channels
{

struct BlockWindow;
class VSampleBlock;

/// The channel that keeps what a reader wants of its input: with summary levels ("SupportLodding"), with rotations made
/// continuous ("EnableRotationUnwrapping"), at least the newest "CacheRangeTicks" ticks (0, or an input that does not
/// grow: everything). Where nothing has to be altered it reads the store of its input; else it has one of its own,
/// which follows the input by steps, one whenever it is asked for its range, so that no reader waits for a long series.
/// Each reader makes one of its own. Any thread.
class VCacheChannel : public TQL::IChannel, public std::enable_shared_from_this<VCacheChannel>
{
public:
    static constexpr std::string_view Operation = "Cache";
    static constexpr std::string_view LevelsParameter = "SupportLodding";
    static constexpr std::string_view UnwrapParameter = "EnableRotationUnwrapping";
    static constexpr std::string_view RangeParameter = "CacheRangeTicks";

    /// i_bKeepAll: the input does not grow, so all of it is kept whatever the range says.
    VCacheChannel(TQL::IChannelInstanceId i_Id, std::shared_ptr<TQL::IChannel> i_pInput, bool i_bKeepAll);

    /// Has to be called once, when a shared pointer owns the channel.
    void ConnectParameters();

    /// Whether the reader has read what it wants (see VSampleBlock::IsReadEnough). False before it asked for anything.
    bool IsReadEnough() const;
    void ForgetReads();

    // IChannel
    std::shared_ptr<TQL::IChannelParameters> GetParameters() const override { return m_pParameters; }
    void GetDependentChannels(std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) const override;
    std::shared_ptr<TQL::IChannelOutput> GetOutput() const override;
    TQL::ComponentDescription GetDescription() const override { return m_pInput->GetDescription(); }
    const TQL::IChannelInstanceId& GetInstanceId() const override { return m_Id; }
    std::uint64_t GetRevision() const override { return m_pInput->GetRevision(); }

private:
    void OnParameterChange();
    std::shared_ptr<VChannelOutput> MakeOutputLocked() const;
    std::shared_ptr<VSampleBlock> FindBlockLocked() const;

    const TQL::IChannelInstanceId m_Id;
    const std::shared_ptr<TQL::IChannel> m_pInput;
    const std::shared_ptr<VChannelParameters> m_pParameters;
    const std::shared_ptr<BlockWindow> m_pWindow; // null when everything is kept
    mutable std::mutex m_Mutex;
    mutable std::shared_ptr<VChannelOutput> m_pOutput; // guarded by m_Mutex
    mutable bool m_bLevels = false;                    // guarded by m_Mutex: as m_pOutput was made
    mutable bool m_bUnwrap = false;                    // guarded by m_Mutex: the same
    mutable bool m_bAsked = false;                     // guarded by m_Mutex: for its output
};

} // namespace Channels
