#include "Bench.h"
#include "ChannelSystem/IChannel.h"
#include "ChannelSystem/IChannelBlock.h"
#include "ChannelSystemSelection/VChannelSelectionManager.h"
#include "Channels/Common/ChannelTypes.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "GraphPlotSystem/Channels/VActiveChannelBuilder.h"
#include "GraphPlotSystem/Channels/VActiveChannelModel.h"
#include "GraphPlotSystem/Common/SharedObject.h"
#include "GraphPlotSystem/Subplots/VKeyModel.h"
#include "GraphPlotSystem/Subplots/VSubplotManager.h"
#include "GraphPlotSystem/Subplots/VSubplotModel.h"
#include "GraphPlotSystem/Subplots/VTraceModel.h"
#include "GraphPlotSystem/Texts/VBaseChannelTextProvider.h"
#include "GraphPlotSystem/Texts/VChannelComponentControls.h"
#include "GraphPlotSystem/Traces/VTraceDataProvider.h"
#include "GraphPlotSystem/Traces/VTraceManager.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "NotificationSystem/VSubscriptions.h"
#include "Services/Selection/VSelectionSource.h"

#include <cmath>
#include <deque>
#include <stdexcept>

namespace Bench
{
namespace
{

constexpr std::size_t s_Few = 100;
constexpr std::size_t s_Many = 500;
constexpr std::size_t s_Frames = 1200;
constexpr int s_Repeats = 15;

/// Stands for the user interface's queue and keeps the time of the longest job.
class TimedQueue : public TQL::IPostalService
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
            Longest = std::max(Longest, BestSeconds(1, m_Jobs.front()));
    }

    double Longest = 0.0;

private:
    std::deque<Job> m_Jobs;
};

std::shared_ptr<Recordings::VRecording> MakeMarkers()
{
    auto pRecording = std::make_shared<Recordings::VRecording>();
    pRecording->Range = {0, static_cast<std::int64_t>(s_Frames) * pRecording->FramePeriod};
    for (std::size_t i = 0; i < s_Many; ++i)
    {
        Recordings::RecordedChannel channel;
        channel.Kind = Recordings::EChannelKind::Marker;
        channel.Name = "Marker " + std::to_string(i * 7919 % s_Many); // not in the order of the names
        channel.ComponentNames = {"X", "Y", "Z"};
        channel.Units = "mm";
        channel.Rate = 120.0;
        channel.SamplePeriod = Recordings::PeriodOfRate(channel.Rate);
        channel.Samples.resize(s_Frames * 3);
        for (std::size_t n = 0; n < channel.Samples.size(); ++n)
            channel.Samples[n] = std::sin(0.01f * static_cast<float>(n + i));
        pRecording->Channels.push_back(std::move(channel));
    }
    return pRecording;
}

/// Has none.
class WithoutPreferences : public GraphPlotUI::IGraphPlotPreferences
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

/// A recording in the host, and what is selected of it.
struct Host
{
    Host()
    {
        const auto pContext =
            std::make_shared<Channels::VRecordedContext>("Take", pService->GetSubTypes(), MakeMarkers());
        pService->AddContext(pContext);
        for (const Channels::ChannelType& rType : Channels::GetChannelTypeTable())
            pManager->RegisterChannelType(rType.Name, rType.Kind, static_cast<std::uint32_t>(rType.Flags));
        pService->SetSelectionManager(pManager);
        for (const auto& rpChannel : *pContext->GetChannels())
            Items.push_back(*Channels::SelectionOfChannel(rpChannel->GetInstanceId()));
    }

    void Select(std::size_t i_Count)
    {
        pSource->Set({Items.begin(), Items.begin() + static_cast<std::ptrdiff_t>(i_Count)});
    }

    const std::shared_ptr<Channels::VChannelService> pService = std::make_shared<Channels::VChannelService>();
    const std::shared_ptr<Services::VSelectionSource> pSource = std::make_shared<Services::VSelectionSource>();
    const std::shared_ptr<ChannelSystemSelection::VChannelSelectionManager> pManager =
        TQL::MakeShared<ChannelSystemSelection::VChannelSelectionManager>(pSource);
    std::vector<TQL::SelectionItem> Items;
};

/// A plot that follows the selection down to subplots and key.
class SelectedPlot
{
public:
    explicit SelectedPlot(Host& i_rHost) : m_rHost(i_rHost)
    {
        m_pBuilder->SetContextName("Take");
        m_pBuilder->SetSelectedChannelType(std::string(Channels::LabelledReconstructionType));
        m_Subscriptions.Subscribe<void(bool)>(
            i_rHost.pManager->SelectionChanged(), [this](bool i_bForce) { m_pBuilder->Refresh(i_bForce); },
            NotificationSystem::MakeCollapserDontPost(m_pQueue));
        m_pQueue->RunAll();
        m_pQueue->Longest = 0.0;
    }

    /// Seconds until the last notice of the selection has been worked off.
    double MeasureRows(std::size_t i_Count)
    {
        const double seconds = BestSeconds(1,
                                           [&]
                                           {
                                               m_rHost.Select(i_Count);
                                               m_pQueue->RunAll();
                                           });
        Require(m_Model.rowCount() == static_cast<int>(i_Count), "not every selected marker has become a row");
        return seconds;
    }

