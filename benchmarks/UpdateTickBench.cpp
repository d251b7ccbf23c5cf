#include "AllocationCounter.h"
#include "Bench.h"
#include "ChannelSystem/IChannelBlock.h"
#include "Channels/Contexts/VLiveContext.h"
#include "Channels/VChannelService.h"
#include "GraphPlotSystem/Texts/VBaseChannelTextProvider.h"
#include "GraphPlotSystem/Texts/VChannelComponentControls.h"
#include "GraphPlotSystem/Time/VBaseGraphPlotTime.h"
#include "GraphPlotSystem/Traces/VTraceDataProvider.h"
#include "GraphPlotSystem/Traces/VTraceDataUpdater.h"
#include "NotificationSystem/VDispatchCollapsers.h"

#include <algorithm>
#include <cmath>
#include <ctime>
#include <deque>
#include <numeric>
#include <stdexcept>

namespace Bench
{
namespace
{

constexpr std::size_t s_Channels = 1000;
constexpr std::size_t s_Components = 3;
constexpr double s_TickSeconds = 0.020;
constexpr int s_WarmUpTicks = 200;
constexpr int s_MeasuredTicks = 2000; // enough for the rings to wrap
constexpr TQL::FrameRange s_TenSeconds{-1200.0, 0.0};
constexpr int s_SubplotWidth = 1200;

class PlotTime : public GraphPlotUI::VBaseGraphPlotTime
{
public:
    PlotTime() : VBaseGraphPlotTime(nullptr) {}

    void SetActive(bool) override {}
    void SetPreferredSources(const std::set<std::string>&) override {}
    void SetCurrentTime(qlonglong) override {}
    void SetLatestFrame(std::int64_t i_Frame)
    {
        Values values = GetValues();
        values.LatestFrame = i_Frame;
        SetValues(values);
    }
};

struct ReadCount
{
    std::uint64_t SampleReads = 0;
    std::uint64_t SampleRows = 0;
    std::uint64_t OtherReads = 0;
};

/// Passes every read on and counts it.
class CountingBlock : public ChannelSystem::IChannelBlock
{
public:
    CountingBlock(const IChannelBlock& i_rBlock, ReadCount& o_rCount) : m_rBlock(i_rBlock), m_rCount(o_rCount) {}

    const ChannelSystem::ChannelBlockShape& GetShape() const override { return m_rBlock.GetShape(); }
    const std::shared_ptr<ChannelSystem::IChannelStore>& GetStore() const override { return m_rBlock.GetStore(); }
    void GetRange(TQL::TickRange& o_rRange) const override { m_rBlock.GetRange(o_rRange); }
    TQL::IResult ReadSamples(const TQL::TickRange& i_rRange, std::span<float> o_Samples,
                             std::uint32_t i_Flag) const override
    {
        ++m_rCount.SampleReads;
        m_rCount.SampleRows += o_Samples.size() / s_Components;
        return m_rBlock.ReadSamples(i_rRange, o_Samples, i_Flag);
    }
    std::size_t ReadSummary(const TQL::TickRange& i_rRange, std::uint32_t i_Level,
                            std::span<ChannelSystem::LodRecord> o_Records, std::uint32_t i_Flag) const override
    {
        ++m_rCount.OtherReads;
        return m_rBlock.ReadSummary(i_rRange, i_Level, o_Records, i_Flag);
    }
    TQL::IResult ReadComponent(const TQL::TickRange& i_rRange, std::span<float> o_Samples, std::uint32_t i_Component,
                               std::uint32_t i_Flag) const override
    {
        ++m_rCount.OtherReads;
        return m_rBlock.ReadComponent(i_rRange, o_Samples, i_Component, i_Flag);
    }
    TQL::IResult Summarise(const TQL::TickRange& i_rRange, std::span<ChannelSystem::LodRecord> o_Records) const override
    {
        return m_rBlock.Summarise(i_rRange, o_Records);
    }

private:
    const IChannelBlock& m_rBlock;
    ReadCount& m_rCount;
};

/// The provider itself; while it counts, it sees the blocks through a counting one.
class CountingProvider : public GraphPlotUI::VTraceDataProvider
{
public:
    CountingProvider() : VTraceDataProvider(nullptr) {}

    void UpdateTrace(const TQL::IChannelInstanceId& i_rChannel, const ChannelSystem::IChannelBlock& i_rBlock,
                     const TQL::TickRange& i_rRequested, const TQL::TickRange& i_rLimit, std::uint8_t i_Level) override
    {
        if (bCount)
            VTraceDataProvider::UpdateTrace(i_rChannel, CountingBlock(i_rBlock, Count), i_rRequested, i_rLimit,
                                            i_Level);
        else
            VTraceDataProvider::UpdateTrace(i_rChannel, i_rBlock, i_rRequested, i_rLimit, i_Level);
    }

