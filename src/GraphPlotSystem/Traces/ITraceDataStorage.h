#pragma once

#include "GraphPlotSystem/Traces/ITraceDataProvider.h"
#include "TQL/IMultiCallback.h"
#include "TQL/ITick.h"

#include <functional>
#include <memory>
#include <vector>

namespace ChannelSystem
{
class IChannelBlock;
}

namespace TQL
{

/// The plotted data of one window as those see them who fill and watch them. Thread-safe. The four signals are raised
/// without any lock held; their default postal service is that of the user interface.
class ITraceDataStorage : public ITraceDataProvider
{
public:
    using ChannelPredicate = std::function<bool(const IChannelInstanceId&)>;

    virtual void SetInspectedTraces(IResult& o_rResult, std::span<const ITraceId> i_Traces) = 0;
    virtual void RemoveInspectedTraces(IResult& o_rResult, std::span<const ITraceId> i_Traces) = 0;
    virtual void ClearInspectedTraces() = 0;
    /// Frames relative to the base tick that InspectTrace gets. NaN is ignored, a time beyond the clock is its end.
    virtual void SetInspectionTime(double i_Frames) = 0;
    /// InvalidArgument when the counts differ. Progress is 0..1: how much of the windows has been read.
    virtual void GetInspectionValues(IResult& o_rResult, std::span<const ITraceId> i_Traces,
                                     std::span<GraphPlotUI::TraceInspectionValues> o_Values, float& o_rProgress) = 0;

    /// Brings the channel's ring to the requested ticks at a level of detail, reading only what it lacks. Nothing
    /// outside i_rLimit is read or kept.
    virtual void UpdateTrace(const IChannelInstanceId& i_rChannel, const ChannelSystem::IChannelBlock& i_rBlock,
                             const TickRange& i_rRequested, const TickRange& i_rLimit, std::uint8_t i_Level) = 0;
    virtual void InspectTrace(const IChannelInstanceId& i_rChannel, const ChannelSystem::IChannelBlock& i_rBlock,
                              std::int64_t i_BaseTick, std::int64_t i_WindowSamples) = 0;
    virtual void RemoveTraces(const ChannelPredicate& i_rPredicate) = 0;
    virtual void RemoveTrace(const IChannelInstanceId& i_rChannel) = 0;
    virtual void Clear() = 0;

    virtual void SetTicksPerFrame(std::int64_t i_Ticks) = 0;
    virtual void SetLatestFrame(std::int64_t i_Frame) = 0;

    virtual void GetTraces(std::vector<ITraceId>& o_rTraces) const = 0; ///< sorted by channel, then component
    virtual std::size_t GetTraceCount() const = 0;
    /// The padded range of values of the given traces; (0, 1) where there are none.
    virtual void GetValueRange(GraphPlotUI::ValueRange& o_rRange, std::span<const ITraceId> i_Traces) const = 0;

    virtual std::shared_ptr<IChangeSignal> DataChanged() const = 0;
    virtual std::shared_ptr<IChangeSignal> ValueRangeChanged() const = 0;
    virtual std::shared_ptr<IChangeSignal> ColoursChanged() const = 0;
    virtual std::shared_ptr<IChangeSignal> InspectionChanged() const = 0;
};

} // namespace TQL
