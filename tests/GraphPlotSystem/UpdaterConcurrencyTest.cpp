#include "GraphPlotSystem/FakeTraceWindow.h"
#include "GraphPlotSystem/Texts/VChannelComponentControls.h"
#include "GraphPlotSystem/Traces/VTraceDataUpdater.h"
#include "support/LogGuard.h"

#include <thread>

using namespace GraphPlotUI;

namespace
{

/// Counts instead of writing down, so that the threads meet in the updater and not in a journal.
class CountingStorage : public FakeTraceWindow::Storage
{
public:
    using Storage::Storage;

    void UpdateTrace(const TQL::IChannelInstanceId&, const ChannelSystem::IChannelBlock&, const TQL::TickRange&,
                     const TQL::TickRange&, std::uint8_t) override
    {
        ++Updates;
    }
    void InspectTrace(const TQL::IChannelInstanceId&, const ChannelSystem::IChannelBlock&, std::int64_t,
                      std::int64_t) override
    {
    }

    std::atomic<int> Updates{0};
};

} // namespace

// What the user interface does while the strand is at work: the thread sanitizer sees any unguarded member, and every
// channel is still plotted in the end.
TEST(UpdaterConcurrency, TheUserInterfaceWorksOnRecordsDuringUpdates)
{
    const TestSupport::LogGuard log;
    constexpr int rounds = 300;
    const auto pJournal = std::make_shared<FakeHost::Journal>();
    const auto pService = std::make_shared<FakeHost::Service>(pJournal);
    const auto pTexts = std::make_shared<FakeTraceWindow::TextProvider>(pService, nullptr);
    const auto pControls = std::make_shared<VChannelComponentControls>(pTexts, nullptr);
    const auto pTime = std::make_shared<FakeTraceWindow::PlotTime>(nullptr);
    const auto pStorage = std::make_shared<CountingStorage>(pJournal);
    const auto pUpdater = TQL::MakeShared<VTraceDataUpdater>(pService, pTexts, pControls, pTime, pStorage);

    std::vector<std::shared_ptr<TQL::IChannel>> channels;
    VTraceDataUpdater::IdSet ids;
    for (std::uint64_t i = 0; i < 8; ++i)
    {
        TQL::IChannelInstanceId id;
        id.First = i;
        auto pChannel = std::make_shared<FakeHost::Channel>(id);
        pChannel->Description.Groups.resize(3);
        pChannel->SetView(std::make_shared<FakeHost::Block>(TQL::DefaultFramePeriod, TQL::TickRange{0, 135'000'000}));
        channels.push_back(std::move(pChannel));
        ids.insert(id);
    }
    const std::vector<std::shared_ptr<TQL::IChannel>> half(channels.begin(), channels.begin() + 4);

    std::atomic<bool> bStop{false};
    std::atomic<int> reentered{0};
    const auto update = [&]
    {
        while (!bStop)
        {
            pUpdater->Update(true, {-120.0, 0.0}, {-1200.0, 0.0}, 500, TQL::DefaultFramePeriod);
            ++reentered;
        }
    };
    std::thread strand(update);
    std::thread intruder(update); // a second caller finds the flag set or waits: never two at a time
    for (int round = 0; round < rounds; ++round)
    {
        pUpdater->SetChannels(round % 2 == 0 ? channels : half, ids);
        pUpdater->SaveRecords();
        pUpdater->SetRotationUnwrapping(round % 3 == 0);
        (void)pUpdater->GetExportData();
        if (round % 5 == 0)
            pUpdater->Clear();
        pUpdater->RestoreRecords();
        pTime->SetLatestFrame(round);
    }
    bStop = true;
    strand.join();
    intruder.join();

    pUpdater->SetChannels(channels, ids);
    pStorage->Updates = 0;
    pUpdater->Update(true, {-120.0, 0.0}, {-1200.0, 0.0}, 500, TQL::DefaultFramePeriod);
    EXPECT_EQ(pStorage->Updates, 8);
    EXPECT_EQ(pUpdater->GetExportData().value<VTraceDataUpdater::ExportMap>().size(), 8u);
}
