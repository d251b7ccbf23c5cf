#include "GraphPlotSystem/TraceManagerFixture.h"
#include "GraphPlotSystem/VGraphPlotSystem.h"

using namespace GraphPlotUI;

TEST_F(TraceManager, ALiveContextStartsTheLoopAndAnEmptyNameStopsIt)
{
    const auto pManager = Make();
    Watch("A", 5000);
    pTime->SetLatestFrame(4999);
    pJournal->Take();
    pManager->SetContext("Live");
    for (int tick = 0; tick < 3; ++tick)
    {
        EXPECT_TRUE(RunLoopOnce());
        EXPECT_NE(pJournal->Take().find("update A 3798..5001 level 10\n"), std::string::npos)
            << "a subplot of one pixel, tick " << tick;
    }
    pManager->setProperty("subplotWidth", 1200);
    RunLoopOnce();
    EXPECT_EQ(pJournal->Take(), "update A 3798..5001 level 0\ninspect A from 4999 window 1201\nlatest 5000\n");
    pManager->SetContext("");
    EXPECT_TRUE(RunLoopOnce()) << "the tick that was waiting";
    EXPECT_FALSE(RunLoopOnce()) << "and no other";
    EXPECT_EQ(pJournal->Take(), "");
    pManager->SetContext("Live");
    EXPECT_TRUE(RunLoopOnce());
    EXPECT_NE(pJournal->Take().find("update A "), std::string::npos);
    pManager->Reset();
    EXPECT_EQ(pJournal->Take(), "clear\n");
}

TEST_F(TraceManager, ARecordingSetsItsRange)
{
    const auto pManager = Make();
    const auto pTake = AddRecording("Take", 100, 300);
    pManager->SetContext("Take");
    EXPECT_EQ(Notes(), "LiveContext TimeRange DefaultTimeRange ");
    EXPECT_FALSE(pManager->IsLiveContext());
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(100, 300));
    EXPECT_EQ(pManager->GetDefaultTimeRange(), QPointF(100, 300));
    pManager->SetLiveTimePresetIndex(5);
    EXPECT_EQ(pManager->GetDefaultTimeRange(), QPointF(100, 300)) << "presets are for live";

    pTake->Range.Last += 50 * TQL::DefaultFramePeriod + TQL::DefaultFramePeriod / 2;
    pTake->pRangeChanged->Invoke();
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(100, 300)) << "only on the user interface's service";
    pUi->RunAll();
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(100, 350.5));
    EXPECT_EQ(pManager->GetDefaultTimeRange(), QPointF(100, 350.5));

    for (const auto& [range, period] : {std::pair(TQL::TickRange{500, 500}, TQL::DefaultFramePeriod),
                                        std::pair(TQL::TickRange{0, 500}, std::int64_t{0})})
    {
        pTake->Range = range;
        pTake->FramePeriod = period;
        pTake->pRangeChanged->Invoke();
        pUi->RunAll();
        EXPECT_EQ(pManager->GetTimeRange(), QPointF(100, 350.5)) << "no range, or no period";
    }
}

TEST_F(TraceManager, ARecordingThatWasLeftIsSilent)
{
    const auto pManager = Make();
    const auto pTake = AddRecording("Take", 100, 300);
    pManager->SetContext("Take");
    pTake->pRangeChanged->Invoke(); // waits in the queue while the context changes
    pManager->SetContext("Live");
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(-1200, 0)) << "who saw the whole recording sees the live window";
    pTake->Range.Last *= 2;
    pUi->RunAll();
    pTake->pRangeChanged->Invoke();
    pUi->RunAll();
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(-1200, 0));
    EXPECT_EQ(pTake->pRangeChanged->Count(), 0u);

    pManager->SetContext("Take");
    pManager->SetTimeRange({120, 130});
    pManager->SetContext("Live");
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(120, 130)) << "a range that the operator chose stays";
    pManager->SetContext("Take");
    pManager->SetContext("");
    pTake->pRangeChanged->Invoke();
    pUi->RunAll();
    EXPECT_EQ(pTake->pRangeChanged->Count(), 0u) << "a dropped context too";
}

