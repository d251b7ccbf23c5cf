#pragma once

#include "Channels/Contexts/VFrameRateMeter.h"
#include "Channels/Contexts/VLiveContext.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <span>
#include <vector>

namespace Channels
{

/// Monitors of a live capture, as global channels: how fast its frames come, and how many of its channels have samples.
/// It measures while frames come in, and keeps as much of it as the capture keeps. The capture holds it as its meter,
/// the channel service its channels; those stay when the capture has ended. Made on any thread.
class VLiveMonitors : public IFrameMeter
{
public:
    using Clock = std::function<VFrameRateMeter::Time()>;

    /// Begins behind the frames that the capture has, which should come i_FramesPerSecond in a second. Without a clock
    /// that of the machine.
    VLiveMonitors(const VLiveContext& i_rCapture, std::shared_ptr<VSubTypeTable> i_pSubTypes, double i_FramesPerSecond,
                  Clock i_Clock = {});

    const std::shared_ptr<VLiveContext>& GetContext() const { return m_pContext; }

    // IFrameMeter
    void OnFrames(std::int64_t i_FirstFrame, std::span<const float> i_Shares) override;

private:
    std::uint32_t AddMonitor(std::uint64_t i_Number, const char* i_pName);

    const Clock m_Clock;
    const std::shared_ptr<VLiveContext> m_pContext;
    const std::uint32_t m_RateChannel;
    const std::uint32_t m_ShareChannel;
    VFrameRateMeter m_Rate;           // the producer's
    std::vector<float> m_RateSamples; // the producer's
};

} // namespace Channels
