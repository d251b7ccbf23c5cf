#include "Channels/Contexts/VLiveContext.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <utility>
#include <vector>

namespace Channels
{

namespace
{

/// What a value costs while it is kept: itself, and its share of the summary levels if it is plotted.
constexpr std::int64_t BytesPerValue = 6;

/// A channel that has come so often is taken to come with every frame.
constexpr int FewestBatches = 2;

/// Trimming gives memory back by the chunk, so it is not tried more often than every so many frames.
constexpr std::int64_t TrimStep = 256;

/// Adds 1 to each frame in whose first row there is a sample.
void CountSamples(const ChannelRows& i_rRows, std::size_t i_Components, std::int64_t i_RowsPerFrame,
                  std::span<float> io_Counts)
{
    const std::size_t stride = i_rRows.Stride == 0 ? i_Components : i_rRows.Stride;
    const std::size_t step = stride * static_cast<std::size_t>(i_RowsPerFrame);
    for (std::size_t frame = 0; frame < io_Counts.size(); ++frame)
        io_Counts[frame] += std::isnan(i_rRows.Values[frame * step]) ? 0.0f : 1.0f;
}

} // namespace

VLiveContext::VLiveContext(std::string i_Name, std::shared_ptr<VSubTypeTable> i_pSubTypes, const Options& i_rOptions)
    : VChannelContext(std::move(i_Name), ChannelSystem::EContextType::Live, i_rOptions.FramePeriod,
                      std::move(i_pSubTypes))
    , m_Options(i_rOptions)
    , m_StartFrame(i_rOptions.FirstFrame)
    , m_EndFrame(i_rOptions.FirstFrame)
    , m_TrimFrame(i_rOptions.FirstFrame)
    , m_HistoryFrames(0)
{
    UpdateHistoryLocked();
    SetRangeLocked();
}

TQL::IResult VLiveContext::AddChannel(const ChannelDefinition& i_rDefinition, std::int64_t i_SamplePeriod,
                                      std::uint32_t& o_rChannel)
{
    const std::int64_t framePeriod = m_Options.FramePeriod;
    const std::int64_t period = i_SamplePeriod == 0 ? framePeriod : i_SamplePeriod;
    if (period < 0 || framePeriod % period != 0)
        return TQL::Result::InvalidArgument;
    if (!FindChannelType(i_rDefinition.TypeName))
        return TQL::Result::InvalidType;
    const auto components = static_cast<std::uint32_t>(ComponentNamesOf(i_rDefinition).size());
    const std::lock_guard lock(m_ProducerMutex);
    auto pSamples = std::make_shared<VSampleStore>(period, m_EndFrame * framePeriod, components);
    const bool bMeasured = FindChannelType(i_rDefinition.TypeName)->RecordedKind.has_value();
    Inlet inlet{nullptr, framePeriod / period, m_EndFrame, false, bMeasured};
    const TQL::IResult result = VChannelContext::AddChannel(i_rDefinition, std::move(pSamples), inlet.pChannel);
    if (result.IsError())
        return result;
    o_rChannel = static_cast<std::uint32_t>(m_Inlets.size());
    m_Inlets.push_back(std::move(inlet));
    m_Appeared.reserve(m_Inlets.size());
    UpdateHistoryLocked();
    return TQL::Result::Ok;
}

TQL::IResult VLiveContext::CheckLocked(std::int64_t i_FirstFrame, std::int64_t i_FrameCount,
                                       std::span<const ChannelRows> i_Rows) const
{
    if (i_FirstFrame < m_EndFrame || i_FrameCount <= 0)
        return TQL::Result::InvalidArgument;
    for (const ChannelRows& rRows : i_Rows)
    {
        if (rRows.Channel >= m_Inlets.size())
            return TQL::Result::InvalidArgument;
        const Inlet& rInlet = m_Inlets[rRows.Channel];
        const std::size_t components = rInlet.pChannel->GetSamples()->Components();
        const std::size_t stride = rRows.Stride == 0 ? components : rRows.Stride;
        const auto rows = static_cast<std::size_t>(i_FrameCount * rInlet.RowsPerFrame);
        const std::size_t needed = (rows - 1) * stride + components;
        // A slice of a larger array may go on to the end of its last stride.
        if (stride < components || rRows.Values.size() < needed || rRows.Values.size() > rows * stride)
            return TQL::Result::InvalidArgument;
    }
    return TQL::Result::Ok;
}

TQL::IResult VLiveContext::AppendFrames(std::int64_t i_FirstFrame, std::int64_t i_FrameCount,
                                        std::span<const ChannelRows> i_Rows)
{
    std::shared_ptr<IFrameMeter> pMeter;
    std::vector<float> shares;
    {
        const std::lock_guard lock(m_ProducerMutex);
        if (const TQL::IResult result = CheckLocked(i_FirstFrame, i_FrameCount, i_Rows); result.IsError())
            return result;
        if (i_FirstFrame - m_EndFrame > GetHistoryFrames())
            RestartLocked(i_FirstFrame);
        pMeter = m_pMeter;
        if (pMeter)
            shares.assign(static_cast<std::size_t>(i_FrameCount), 0.0f);
        AppendLocked(i_FirstFrame, i_FrameCount, i_Rows, shares);
        TrimLocked();
        SetRangeLocked();
    }
    NotifyAppeared();
    InvokeRangeChanged();
    if (pMeter)
        pMeter->OnFrames(i_FirstFrame, shares);
    return TQL::Result::Ok;
}

/// The shares are empty, or begin at 0 and there is one for each frame.
void VLiveContext::AppendLocked(std::int64_t i_FirstFrame, std::int64_t i_FrameCount,
                                std::span<const ChannelRows> i_Rows, std::span<float> io_Shares)
{
    bool bMoreSpeak = false;
    for (const ChannelRows& rRows : i_Rows)
    {
        Inlet& rInlet = m_Inlets[rRows.Channel];
        if (rInlet.EndFrame > i_FirstFrame) // named twice: the first one counts
            continue;
        FillUpLocked(rInlet, i_FirstFrame);
        rInlet.pChannel->GetSamples()->Append(rRows.Values, rRows.Stride);
        rInlet.EndFrame = i_FirstFrame + i_FrameCount;
        bMoreSpeak |= rInlet.Batches < FewestBatches && ++rInlet.Batches == FewestBatches;
        if (rInlet.bMeasured)
            CountSamples(rRows, rInlet.pChannel->GetSamples()->Components(), rInlet.RowsPerFrame, io_Shares);
    }
    if (bMoreSpeak)
        UpdateHistoryLocked();
    m_EndFrame = i_FirstFrame + i_FrameCount;
    for (Inlet& rInlet : m_Inlets)
    {
        FillUpLocked(rInlet, m_EndFrame);
        if (!std::exchange(rInlet.bHasData, true))
            m_Appeared.push_back(rInlet.pChannel);
    }
    const auto measured = static_cast<float>(std::ranges::count(m_Inlets, true, &Inlet::bMeasured));
    for (float& rShare : io_Shares)
        rShare = measured == 0.0f ? std::numeric_limits<float>::quiet_NaN() : rShare / measured;
}

/// Missing samples up to a frame.
void VLiveContext::FillUpLocked(Inlet& io_rInlet, std::int64_t i_EndFrame)
{
    if (io_rInlet.EndFrame >= i_EndFrame)
        return;
    io_rInlet.pChannel->GetSamples()->AppendMissing((i_EndFrame - io_rInlet.EndFrame) * io_rInlet.RowsPerFrame);
    io_rInlet.EndFrame = i_EndFrame;
}

/// Tells the subscribers of channels that had no data before. With no lock held.
void VLiveContext::NotifyAppeared()
{
    std::vector<std::shared_ptr<VSourceChannel>> appeared;
    {
        const std::lock_guard lock(m_ProducerMutex);
        if (m_Appeared.empty())
            return;
        appeared = m_Appeared;
        m_Appeared.clear();
    }
    for (const std::shared_ptr<VSourceChannel>& rpChannel : appeared)
        rpChannel->NotifyOutputChanged();
}

void VLiveContext::TrimLocked()
{
    if (m_EndFrame < m_TrimFrame)
        return;
    m_TrimFrame = m_EndFrame + TrimStep;
    const std::int64_t first = m_EndFrame - GetHistoryFrames();
    if (first <= m_StartFrame)
        return;
    m_StartFrame = first;
    SetRangeLocked(); // before the samples go: what the range says was there when it was said
    for (const Inlet& rInlet : m_Inlets)
        rInlet.pChannel->GetSamples()->TrimBefore(first * m_Options.FramePeriod);
}

void VLiveContext::UpdateHistoryLocked()
{
    std::int64_t bytesPerFrame = 1;
    for (const Inlet& rInlet : m_Inlets)
        if (rInlet.Batches >= FewestBatches)
            bytesPerFrame += rInlet.RowsPerFrame * rInlet.pChannel->GetSamples()->Components() * BytesPerValue;
    const std::int64_t affordable = static_cast<std::int64_t>(m_Options.MemoryLimitBytes) / bytesPerFrame;
    const std::int64_t wanted = m_Options.HistoryTicks / m_Options.FramePeriod;
    m_HistoryFrames.store(std::max(std::min(wanted, affordable), std::int64_t{1}), std::memory_order_relaxed);
}

void VLiveContext::SetMeter(std::shared_ptr<IFrameMeter> i_pMeter)
{
    const std::lock_guard lock(m_ProducerMutex);
    m_pMeter = std::move(i_pMeter);
}

void VLiveContext::Restart(std::int64_t i_FirstFrame)
{
    {
        const std::lock_guard lock(m_ProducerMutex);
        RestartLocked(i_FirstFrame);
        SetRangeLocked();
    }
    const std::shared_ptr<const ChannelList> pChannels = GetChannels();
    for (const std::shared_ptr<VSourceChannel>& rpChannel : *pChannels)
        rpChannel->NotifyOutputChanged();
    InvokeRangeChanged();
}

void VLiveContext::RestartLocked(std::int64_t i_FirstFrame)
{
    m_StartFrame = i_FirstFrame;
    m_EndFrame = i_FirstFrame;
    m_TrimFrame = i_FirstFrame;
    for (Inlet& rInlet : m_Inlets)
    {
        // A frame stands on the grid of every channel, so this does not fail.
        (void)rInlet.pChannel->GetSamples()->ReplaceAll(i_FirstFrame * m_Options.FramePeriod, {});
        rInlet.EndFrame = i_FirstFrame;
        rInlet.bHasData = false;
    }
}

void VLiveContext::SetRangeLocked()
{
    const std::lock_guard lock(m_RangeMutex);
    m_Range = {m_StartFrame * m_Options.FramePeriod, m_EndFrame * m_Options.FramePeriod};
}

TQL::TickRange VLiveContext::GetTickRange() const
{
    const std::lock_guard lock(m_RangeMutex);
    return m_Range;
}

} // namespace Channels