TEST_F(TraceManager, WaitsForAContextThatDoesNotExistYet)
{
    const auto pManager = Make();
    const auto announce = [&]
    {
        pService->pContextListChanged->Invoke();
        pUi->RunAll();
    };
    pManager->SetContext("Take");
    announce();
    EXPECT_TRUE(pManager->IsLiveContext());
    AddRecording("Take", 0, 100);
    EXPECT_TRUE(pManager->IsLiveContext());
    announce();
    EXPECT_FALSE(pManager->IsLiveContext());

    pManager->SetContext("Later");
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(0, 100)) << "the present context stays meanwhile";
    pManager->SetContext("Take");
    AddRecording("Later", 0, 7);
    announce();
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(0, 100)) << "asking for the present context calls the wait off";
    pManager->SetContext("Never");
    pManager->SetContext("");
    AddRecording("Never", 0, 9);
    announce();
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(0, 100)) << "so does asking for none";
}

TEST_F(TraceManager, FollowsAContextThatIsReplacedOrVanishes)
{
    const auto pManager = Make();
    const auto announce = [&]
    {
        pService->pContextListChanged->Invoke();
        pUi->RunAll();
    };
    AddRecording("Take", 0, 100);
    pManager->SetContext("Take");
    const auto pSecond = AddRecording("Take", 0, 200);
    pManager->SetContext("Take");
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(0, 100)) << "the same name is no change";
    announce();
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(0, 200));
    Notes();
    announce();
    EXPECT_EQ(Notes(), "");

    pService->Contexts.erase("Take");
    announce();
    while (RunLoopOnce())
    {
    }
    EXPECT_EQ(pSecond->pRangeChanged->Count(), 0u);
    AddRecording("Take", 0, 300);
    announce();
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(0, 300)) << "it came back";
    EXPECT_TRUE(RunLoopOnce());
}

TEST_F(TraceManager, FollowsTheFramePeriodWhileActive)
{
    const auto pManager = Make();
    pTime->SetFramePeriod(2 * TQL::DefaultFramePeriod);
    pUi->RunAll();
    EXPECT_EQ(Notes(), "") << "not active";
    pManager->SetContext("Live");
    pUi->RunAll();
    EXPECT_EQ(Notes(), "DefaultTimeRange TimeRange ContextFramePeriod ");
    EXPECT_EQ(pManager->GetDefaultTimeRange(), QPointF(-600, 0));
    EXPECT_EQ(pManager->GetContextFramePeriod(), 2 * TQL::DefaultFramePeriod);
    EXPECT_EQ(pJournal->Take(), "period 2250000\n");
    pTime->SetFramePeriod(0);
    pTime->SetFramePeriod(2 * TQL::DefaultFramePeriod);
    pUi->RunAll();
    EXPECT_EQ(Notes(), "");
    pManager->SetContext("");
    pTime->SetFramePeriod(TQL::DefaultFramePeriod);
    pUi->RunAll();
    EXPECT_EQ(Notes(), "");
}

TEST_F(TraceManager, TheWindowOfALiveContextIsTenSecondsAtEveryRate)
{
    struct Case
    {
        std::int64_t Rate;
        std::int64_t RecordingRate;
        double Frames;
    };
    for (const Case& rCase : {Case{100, 50, 1000}, Case{50, 200, 500}, Case{1000, 100, 10000}, Case{120, 1000, 1200}})
    {
        SCOPED_TRACE(rCase.Rate);
        const auto setRate = [&](std::int64_t i_Rate)
        {
            pTime->SetFramePeriod(TQL::DefaultTickRate / i_Rate);
            pUi->RunAll();
        };
        const QPointF window(-rCase.Frames, 0);
        const auto pManager = Make();
        pManager->SetContext("Live");
        setRate(rCase.Rate);
        EXPECT_EQ(pManager->GetTimeRange(), window) << "the rate comes after the context";

        AddRecording("Take", 100, 300);
        pManager->SetContext("Take");
        setRate(rCase.RecordingRate);
        EXPECT_EQ(pManager->GetTimeRange(), QPointF(100, 300));
        pManager->SetContext("Live");
        setRate(rCase.Rate);
        EXPECT_EQ(pManager->GetTimeRange(), window) << "on the way back";

        pManager->SetTimeRange({-70, -20});
        setRate(rCase.RecordingRate);
        EXPECT_EQ(pManager->GetTimeRange(), QPointF(-70, -20)) << "a range that the operator chose stays";
        setRate(120);
    }
}

