#include "GraphPlotSystem/FakeTraceWindow.h"
#include "GraphPlotSystem/Texts/VChannelComponentControls.h"
#include "GraphPlotSystem/Traces/VTraceDataUpdater.h"
#include "support/LogGuard.h"

using namespace GraphPlotUI;

namespace
{

constexpr std::int64_t Period = TQL::DefaultFramePeriod;
constexpr TQL::FrameRange TenSeconds{-1200.0, 0.0};

TQL::TickRange FrameTicks(std::int64_t i_First, std::int64_t i_End)
{
    return {i_First * Period, i_End * Period};
}

TQL::IChannelInstanceId IdOf(const std::string& i_rName)
{
    TQL::IChannelInstanceId id;
    id.DataContextName = "Live";
    id.TypeName = i_rName;
    return id;
}

class TraceDataUpdater : public ::testing::Test
{
protected:
    /// A channel at the frame rate that holds frames 0 to 4999.
    std::shared_ptr<FakeHost::Channel> MakeChannel(const std::string& i_rName)
    {
        auto pChannel = std::make_shared<FakeHost::Channel>(IdOf(i_rName));
        (void)pChannel->pParameters->SetParameter("ComponentDisplayNames", std::string("TX,TY"));
        pChannel->Description.Groups.resize(2);
        pChannel->SetView(std::make_shared<FakeHost::Block>(Period, FrameTicks(0, 5000)));
        return pChannel;
    }

    void Plot(const std::vector<std::shared_ptr<TQL::IChannel>>& i_rChannels)
    {
        VTraceDataUpdater::IdSet ids;
        for (const auto& rpChannel : i_rChannels)
            ids.insert(rpChannel->GetInstanceId());
        pUpdater->SetChannels(i_rChannels, ids);
    }

    /// One tick of a live plot of 1200 px; what it did.
    std::string Tick(const TQL::FrameRange& i_rDefault = TenSeconds, int i_Width = 1200, bool i_bLive = true)
    {
        pUpdater->Update(i_bLive, TenSeconds, i_rDefault, i_Width, Period);
        return pJournal->Take();
    }

    TestSupport::LogGuard Log;
    std::shared_ptr<FakeHost::Journal> pJournal = std::make_shared<FakeHost::Journal>();
    std::shared_ptr<FakeHost::Service> pService = std::make_shared<FakeHost::Service>(pJournal);
    std::shared_ptr<FakeTraceWindow::TextProvider> pTexts =
        std::make_shared<FakeTraceWindow::TextProvider>(pService, nullptr);
    std::shared_ptr<VChannelComponentControls> pControls = std::make_shared<VChannelComponentControls>(pTexts, nullptr);
    std::shared_ptr<FakeTraceWindow::PlotTime> pTime = []
    {
        auto pPlotTime = std::make_shared<FakeTraceWindow::PlotTime>(nullptr);
        pPlotTime->SetLatestFrame(4999);
        return pPlotTime;
    }();
    std::shared_ptr<FakeTraceWindow::Storage> pStorage = std::make_shared<FakeTraceWindow::Storage>(pJournal);
    std::shared_ptr<VTraceDataUpdater> pUpdater =
        TQL::MakeShared<VTraceDataUpdater>(pService, pTexts, pControls, pTime, pStorage);
};

const std::string SteadyTick = "update A 3798..5001 level 0\n"
                               "inspect A from 4999 window 1201\n"
                               "latest 5000\n";

} // namespace

TEST_F(TraceDataUpdater, MakesTheCacheOnceAndThenOnlyUpdates)
{
    Plot({MakeChannel("A")});
    EXPECT_EQ(pJournal->Take(), "removeTraces: B C\n");
    EXPECT_EQ(Tick(), "create Cache of A\n"
                      "A.cache: SupportLodding = true\n"
                      "A.cache: EnableRotationUnwrapping = true\n"
                      "A.cache: CacheRangeTicks = 1351125000\n" +
                          SteadyTick);
    EXPECT_EQ(Tick(), SteadyTick);
    EXPECT_EQ(Tick({-1200.0 * (1.0 + 1e-13), 0.0}), SteadyTick) << "a range that differs by rounding only";
    EXPECT_EQ(Tick({-600.0, 0.0}), "A.cache: CacheRangeTicks = 676125000\n"
                                   "update A 4398..5001 level 0\n"
                                   "inspect A from 4999 window 601\n"
                                   "latest 5000\n");
}