    bool bCount = false;
    ReadCount Count;
};

/// Stands for the user interface's queue: takes jobs and runs them when told.
class QueuePostalService : public TQL::IPostalService
{
public:
    void Post(Job i_Job, std::uint64_t = 0) override { m_Jobs.push_back(std::move(i_Job)); }
    void GetDispatchTraits(TQL::DispatchTraits& o_rTraits) const override
    {
        o_rTraits = {TQL::DispatchTraits::KindSerial, TQL::DispatchTraits::FlagOrdered};
    }
    void RunAll()
    {
        for (; !m_Jobs.empty(); m_Jobs.pop_front())
            m_Jobs.front()();
    }

private:
    std::deque<Job> m_Jobs;
};

void Require(TQL::IResult i_Result)
{
    if (i_Result.IsError())
        throw std::runtime_error("update bench: " + std::string(i_Result.Description()));
}

/// A live capture of markers that swing, and a window that plots them all.
class LivePlot
{
public:
    LivePlot()
    {
        m_pService->AddContext(m_pContext);
        std::vector<std::shared_ptr<TQL::IChannel>> channels;
        GraphPlotUI::VTraceDataUpdater::IdSet ids;
        for (std::uint64_t marker = 0; marker < s_Channels; ++marker)
        {
            Channels::ChannelDefinition definition;
            definition.TypeName = Channels::LabelledReconstructionType;
            definition.First = 1;
            definition.Second = marker;
            definition.Name = std::to_string(marker);
            definition.Units = "mm";
            std::uint32_t number = 0;
            Require(m_pContext->AddChannel(definition, 0, number));
            m_Rows.push_back({number, {}, 0});
        }
        for (const auto& rpChannel : *m_pContext->GetChannels())
        {
            channels.push_back(rpChannel);
            ids.insert(rpChannel->GetInstanceId());
        }
        Append(1440);
        m_pUpdater->SetChannels(channels, ids);
    }

    /// Appends as many frames as come in 20 ms at 120 Hz: 2, 3, 2, 3, 2.
    void AppendTick()
    {
        Append(m_TickNumber % 5 % 2 == 0 ? 2 : 3);
        ++m_TickNumber;
    }

    void Update() { m_pUpdater->Update(true, s_TenSeconds, s_TenSeconds, s_SubplotWidth, TQL::DefaultFramePeriod); }

    CountingProvider& Provider() { return *m_pProvider; }
    GraphPlotUI::VTraceDataUpdater& Updater() { return *m_pUpdater; }

private:
    void Append(std::int64_t i_Frames)
    {
        m_Values.resize(s_Channels * s_Components * static_cast<std::size_t>(i_Frames));
        for (std::size_t i = 0; i < m_Values.size(); ++i)
        {
            const auto frame = static_cast<double>(m_EndFrame) +
                               static_cast<double>(i / s_Components % static_cast<std::size_t>(i_Frames));
            m_Values[i] = static_cast<float>(1000.0 * std::sin(0.05 * frame + 0.001 * static_cast<double>(i)));
        }
        const std::size_t length = s_Components * static_cast<std::size_t>(i_Frames);
        for (std::size_t channel = 0; channel < s_Channels; ++channel)
            m_Rows[channel].Values = std::span(m_Values).subspan(channel * length, length);
        Require(m_pContext->AppendFrames(m_EndFrame, i_Frames, m_Rows));
        m_EndFrame += i_Frames;
        m_pTime->SetLatestFrame(m_EndFrame - 1);
    }

    static Channels::VLiveContext::Options ContextOptions()
    {
        Channels::VLiveContext::Options options;
        options.HistoryTicks = 60 * TQL::DefaultTickRate;
        return options;
    }

