#include "Channels/Contexts/VLiveMonitors.h"

#include <array>
#include <chrono>
#include <string>
#include <utility>

namespace Channels
{

namespace
{

std::shared_ptr<VLiveContext> MakeContext(const VLiveContext& i_rCapture, std::shared_ptr<VSubTypeTable> i_pSubTypes)
{
    VLiveContext::Options options;
    options.FramePeriod = i_rCapture.GetFramePeriod();
    options.FirstFrame = TQL::FloorDivide(i_rCapture.GetTickRange().Last, options.FramePeriod);
    return std::make_shared<VLiveContext>(std::string(GlobalContextName), std::move(i_pSubTypes), options);
}

VFrameRateMeter::Time Now()
{
    return std::chrono::duration_cast<VFrameRateMeter::Time>(std::chrono::steady_clock::now().time_since_epoch());
}

} // namespace

VLiveMonitors::VLiveMonitors(const VLiveContext& i_rCapture, std::shared_ptr<VSubTypeTable> i_pSubTypes,
                             double i_FramesPerSecond, Clock i_Clock)
    : m_Clock(i_Clock ? std::move(i_Clock) : Clock(Now))
    , m_pContext(MakeContext(i_rCapture, std::move(i_pSubTypes)))
    , m_RateChannel(AddMonitor(1, "Relative frame rate"))
    , m_ShareChannel(AddMonitor(2, "Channels with data"))
    , m_Rate(i_FramesPerSecond)
{
}

std::uint32_t VLiveMonitors::AddMonitor(std::uint64_t i_Number, const char* i_pName)
{
    ChannelDefinition definition;
    definition.TypeName = MonitorType;
    definition.First = i_Number;
    definition.Name = i_pName;
    std::uint32_t channel = 0;
    // The context is new and the numbers differ, so this does not fail.
    (void)m_pContext->AddChannel(definition, 0, channel);
    return channel;
}

void VLiveMonitors::OnFrames(std::int64_t i_FirstFrame, std::span<const float> i_Shares)
{
    const auto frames = static_cast<std::int64_t>(i_Shares.size());
    m_RateSamples.assign(i_Shares.size(), m_Rate.Add(frames, m_Clock()));
    const std::array<ChannelRows, 2> rows{{{m_RateChannel, m_RateSamples}, {m_ShareChannel, i_Shares}}};
    if (m_pContext->AppendFrames(i_FirstFrame, frames, rows).IsSuccess())
        return;
    m_pContext->Restart(i_FirstFrame); // the capture began anew, with frames that were there already
    (void)m_pContext->AppendFrames(i_FirstFrame, frames, rows);
}

} // namespace Channels
