#include "Channels/Blocks/VCacheChannel.h"

#include "Channels/Blocks/VCacheFeed.h"
#include "Channels/Blocks/VSampleBlock.h"

#include <optional>
#include <utility>
#include <vector>

namespace Channels
{

VCacheChannel::VCacheChannel(TQL::IChannelInstanceId i_Id, std::shared_ptr<TQL::IChannel> i_pInput, bool i_bKeepAll)
    : m_Id(std::move(i_Id))
    , m_pInput(std::move(i_pInput))
    , m_pParameters(std::make_shared<VChannelParameters>(m_pInput->GetParameters()))
    , m_pWindow(i_bKeepAll ? nullptr : std::make_shared<BlockWindow>())
{
    m_pParameters->Define(VChannelParameters::CacheGroup, LevelsParameter, false, true);
    m_pParameters->Define(VChannelParameters::CacheGroup, UnwrapParameter, false, true);
    m_pParameters->Define(VChannelParameters::CacheGroup, RangeParameter, std::int64_t{0}, true);
}

void VCacheChannel::ConnectParameters()
{
    m_pParameters->OnChange(
        [pWeak = weak_from_this()]
        {
            if (const auto pSelf = pWeak.lock())
                pSelf->OnParameterChange();
        });
}

/// A new range moves the window of the block that is out there; the other two need another block.
void VCacheChannel::OnParameterChange()
{
    if (m_pWindow)
        m_pWindow->Ticks.store(m_pParameters->Get<std::int64_t>(RangeParameter), std::memory_order_relaxed);
    {
        const std::lock_guard lock(m_Mutex);
        if (!m_pOutput || (m_bLevels == m_pParameters->Get<bool>(LevelsParameter) &&
                           m_bUnwrap == m_pParameters->Get<bool>(UnwrapParameter)))
            return;
        m_pOutput->Retire();
        m_pOutput = nullptr;
    }
    m_pParameters->Notifier().Notify();
}

void VCacheChannel::GetDependentChannels(std::vector<std::shared_ptr<TQL::IChannel>>& o_rChannels) const
{
    o_rChannels.assign(1, m_pInput);
}

std::shared_ptr<TQL::IChannelOutput> VCacheChannel::GetOutput() const
{
    const auto pSelf = std::const_pointer_cast<VCacheChannel>(shared_from_this());
    const std::lock_guard lock(m_Mutex);
    m_bAsked = true;
    if (!m_pOutput || m_pOutput->IsStale())
    {
        m_bLevels = m_pParameters->Get<bool>(LevelsParameter);
        m_bUnwrap = m_pParameters->Get<bool>(UnwrapParameter);
        m_pOutput = MakeOutputLocked();
    }
    return VChannelOutput::HandOut(m_pOutput, pSelf);
}

std::shared_ptr<VSampleBlock> VCacheChannel::FindBlockLocked() const
{
    return m_pOutput ? std::dynamic_pointer_cast<VSampleBlock>(m_pOutput->GetBlock()) : nullptr;
}

bool VCacheChannel::IsReadEnough() const
{
    const std::lock_guard lock(m_Mutex);
    const std::shared_ptr<VSampleBlock> pBlock = FindBlockLocked();
    return m_bAsked && (!pBlock || pBlock->IsReadEnough());
}

void VCacheChannel::ForgetReads()
{
    const std::lock_guard lock(m_Mutex);
    if (const std::shared_ptr<VSampleBlock> pBlock = FindBlockLocked())
        pBlock->ForgetReads();
}

/// Null while the input has no data.
std::shared_ptr<VChannelOutput> VCacheChannel::MakeOutputLocked() const
{
    const std::shared_ptr<TQL::IChannelOutput> pInput = m_pInput->GetOutput();
    const std::shared_ptr<ChannelSystem::IChannelBlock> pInputBlock = pInput ? pInput->GetBlock() : nullptr;
    if (!pInputBlock)
        return nullptr;
    std::optional<RotationPart> rotation;
    if (m_bUnwrap)
        rotation = FindRotation(pInput->GetDescription());
    const auto pInputSamples = std::dynamic_pointer_cast<VSampleBlock>(pInputBlock);
    const bool bAll = pInputSamples && pInputSamples->ShowsAll();
    // What is computed from samples that grow is kept for the window only, never for all the time that they have.
    const bool bShared = !rotation && bAll && !(m_pWindow && pInputSamples->GetFeed());
    const auto makeFeed = [&]
    {
        return rotation && bAll && !m_pWindow
                   ? pInputSamples->GetContinuous(*rotation)
                   : std::make_shared<VCacheFeed>(SourceOf(pInputBlock), rotation, m_pWindow);
    };
    const std::shared_ptr<VCacheFeed> pFeed = bShared ? pInputSamples->GetFeed() : makeFeed();
    const std::shared_ptr<VSampleStore>& rpSamples = bShared ? pInputSamples->GetSamples() : pFeed->GetSamples();
    if (m_bLevels)
        rpSamples->EnableSummaries();
    if (pFeed)
        pFeed->CatchUpByStep(); // before the output notes what contents it stands for
    const std::uint32_t levels = m_bLevels ? VSummaryPyramid::LevelCount : 1;
    const auto pBlock = std::make_shared<VSampleBlock>(rpSamples, levels, m_pWindow, pFeed, EFollow::ByStep);
    const auto pSelf = std::const_pointer_cast<VCacheChannel>(shared_from_this());
    return std::make_shared<VChannelOutput>(pSelf, pBlock, pInput->GetDescription(),
                                            std::vector<std::shared_ptr<TQL::IChannelOutput>>{pInput}, rpSamples);
}

} // namespace Channels
