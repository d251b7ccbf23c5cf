#include "Bench.h"
#include "ChannelSystem/IChannelBlock.h"
#include "Channels/Contexts/VLiveContext.h"
#include "Channels/VChannelService.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Common/SharedObject.h"
#include "GraphPlotSystem/Subplots/VSubplotManager.h"
#include "GraphPlotSystem/Subplots/VSubplotModel.h"
#include "GraphPlotSystem/Texts/VBaseChannelTextProvider.h"
#include "GraphPlotSystem/Texts/VChannelComponentControls.h"
#include "GraphPlotSystem/Traces/VTraceDataProvider.h"
#include "GraphPlotSystem/Traces/VTraceManager.h"

#include <QtCore/QCoreApplication>
#include <QtCore/QEvent>

#include <cmath>
#include <deque>
#include <numeric>
#include <span>
#include <stdexcept>
#include <utility>

namespace Bench
{
namespace
{

constexpr std::int64_t s_FramesASecond = TQL::DefaultTickRate / TQL::DefaultFramePeriod;

void Require(TQL::IResult i_Result)
{
    if (i_Result.IsError())
        throw std::runtime_error("subplot bench: " + std::string(i_Result.Description()));
}

/// Channels of a live capture, each with its block.
class Capture
{
public:
    /// Samples come i_RateFactor times a frame.
    Capture(std::size_t i_Channels, std::size_t i_Components, std::int64_t i_RateFactor)
        : m_RowLength(i_Components * static_cast<std::size_t>(i_RateFactor))
    {
        pService->AddContext(m_pContext);
        for (std::size_t channel = 0; channel < i_Channels; ++channel)
        {
            // Components of their own make each channel a subtype of its own.
            Channels::ChannelDefinition definition;
            definition.TypeName = Channels::DeviceOutputType;
            definition.First = channel;
            definition.Name = "Output " + std::to_string(channel);
            definition.Units = "V";
            for (std::size_t component = 0; component < i_Components; ++component)
                definition.ComponentNames.push_back("c" + std::to_string(channel) + "." + std::to_string(component));
            std::uint32_t number = 0;
            Require(m_pContext->AddChannel(definition, TQL::DefaultFramePeriod / i_RateFactor, number));
            m_Rows.push_back({number, {}, 0});
        }
        AppendSecond();
        for (const auto& rpChannel : *m_pContext->GetChannels())
        {
            Channels.push_back(rpChannel);
            Blocks.push_back(rpChannel->GetOutput()->GetBlock());
        }
    }

    void AppendSecond()
    {
        const std::size_t length = m_RowLength * s_FramesASecond;
        m_Values.resize(m_Rows.size() * length);
        for (std::size_t i = 0; i < m_Values.size(); ++i)
            m_Values[i] = static_cast<float>(1000.0 * std::sin(0.01 * static_cast<double>(i + m_Offset)));
        m_Offset += m_Values.size();
        for (std::size_t channel = 0; channel < m_Rows.size(); ++channel)
            m_Rows[channel].Values = std::span(m_Values).subspan(channel * length, length);
        Require(m_pContext->AppendFrames(m_EndFrame, s_FramesASecond, m_Rows));
        m_EndFrame += s_FramesASecond;
    }

    /// Of the second appended last, one channel's after the other's.
    const std::vector<float>& LatestValues() const { return m_Values; }

    std::shared_ptr<Channels::VChannelService> pService = std::make_shared<Channels::VChannelService>();
    std::vector<std::shared_ptr<TQL::IChannel>> Channels;
    std::vector<std::shared_ptr<ChannelSystem::IChannelBlock>> Blocks;

private:
    static Channels::VLiveContext::Options ContextOptions()
    {
        Channels::VLiveContext::Options options;
        options.HistoryTicks = 60 * TQL::DefaultTickRate;
        return options;
    }

    const std::shared_ptr<Channels::VLiveContext> m_pContext =
        std::make_shared<Channels::VLiveContext>("Live", pService->GetSubTypes(), ContextOptions());
    const std::size_t m_RowLength;
    std::vector<Channels::ChannelRows> m_Rows;
    std::vector<float> m_Values;
    std::size_t m_Offset = 0;
    std::int64_t m_EndFrame = 0;
};

/// The mean and the variance of all samples so far, one by one.
struct Welford
{
    void Add(float i_Sample)
    {
        ++Count;
        const float distance = i_Sample - Mean;
        Mean += distance / static_cast<float>(Count);
        Sum += distance * (i_Sample - Mean);
    }

