#include "GraphPlotSystem/Time/PlotTimeRules.h"

#include "TQL/ITick.h"

namespace GraphPlotUI
{

std::optional<PlotTimeSample> SamplePlotTime(const OrvanePluginInterface::TimeState& i_rState, bool i_bRelative)
{
    const std::int64_t period = i_rState.FramePeriodTicks;
    if (period <= 0)
        return std::nullopt;
    const std::int64_t first = TQL::FloorDivide(i_rState.FirstTick, period);
    PlotTimeSample sample;
    sample.FramePeriod = period;
    sample.LatestFrame = TQL::FloorDivide(i_rState.FirstTick + i_rState.LengthTicks - period, period);
    sample.CurrentTime = TQL::FloorDivide(i_rState.CurrentTick, period);
    if (i_bRelative)
    {
        sample.SessionRange = {static_cast<double>(-sample.LatestFrame), 0.0};
        sample.CurrentTime -= sample.LatestFrame;
    }
    else
    {
        sample.SessionRange = {static_cast<double>(first), static_cast<double>(sample.LatestFrame)};
    }
    return sample;
}

std::optional<std::int64_t> SeekTickOfFrame(const OrvanePluginInterface::TimeState& i_rState, std::int64_t i_Frame,
                                            bool i_bRelative)
{
    const auto sample = SamplePlotTime(i_rState, i_bRelative);
    if (!sample)
        return std::nullopt;
    return (i_bRelative ? i_Frame + sample->LatestFrame : i_Frame) * sample->FramePeriod;
}

} // namespace GraphPlotUI