TEST_F(TraceManager, FollowsTheUnwrappingPreferenceWhileActive)
{
    const auto pManager = Make();
    Watch("A", 100);
    const auto set = [&](bool i_bEnabled)
    {
        EXPECT_TRUE(pPreferences->SetValue(IGraphPlotPreferences::EnableRotationUnwrapping, i_bEnabled).IsSuccess());
        pUi->RunAll();
        return pJournal->Take();
    };
    pJournal->Take();
    EXPECT_EQ(set(false), "") << "not active";
    pManager->SetContext("Live");
    pUi->RunAll();
    EXPECT_EQ(pJournal->Take(), "remove A\n") << "the present value is picked up";
    EXPECT_EQ(set(true), "remove A\n");
    pManager->SetContext("");
    EXPECT_EQ(set(false), "");
}

TEST_F(TraceManager, ChannelsNameTheirSources)
{
    const auto pManager = Make();
    const auto pInput = std::make_shared<FakeHost::Channel>(TQL::IChannelInstanceId{"Take", "Input", 1, 0, ""});
    const auto pNameless = std::make_shared<FakeHost::Channel>(TQL::IChannelInstanceId{"", "Nameless", 1, 0, ""});
    const auto pDerived = std::make_shared<FakeHost::Channel>(TQL::IChannelInstanceId{"Live", "Derived", 1, 0, ""});
    const auto pGlobal = std::make_shared<FakeHost::Channel>(TQL::IChannelInstanceId{"GlobalItems", "Rate", 1, 0, ""});
    pDerived->Inputs = {pInput, pNameless, pGlobal, nullptr};
    pInput->Inputs = {pDerived}; // a ring must not hang
    pManager->SetChannels({pDerived, pNameless});
    EXPECT_EQ(pTime->PreferredSources, (std::set<std::string>{"Live", "Take"})) << "what has a time, and no other";
    pInput->Inputs.clear();
    pManager->SetChannels({});
    EXPECT_TRUE(pTime->PreferredSources.empty());
}

TEST_F(TraceManager, ADeadManagerLeavesNothingBehind)
{
    auto pManager = Make();
    const auto pTake = AddRecording("Take", 0, 100);
    Watch("A", 100);
    pManager->SetContext("Take");
    RunLoopOnce();
    // Leave a job of every kind in the queues: the range, the context list, the period, the preference, a tick.
    pTake->pRangeChanged->Invoke();
    pService->pContextListChanged->Invoke();
    pTime->SetFramePeriod(777);
    EXPECT_TRUE(pPreferences->SetValue(IGraphPlotPreferences::EnableRotationUnwrapping, false).IsSuccess());
    pManager->SetContext("Live");
    pManager->SetContext("Take");
    EXPECT_GT(pUi->Pending(), 3u);
    pManager.reset();
    EXPECT_TRUE(pNewest.expired());
    pJournal->Take();
    while (RunLoopOnce())
    {
    }
    EXPECT_EQ(pJournal->Take(), "");
    EXPECT_EQ(pTake->pRangeChanged->Count() + pService->pContextListChanged->Count() +
                  pTime->FramePeriodChanged()->Count(),
              0u);
}

TEST_F(TraceManager, TheGraphPlotSystemIsTheDoorToAll)
{
    const auto pManager = Make();
    VGraphPlotSystem graphPlotSystem(std::make_shared<VGraphPlotContext>(nullptr, pStorage), pManager, pTime);
    AddRecording("Take", 5, 25);
    graphPlotSystem.SetContext("Take");
    EXPECT_TRUE(pTime->bActive);
    GraphPlotState state;
    state.ActiveChannels.SelectedChannelType = "left from before";
    graphPlotSystem.BuildState(state);
    GraphPlotState expected;
    expected.Trace.LiveTimePreset = "10s";
    expected.Trace.TimeRange = {5.0, 25.0};
    EXPECT_EQ(state, expected);
    state.Trace.TimeRange = {10.0, 12.0};
    TQL::IResult result = TQL::Result::NotAvailable;
    graphPlotSystem.ApplyState(result, state);
    EXPECT_EQ(result, TQL::Result::Ok);
    EXPECT_EQ(pManager->GetTimeRange(), QPointF(10, 12));
    graphPlotSystem.SetContext("");
    EXPECT_FALSE(pTime->bActive);
    pJournal->Take();
    graphPlotSystem.Reset();
    EXPECT_EQ(pJournal->Take(), "clear\n");
    EXPECT_EQ(graphPlotSystem.GetContext()->GetTraceDataProvider(), pStorage);
}