    std::int64_t Count = 0;
    float Mean = 0.0f;
    float Sum = 0.0f;
};

/// The samples stand one trace's after the other's.
void AddToEach(std::vector<Welford>& io_rStatistics, std::span<const float> i_Samples)
{
    const std::size_t length = i_Samples.size() / io_rStatistics.size();
    for (std::size_t i = 0; i < io_rStatistics.size(); ++i)
    {
        Welford trace = io_rStatistics[i];
        for (const float sample : i_Samples.subspan(i * length, length))
            trace.Add(sample);
        io_rStatistics[i] = trace;
    }
    Keep(io_rStatistics);
}

double MeanOfLast(const std::vector<float>& i_rSamples, std::int64_t i_Count)
{
    return std::accumulate(i_rSamples.end() - i_Count, i_rSamples.end(), 0.0) / static_cast<double>(i_Count);
}

void MeasureInspection(Table& o_rTable, const char* i_pName, std::int64_t i_RateFactor)
{
    constexpr std::size_t traces = 100;
    Capture capture(traces, 1, i_RateFactor);
    GraphPlotUI::VTraceDataProvider provider(nullptr);
    std::vector<TQL::ITraceId> ids;
    for (const auto& rpChannel : capture.Channels)
        ids.emplace_back(rpChannel->GetInstanceId(), std::uint8_t{0});
    TQL::IResult result;
    provider.SetInspectedTraces(result, ids);
    Require(result);
    const std::int64_t window = 10 * s_FramesASecond * i_RateFactor;
    const std::size_t length = capture.LatestValues().size() / traces;
    std::vector<Welford> statistics(traces);
    std::vector<float> history; // of the last trace
    double best = 1e300;
    double bestYardstick = 1e300;
    for (int second = 0; second < 40; ++second) // a quarter of them until the windows are full
    {
        const double seconds = BestSeconds(1,
                                           [&]
                                           {
                                               for (std::size_t i = 0; i < traces; ++i)
                                                   provider.InspectTrace(ids[i].Channel(), *capture.Blocks[i],
                                                                         second * TQL::DefaultTickRate, window);
                                           });
        const double yardstick = BestSeconds(1, [&] { AddToEach(statistics, capture.LatestValues()); });
        const std::vector<float>& rLatest = capture.LatestValues();
        history.insert(history.end(), rLatest.end() - static_cast<std::ptrdiff_t>(length), rLatest.end());
        if (second >= 10)
        {
            best = std::min(best, seconds);
            bestYardstick = std::min(bestYardstick, yardstick);
        }
        capture.AppendSecond();
    }
    std::vector<GraphPlotUI::TraceInspectionValues> values(traces);
    float progress = 0.0f;
    provider.GetInspectionValues(result, ids, values, progress);
    Require(result);
    if (!(std::abs(static_cast<double>(values.back().Mean) - MeanOfLast(history, window)) < 0.1))
        throw std::runtime_error("subplot bench: the windows were not read to their end");
    o_rTable.push_back({i_pName, best * 1e3, "ms", "Welford's mean and variance in a loop over the same samples",
                        bestYardstick * 1e3, best / bestYardstick, EGoal::AtMost, 2.0});
}

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

/// Has none.
class NoPreferences : public GraphPlotUI::IGraphPlotPreferences
{
public:
    TQL::IResult GetValue(int, Value&) const override { return TQL::Result::NotAvailable; }
    TQL::IResult SetValue(int, const Value&) override { return TQL::Result::NotAvailable; }
    TQL::IResult AddCallback(Token&, int, std::function<void()>, std::shared_ptr<TQL::IPostalService>) override
    {
        return TQL::Result::NotAvailable;
    }
    TQL::IResult RemoveCallback(int, Token) override { return TQL::Result::NotAvailable; }
};

/// A window with a thousand subplots of one trace each.
class SubplotWindow
{
public:
    SubplotWindow()
    {
        for (const auto& rpChannel : m_Capture.Channels)
            Require(m_pTexts->Update(rpChannel));
        Require(m_ActiveChannels.SetChannels(m_Capture.Channels));
        for (std::size_t i = 0; i < m_Capture.Channels.size(); ++i)
        {
            TQL::TickRange range;
            m_Capture.Blocks[i]->GetRange(range);
            m_pStorage->UpdateTrace(m_Capture.Channels[i]->GetInstanceId(), *m_Capture.Blocks[i], range, range, 0);
        }
    }