TEST_F(TraceDataUpdater, AReviewReadsAbsoluteFramesAndLeavesTheLatestFrame)
{
    Plot({MakeChannel("A")});
    Tick();
    pUpdater->Update(false, {100.4, 200.6}, {0.0, 5000.0}, 50, Period);
    EXPECT_EQ(pJournal->Take(), "A.cache: CacheRangeTicks = 5626125000\n"
                                "update A 99..203 level 1\n"
                                "inspect A from 0 window 5001\n"
                                "latest 4999\n");
}

TEST_F(TraceDataUpdater, TheReadIsAlignedToTheSamplesOfTheBlock)
{
    const auto pChannel = std::make_shared<FakeHost::Channel>(IdOf("A"));
    // 50 Hz samples that begin 1000 ticks after a frame.
    constexpr std::int64_t samplePeriod = 2'700'000;
    pChannel->SetView(
        std::make_shared<FakeHost::Block>(samplePeriod, TQL::TickRange{1000, 1000 + 100 * samplePeriod}, 1000));
    Plot({pChannel});
    pJournal->Take();
    pUpdater->Update(false, {10.0, 20.0}, {0.0, 240.0}, 1000, Period);
    // Frames 9 to 22 are 10125000 to 24750000 ticks: samples 3 to 10.
    EXPECT_NE(pJournal->Take().find("update A 7+226000..24+1000 level 0\n"), std::string::npos);
}

TEST_F(TraceDataUpdater, DoesNothingWithoutAWidthOrAPeriod)
{
    Plot({MakeChannel("A")});
    pJournal->Take();
    for (const int width : {0, -70})
        EXPECT_EQ(Tick(TenSeconds, width), "") << width;
    pUpdater->Update(true, TenSeconds, TenSeconds, 100, 0);
    EXPECT_EQ(pJournal->Take(), "");
}

TEST_F(TraceDataUpdater, TellsTheCachedRangeWhenItChanges)
{
    std::string told;
    pUpdater->RangeChanged()->AddDirect(
        [&told](const TQL::TickRange& i_rRange)
        { told += std::to_string(i_rRange.First / Period) + ".." + std::to_string(i_rRange.Last / Period) + " "; });
    Tick();
    EXPECT_EQ(std::exchange(told, {}), "4999..4999 ") << "nothing is plotted: the latest tick";
    Plot({MakeChannel("A")});
    Tick();
    Tick();
    EXPECT_EQ(std::exchange(told, {}), "0..5000 ");
    pUpdater->Clear();
    EXPECT_EQ(std::exchange(told, {}), "0..0 ");
}

TEST_F(TraceDataUpdater, AChannelWithoutDataHasNoTraceAndComesBack)
{
    const auto pBlock = std::make_shared<FakeHost::Block>(Period, FrameTicks(0, 5000));
    const auto pChannel = MakeChannel("A");
    pChannel->SetView(nullptr, false);
    Plot({pChannel});
    pJournal->Take();
    EXPECT_EQ(Tick(), "remove A\nlatest 4999\n") << "no view";
    EXPECT_EQ(Tick(), "latest 4999\n") << "the trace is gone already";
    pChannel->SetView(pBlock);
    EXPECT_NE(Tick().find(SteadyTick), std::string::npos);

    const auto pCache = pService->CacheOf(*pChannel);
    const auto losesItsView = [&](std::shared_ptr<FakeHost::Block> i_pBlock, bool i_bHasOutput)
    {
        const auto pOld = std::static_pointer_cast<FakeHost::View>(pCache->GetOutput());
        pCache->SetView(std::move(i_pBlock), i_bHasOutput);
        pOld->bStale = true;
    };
    losesItsView(nullptr, true);
    EXPECT_EQ(Tick(), "remove A\nlatest 4999\n") << "a cache without a block";
    losesItsView(pBlock, true);
    EXPECT_EQ(Tick(), SteadyTick);
    losesItsView(nullptr, false);
    EXPECT_EQ(Tick(), "remove A\nlatest 4999\n") << "a cache without a view";
}

