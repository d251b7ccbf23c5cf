#pragma once

#include "GraphPlotSystem/Traces/RollingStatistics.h"
#include "GraphPlotSystem/Traces/TraceRenderInfo.h"
#include "TQL/IResult.h"
#include "TQL/ITick.h"

#include <cstdint>
#include <limits>
#include <memory>
#include <optional>
#include <vector>

namespace ChannelSystem
{
class IChannelBlock;
}

namespace GraphPlotUI
{

/// Reads one component of a block. The range is made smaller until it lies on the block's sample grid; o_rSamples gets
/// its samples. OkButNoEffect for a range that is empty then, InvalidArgument for a component that the block lacks or
/// for ticks that it does not hold.
TQL::IResult ReadComponentRange(const ChannelSystem::IChannelBlock& i_rBlock, std::uint32_t i_Component,
                                TQL::TickRange& i_rRange, std::vector<float>& o_rSamples);

/// Tells of one trace the value at the inspected tick, and mean and standard deviation over the newest samples, which
/// it takes in at most one second of data a call. Owned by the trace data provider, used under its mutex.
class VTraceInspector
{
public:
    static constexpr std::int64_t TicksPerAdvance = TQL::DefaultTickRate; ///< one second

    /// Reads the sample nearest to i_Tick, unless it has that already. True when it has a new one. A tick that lies
    /// half-way between two samples, or where the block has none, leaves the value as it was.
    bool UpdateValue(const ChannelSystem::IChannelBlock& i_rBlock, std::uint32_t i_Component, std::int64_t i_Tick,
                     std::vector<float>& i_rScratch);

    /// Takes in the samples that follow those already seen. Starts anew with another window size (in samples, at least
    /// 1), when the data went back or begin earlier than before, and after a hole. True when anything was read. Throws
    /// std::length_error for an impossible window size, and is as before then.
    bool UpdateWindow(const ChannelSystem::IChannelBlock& i_rBlock, std::uint32_t i_Component,
                      std::int64_t i_WindowSamples, std::vector<float>& i_rScratch);

    TraceInspectionValues Values() const { return {m_Value, m_Mean, m_StandardDeviation, true}; }

    /// How much of the window has been taken in; 1 where there is nothing to wait for.
    double Progress() const;

private:
    static constexpr float NoNumber = std::numeric_limits<float>::quiet_NaN();

    float m_Value = NoNumber;
    float m_Mean = NoNumber;
    float m_StandardDeviation = NoNumber;
    TQL::TickRange m_Window; ///< ticks taken in so far
    std::int64_t m_Span = 0; ///< ticks there were to take in, at the last read
    std::optional<std::int64_t> m_ValueTick;
    std::unique_ptr<RollingStatistics> m_pStatistics;
    std::int64_t m_WindowSamples = 0; ///< what the statistics were made for
};

} // namespace GraphPlotUI