    /// Makes all subplots from nothing; they stay.
    void Rebuild()
    {
        m_pManager = GraphPlotUI::MakeSharedObject<GraphPlotUI::VSubplotManager>(
            m_pUi, &m_ActiveChannels, m_pTexts, m_pControls, nullptr, m_pStorage, std::make_shared<NoPreferences>(),
            false);
        m_pUi->RunAll();
        if (m_pManager->GetSubplotModel()->rowCount() != 1000)
            throw std::runtime_error("subplot bench: not every trace has a subplot");
    }
    void Drop()
    {
        m_pManager.reset();
        CleanUp();
    }

    void Switch(bool i_bEnabled)
    {
        const std::uint64_t subType = m_pTexts->GetSubTypeId(m_Capture.Channels[100]->GetInstanceId());
        Require(m_pControls->SetComponentEnabled(subType, 1, i_bEnabled));
        m_pUi->RunAll();
    }
    /// How many rows came or went since the last call.
    int RowsTouched() { return std::exchange(m_RowsTouched, 0); }
    void Watch()
    {
        const auto count = [this](const QModelIndex&, int i_First, int i_Last)
        {
            m_RowsTouched += i_Last - i_First + 1;
        };
        QObject::connect(m_pManager->GetSubplotModel(), &QAbstractItemModel::rowsInserted, count);
        QObject::connect(m_pManager->GetSubplotModel(), &QAbstractItemModel::rowsRemoved, count);
        QObject::connect(m_pManager->GetSubplotModel(), &QAbstractItemModel::modelReset,
                         [this] { m_RowsTouched += 1000; });
    }
    static void CleanUp() { QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete); }

private:
    Capture m_Capture{250, 4, 1};
    const std::shared_ptr<QueuePostalService> m_pUi = std::make_shared<QueuePostalService>();
    const std::shared_ptr<GraphPlotUI::VBaseChannelTextProvider> m_pTexts =
        std::make_shared<GraphPlotUI::VBaseChannelTextProvider>(m_Capture.pService, nullptr);
    const std::shared_ptr<GraphPlotUI::VChannelComponentControls> m_pControls =
        std::make_shared<GraphPlotUI::VChannelComponentControls>(m_pTexts, m_pUi);
    const std::shared_ptr<GraphPlotUI::VTraceDataProvider> m_pStorage =
        std::make_shared<GraphPlotUI::VTraceDataProvider>(m_pUi);
    GraphPlotUI::VActiveChannelModel m_ActiveChannels{m_pUi, m_pTexts, nullptr, nullptr};
    std::shared_ptr<GraphPlotUI::VSubplotManager> m_pManager;
    int m_RowsTouched = 0;
};

void MeasureSwitch(Table& o_rTable)
{
    SubplotWindow window;
    double full = 1e300;
    for (int i = 0; i < 10; ++i)
    {
        window.Drop();
        full = std::min(full, BestSeconds(1, [&] { window.Rebuild(); }));
    }
    window.Watch();
    double switched = 1e300;
    int touched = 0;
    for (int i = 0; i < 20; ++i)
    {
        switched = std::min(switched, BestSeconds(1, [&] { window.Switch(i % 2 != 0); }));
        touched = std::max(touched, window.RowsTouched());
        SubplotWindow::CleanUp();
    }
    o_rTable.push_back({"subplots of 1000 traces when one component is switched / all made anew", switched * 1e3, "ms",
                        "all made anew", full * 1e3, switched / full, EGoal::Report, 0.0});
    o_rTable.push_back({"rows that came or went then, the most", static_cast<double>(touched), "rows",
                        "that of the component", 1.0, static_cast<double>(touched), EGoal::AtMost, 1.0});
}

} // namespace

void RunSubplot(Table& o_rTable)
{
    MeasureInspection(o_rTable, "inspection of 100 traces, 1 s of 120 Hz samples a tick / Welford", 1);
    MeasureInspection(o_rTable, "the same at 1200 Hz", 10);
    MeasureSwitch(o_rTable);
}

} // namespace Bench