TEST_F(TraceDataUpdater, ABlockWithoutAPeriodIsNotPlotted)
{
    const auto pChannel = MakeChannel("A");
    pChannel->SetView(std::make_shared<FakeHost::Block>(0, FrameTicks(0, 5000)));
    Plot({pChannel, MakeChannel("B")});
    Tick();
    const std::string second = Tick();
    EXPECT_EQ(second.find(" A "), std::string::npos) << second;
    EXPECT_NE(second.find("update B "), std::string::npos) << second;
}

TEST_F(TraceDataUpdater, ReplacedDataRemoveTheTraceAndRefreshTheTexts)
{
    const auto pChannel = MakeChannel("A");
    Plot({pChannel});
    Tick();
    int textChanges = 0;
    pTexts->TextChanged()->AddDirect(
        [&]
        {
            ++textChanges;
            pUpdater->HasSavedRecords(); // would deadlock if the updater still held its mutex
        });
    const auto pCache = pService->CacheOf(*pChannel);
    const auto pOld = std::static_pointer_cast<FakeHost::View>(pCache->GetOutput());
    pCache->SetView(std::make_shared<FakeHost::Block>(Period, FrameTicks(100, 5000)));
    EXPECT_EQ(Tick(), SteadyTick) << "not stale yet";
    pOld->bStale = true;
    EXPECT_EQ(Tick(), "remove A\n" + SteadyTick);
    EXPECT_EQ(textChanges, 1);
    EXPECT_EQ(Tick(), SteadyTick);
}

TEST_F(TraceDataUpdater, AStaleSourceThatHasNoNewViewWaits)
{
    const auto pChannel = MakeChannel("A");
    Plot({pChannel});
    Tick();
    std::static_pointer_cast<FakeHost::View>(pChannel->GetOutput())->bStale = true;
    EXPECT_EQ(Tick(), "latest 4999\n") << "the same stale view again";
    pChannel->SetView(std::make_shared<FakeHost::Block>(Period, FrameTicks(0, 5000)));
    EXPECT_EQ(Tick(), SteadyTick);
}

TEST_F(TraceDataUpdater, ARefusedCacheIsLoggedAndTriedAgain)
{
    pService->bRefuse = true;
    Plot({MakeChannel("A")});
    pJournal->Take();
    EXPECT_EQ(Tick(), "create Cache of A\nremove A\nlatest 4999\n");
    EXPECT_EQ(Tick(), "create Cache of A\nlatest 4999\n");
    const auto entries = Log.Take();
    ASSERT_EQ(entries.size(), 2u);
    EXPECT_EQ(entries[0].Text, "Failed to create cache channel: Live A");
    EXPECT_EQ(entries[0].Severity, TQL::ELogSeverity::Error);
    EXPECT_EQ(entries[0].Category, "GraphPlot");
    pService->bRefuse = false;
    EXPECT_NE(Tick().find(SteadyTick), std::string::npos);
}

TEST_F(TraceDataUpdater, AFailingTextProviderSkipsTheTickOnly)
{
    Plot({MakeChannel("A")});
    Tick();
    pTexts->bRefuse = true;
    EXPECT_EQ(Tick(), "latest 4999\n") << "the trace stays, and nothing is read";
    pTexts->bRefuse = false;
    EXPECT_EQ(Tick(), SteadyTick);
}