    std::shared_ptr<Channels::VChannelService> m_pService = std::make_shared<Channels::VChannelService>();
    std::shared_ptr<Channels::VLiveContext> m_pContext =
        std::make_shared<Channels::VLiveContext>("Live", m_pService->GetSubTypes(), ContextOptions());
    std::shared_ptr<GraphPlotUI::VBaseChannelTextProvider> m_pTexts =
        std::make_shared<GraphPlotUI::VBaseChannelTextProvider>(m_pService, nullptr);
    std::shared_ptr<PlotTime> m_pTime = std::make_shared<PlotTime>();
    std::shared_ptr<CountingProvider> m_pProvider = std::make_shared<CountingProvider>();
    std::shared_ptr<GraphPlotUI::VTraceDataUpdater> m_pUpdater = TQL::MakeShared<GraphPlotUI::VTraceDataUpdater>(
        m_pService, m_pTexts, std::make_shared<GraphPlotUI::VChannelComponentControls>(m_pTexts, nullptr), m_pTime,
        m_pProvider);
    std::vector<Channels::ChannelRows> m_Rows;
    std::vector<float> m_Values;
    std::int64_t m_EndFrame = 0;
    int m_TickNumber = 0;
};

/// Seconds that one core works on a call of i_rFunction. Waiting for a busy machine does not count.
template <typename TFunction>
double CoreSeconds(const TFunction& i_rFunction)
{
    const std::clock_t start = std::clock();
    i_rFunction();
    return static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
}

/// Seconds of each measured tick, in ascending order, and the most allocations that one of them made.
std::pair<std::vector<double>, std::uint64_t> MeasureTicks(LivePlot& i_rPlot)
{
    std::vector<double> seconds;
    seconds.reserve(s_MeasuredTicks);
    std::uint64_t mostAllocations = 0;
    for (int tick = 0; tick < s_MeasuredTicks; ++tick)
    {
        i_rPlot.AppendTick();
        const std::uint64_t before = AllocationsOfThisThread();
        seconds.push_back(CoreSeconds([&] { i_rPlot.Update(); }));
        mostAllocations = std::max(mostAllocations, AllocationsOfThisThread() - before);
    }
    std::ranges::sort(seconds);
    return {seconds, mostAllocations};
}

/// The most sample reads that one tick made, a channel; also checks that only new rows were read.
double MostReadsOfATick(LivePlot& i_rPlot)
{
    CountingProvider& rProvider = i_rPlot.Provider();
    rProvider.bCount = true;
    std::uint64_t most = 0;
    for (int tick = 0; tick < 100; ++tick)
    {
        i_rPlot.AppendTick();
        rProvider.Count = {};
        i_rPlot.Update();
        if (rProvider.Count.SampleRows > 3 * s_Channels || rProvider.Count.OtherReads != 0)
            throw std::runtime_error("update bench: a steady tick reads more than its new rows");
        most = std::max(most, rProvider.Count.SampleReads);
    }
    rProvider.bCount = false;
    return static_cast<double>(most) / static_cast<double>(s_Channels);
}

/// Allocations of a tick when a trace manager listens to the cached range, as it does in a window.
double AllocationsWithAListener(LivePlot& i_rPlot)
{
    const auto pQueue = std::make_shared<QueuePostalService>();
    std::int64_t told = 0;
    i_rPlot.Updater().RangeChanged()->Add([&told](const TQL::TickRange& i_rRange) { Keep(told += i_rRange.Last); },
                                          NotificationSystem::MakeCollapserDontDispatch(pQueue));
    constexpr int ticks = 100;
    std::uint64_t allocations = 0;
    for (int tick = 0; tick < ticks; ++tick)
    {
        i_rPlot.AppendTick();
        const std::uint64_t before = AllocationsOfThisThread();
        i_rPlot.Update();
        allocations += AllocationsOfThisThread() - before;
        pQueue->RunAll();
    }
    return static_cast<double>(allocations) / ticks;
}

} // namespace

void RunUpdateTick(Table& o_rTable)
{
    LivePlot plot;
    for (int tick = 0; tick < s_WarmUpTicks; ++tick)
    {
        plot.AppendTick();
        plot.Update();
    }
    if (plot.Provider().GetTraceCount() != s_Channels * s_Components)
        throw std::runtime_error("update bench: not every trace is plotted");

    const auto [seconds, allocations] = MeasureTicks(plot);
    const double mean = std::accumulate(seconds.begin(), seconds.end(), 0.0) / static_cast<double>(seconds.size());
    const double rare = seconds[seconds.size() * 99 / 100];
    o_rTable.push_back({"update tick, 1000 channels x 3 live at 120 Hz, mean time of one core / tick", mean * 1e3, "ms",
                        "the 20 ms tick", s_TickSeconds * 1e3, mean / s_TickSeconds, EGoal::AtMost, 0.15});
    o_rTable.push_back({"the same, 99th percentile / tick", rare * 1e3, "ms", "the 20 ms tick", s_TickSeconds * 1e3,
                        rare / s_TickSeconds, EGoal::Report, 0.0});
    const double reads = MostReadsOfATick(plot);
    o_rTable.push_back({"ReadSamples calls a channel and tick, the most", reads, "calls", "one read of the new rows",
                        1.0, reads, EGoal::AtMost, 1.0});
    const auto most = static_cast<double>(allocations);
    o_rTable.push_back(
        {"allocations a tick after warm-up, the most", most, "calls", "none", 0.0, most, EGoal::AtMost, 0.0});
    const double listened = AllocationsWithAListener(plot);
    o_rTable.push_back({"the same, mean, with the notice of the cached range posted", listened, "calls", "none", 0.0,
                        listened, EGoal::Report, 0.0});
}

} // namespace Bench