    /// Seconds that the update loop's first tick takes.
    double MeasureTraces()
    {
        return BestSeconds(1,
                           [&]
                           {
                               for (const auto& rpChannel : m_Model.GetChannels())
                               {
                                   const auto pBlock = rpChannel->GetOutput()->GetBlock();
                                   TQL::TickRange range;
                                   pBlock->GetRange(range);
                                   m_pStorage->UpdateTrace(rpChannel->GetInstanceId(), *pBlock, range, range, 0);
                               }
                           });
    }

    /// Seconds in which the user interface takes the new traces.
    double MeasureSubplots(std::size_t i_Count)
    {
        const double seconds = BestSeconds(1, [&] { m_pQueue->RunAll(); });
        const GraphPlotUI::VSubplotModel& rSubplots = *m_pManager->GetSubplotModel();
        Require(rSubplots.rowCount() == 3, "the three components have not three subplots");
        const auto* const pTraces = static_cast<GraphPlotUI::VTraceModel*>(
            rSubplots.index(0).data(TQL::SubplotModelRoles::SubplotTraceModel).value<QObject*>());
        Require(pTraces->rowCount() == static_cast<int>(i_Count), "not every selected marker has a trace");
        Require(m_Key.rowCount() == 3 * static_cast<int>(i_Count), "not every trace is in the key");
        return seconds;
    }

    double LongestJob() const { return m_pQueue->Longest; }

private:
    static void Require(bool i_bHolds, const char* i_pWhatElse)
    {
        if (!i_bHolds)
            throw std::runtime_error(std::string("selection bench: ") + i_pWhatElse);
    }

    Host& m_rHost;
    const std::shared_ptr<TimedQueue> m_pQueue = std::make_shared<TimedQueue>();
    const std::shared_ptr<GraphPlotUI::VBaseChannelTextProvider> m_pTexts =
        std::make_shared<GraphPlotUI::VBaseChannelTextProvider>(m_rHost.pService, m_pQueue);
    const std::shared_ptr<GraphPlotUI::VChannelComponentControls> m_pControls =
        std::make_shared<GraphPlotUI::VChannelComponentControls>(m_pTexts, m_pQueue);
    const std::shared_ptr<GraphPlotUI::VTraceDataProvider> m_pStorage =
        std::make_shared<GraphPlotUI::VTraceDataProvider>(m_pQueue);
    GraphPlotUI::VActiveChannelModel m_Model{m_pQueue, m_pTexts, nullptr, nullptr};
    GraphPlotUI::VKeyModel m_Key{m_pQueue, m_pTexts, m_pControls, m_pStorage, &m_Model, nullptr};
    const std::shared_ptr<GraphPlotUI::VSubplotManager> m_pManager =
        GraphPlotUI::MakeSharedObject<GraphPlotUI::VSubplotManager>(m_pQueue, &m_Model, m_pTexts, m_pControls, nullptr,
                                                                    m_pStorage, std::make_shared<WithoutPreferences>(),
                                                                    false);
    const std::shared_ptr<GraphPlotUI::VActiveChannelBuilder> m_pBuilder =
        TQL::MakeShared<GraphPlotUI::VActiveChannelBuilder>(m_pQueue, m_rHost.pService, nullptr, &m_Model);
    NotificationSystem::VSubscriptions m_Subscriptions;
};

/// Seconds of the parts of one selection, the shortest of several.
struct SelectionTimes
{
    void Measure(Host& i_rHost, std::size_t i_Count)
    {
        i_rHost.Select(0);
        SelectedPlot plot(i_rHost);
        const double rows = plot.MeasureRows(i_Count);
        const double traces = plot.MeasureTraces();
        const double subplots = plot.MeasureSubplots(i_Count);
        Rows = std::min(Rows, rows);
        All = std::min(All, rows + traces + subplots);
        LongestJob = std::max(LongestJob, plot.LongestJob());
    }

    double Rows = 1e300;     ///< from the selection to rows of channels
    double All = 1e300;      ///< and on to traces, subplots and key
    double LongestJob = 0.0; ///< in the user interface, of all repeats
};

double EachIn(double i_Seconds, std::size_t i_Count)
{
    return i_Seconds * 1e6 / static_cast<double>(i_Count);
}

} // namespace

void RunSelection(Table& o_rTable)
{
    Host host;
    SelectionTimes few;
    SelectionTimes many;
    for (int i = 0; i < s_Repeats; ++i)
    {
        few.Measure(host, s_Few);
        many.Measure(host, s_Many);
    }
    const auto compare = [&](const char* i_pName, double SelectionTimes::*i_pPart)
    {
        const double costOfMany = EachIn(many.*i_pPart, s_Many);
        const double costOfFew = EachIn(few.*i_pPart, s_Few);
        o_rTable.push_back(
            {i_pName, costOfMany, "us", "each of 100 markers", costOfFew, costOfMany / costOfFew, EGoal::AtMost, 1.5});
    };
    compare("500 markers from the host's selection to active channel rows, each", &SelectionTimes::Rows);
    compare("and on to traces, subplot rows and key rows, each", &SelectionTimes::All);
    const double longest = many.LongestJob;
    o_rTable.push_back({"longest job in the user interface while 500 markers are selected", longest * 1e3, "ms",
                        "a stall that an operator notices", 100.0, longest * 1e3 / 100.0, EGoal::AtMost, 1.0});
}

} // namespace Bench