TEST_F(TraceDataUpdater, AThrowingHostCostsItsChannelOnly)
{
    const auto pChannel = MakeChannel("A");
    Plot({pChannel, MakeChannel("B")});
    Tick();
    const auto pView = std::static_pointer_cast<FakeHost::View>(pChannel->GetOutput());
    pView->bThrow = true;
    for (int tick = 0; tick < 2; ++tick)
        EXPECT_EQ(Tick(), "update B 3798..5001 level 0\ninspect B from 4999 window 1201\nlatest 5000\n") << tick;
    const auto entries = Log.Take();
    ASSERT_EQ(entries.size(), 1u) << "said once";
    EXPECT_EQ(entries[0].Text, "Failed to update trace data of channel: Live A: view torn");
    pView->bThrow = false;
    EXPECT_NE(Tick().find("update A "), std::string::npos);
}

TEST_F(TraceDataUpdater, TogglingUnwrappingMakesEveryCacheAnew)
{
    Plot({MakeChannel("A")});
    Tick();
    pUpdater->SaveRecords();
    pUpdater->SetRotationUnwrapping(true);
    EXPECT_EQ(pJournal->Take(), "") << "unchanged";
    for (const char* pValue : {"false", "true"})
    {
        pUpdater->SetRotationUnwrapping(std::string_view(pValue) == "true");
        EXPECT_EQ(pJournal->Take(), "remove A\nremove A\n") << "the live and the saved record";
        EXPECT_EQ(Tick(), "create Cache of A\n"
                          "A.cache: SupportLodding = true\n"
                          "A.cache: EnableRotationUnwrapping = " +
                              std::string(pValue) + "\nA.cache: CacheRangeTicks = 1351125000\n" + SteadyTick)
            << "the new cache is told its length too";
    }
}

TEST_F(TraceDataUpdater, AnotherObjectUnderAKnownIdStartsAfresh)
{
    const auto pFirst = MakeChannel("A");
    Plot({pFirst});
    Tick();
    Plot({pFirst});
    EXPECT_EQ(pJournal->Take(), "removeTraces: B C\n") << "the same object keeps its record";
    Plot({MakeChannel("A")});
    EXPECT_EQ(pJournal->Take(), "remove A\nremoveTraces: B C\n");
    EXPECT_EQ(Tick().substr(0, 18), "create Cache of A\n");
}

TEST_F(TraceDataUpdater, SavedRecordsKeepTheirCachesOverAClear)
{
    const auto pChannel = MakeChannel("A");
    Plot({pChannel});
    Tick();
    pUpdater->SaveRecords();
    pUpdater->Clear();
    EXPECT_EQ(Tick(), "clear\nlatest 4999\n");
    pUpdater->RestoreRecords();
    EXPECT_FALSE(pUpdater->HasSavedRecords());
    EXPECT_EQ(Tick(), SteadyTick) << "no new cache";
    pUpdater->RestoreRecords();
    EXPECT_EQ(Tick(), SteadyTick) << "restoring nothing changes nothing";
}

TEST_F(TraceDataUpdater, ExportsTheEnabledComponentsOfCachedChannels)
{
    const auto pChannel = MakeChannel("A");
    const auto pWithoutData = MakeChannel("B");
    pWithoutData->SetView(nullptr, false);
    Plot({pChannel, pWithoutData});
    EXPECT_TRUE(pUpdater->GetExportData().value<VTraceDataUpdater::ExportMap>().empty()) << "no cache yet";
    Tick();
    const VTraceDataUpdater::ExportMap both{{IdOf("A.cache"), {"TX", "TY"}}};
    EXPECT_EQ(pUpdater->GetExportData().value<VTraceDataUpdater::ExportMap>(), both);
    (void)pControls->SetComponentEnabled(pTexts->GetSubTypeId(pChannel->Id), 0, false);
    const VTraceDataUpdater::ExportMap one{{IdOf("A.cache"), {"TY"}}};
    EXPECT_EQ(pUpdater->GetExportData().value<VTraceDataUpdater::ExportMap>(), one);
}
