#include "Bench.h"
#include "ChannelSystemSelection/VChannelSelectionManager.h"
#include "Channels/ChannelTypes.h"
#include "Channels/VChannelService.h"
#include "Channels/VRecordedContext.h"
#include "GraphPlotSystem/VActiveChannelBuilder.h"
#include "GraphPlotSystem/VActiveChannelModel.h"
#include "GraphPlotSystem/VBaseChannelTextProvider.h"
#include "NotificationSystem/VDispatchCollapsers.h"
#include "NotificationSystem/VSubscriptions.h"
#include "Services/VSelectionSource.h"

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

/// A recording in the host and a plot that follows what is selected of it.
class SelectedPlot
{
public:
    SelectedPlot()
    {
        const auto pContext =
            std::make_shared<Channels::VRecordedContext>("Take", m_pService->GetSubTypes(), MakeMarkers());
        m_pService->AddContext(pContext);
        for (const Channels::ChannelType& rType : Channels::GetChannelTypeTable())
            m_pManager->RegisterChannelType(rType.Name, rType.Kind, static_cast<std::uint32_t>(rType.Flags));
        m_pService->SetSelectionManager(m_pManager);
        for (const auto& rpChannel : *pContext->GetChannels())
            m_Items.push_back(*Channels::SelectionOfChannel(rpChannel->GetInstanceId()));
        m_pBuilder->SetContextName("Take");
        m_pBuilder->SetSelectedChannelType(std::string(Channels::LabelledReconstructionType));
        m_Subscriptions.Subscribe<void(bool)>(
            m_pManager->SelectionChanged(), [this](bool i_bForce) { m_pBuilder->Refresh(i_bForce); },
            NotificationSystem::MakeCollapserDontPost(m_pQueue));
    }

    /// Selects the first so many markers, until the last notice has been worked off.
    void Select(std::size_t i_Count)
    {
        m_pSource->Set({m_Items.begin(), m_Items.begin() + static_cast<std::ptrdiff_t>(i_Count)});
        m_pQueue->RunAll();
        if (m_Model.rowCount() != static_cast<int>(i_Count))
            throw std::runtime_error("selection bench: not every selected marker has become a row");
    }

    /// Seconds from the host's selection of so many markers to the rows, after none was selected.
    double MeasureSelect(std::size_t i_Count)
    {
        Select(0);
        m_pQueue->Longest = 0.0;
        return BestSeconds(1, [&] { Select(i_Count); });
    }

    double LongestJob() const { return m_pQueue->Longest; }

private:
    std::shared_ptr<TimedQueue> m_pQueue = std::make_shared<TimedQueue>();
    std::shared_ptr<Channels::VChannelService> m_pService = std::make_shared<Channels::VChannelService>();
    std::shared_ptr<Services::VSelectionSource> m_pSource = std::make_shared<Services::VSelectionSource>();
    std::shared_ptr<ChannelSystemSelection::VChannelSelectionManager> m_pManager =
        TQL::MakeShared<ChannelSystemSelection::VChannelSelectionManager>(m_pSource);
    std::shared_ptr<GraphPlotUI::VBaseChannelTextProvider> m_pTexts =
        std::make_shared<GraphPlotUI::VBaseChannelTextProvider>(m_pService, nullptr);
    GraphPlotUI::VActiveChannelModel m_Model{m_pQueue, m_pTexts, nullptr, nullptr};
    std::shared_ptr<GraphPlotUI::VActiveChannelBuilder> m_pBuilder =
        TQL::MakeShared<GraphPlotUI::VActiveChannelBuilder>(m_pQueue, m_pService, nullptr, &m_Model);
    NotificationSystem::VSubscriptions m_Subscriptions;
    std::vector<TQL::SelectionItem> m_Items;
};

} // namespace

void RunSelection(Table& o_rTable)
{
    SelectedPlot plot;
    double few = 1e300;
    double many = 1e300;
    double longest = 0.0;
    for (int i = 0; i < s_Repeats; ++i)
    {
        few = std::min(few, plot.MeasureSelect(s_Few));
        many = std::min(many, plot.MeasureSelect(s_Many));
        longest = std::max(longest, plot.LongestJob());
    }
    const double costOfFew = few * 1e6 / static_cast<double>(s_Few);
    const double costOfMany = many * 1e6 / static_cast<double>(s_Many);
    o_rTable.push_back({"500 markers from the host's selection to active channel rows, each", costOfMany, "us",
                        "each of 100 markers", costOfFew, costOfMany / costOfFew, EGoal::AtMost, 1.5});
    o_rTable.push_back({"longest job in the user interface while 500 markers are selected", longest * 1e3, "ms",
                        "a stall that an operator notices", 100.0, longest * 1e3 / 100.0, EGoal::AtMost, 1.0});
}

} // namespace Bench
