#include "GraphPlotSystem/Common/SharedObject.h"
#include "GraphPlotSystem/Time/PlotTimeRules.h"
#include "GraphPlotSystem/Time/VOrvaneGraphPlotTime.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <QtCore/QVariant>

#include <array>
#include <map>

using namespace GraphPlotUI;
using OrvanePluginInterface::TimeState;

namespace
{

constexpr std::int64_t Period = TQL::DefaultFramePeriod;

TimeState StateOf(std::int64_t i_FirstFrame, std::int64_t i_Frames, std::int64_t i_CurrentFrame)
{
    TimeState state;
    state.FirstTick = i_FirstFrame * Period;
    state.LengthTicks = i_Frames * Period;
    state.FramePeriodTicks = Period;
    state.CurrentTick = i_CurrentFrame * Period;
    return state;
}

class Source : public OrvanePluginInterface::ITimeSource
{
public:
    Source(int i_Mode, const TimeState& i_rState) : Mode(i_Mode), State(i_rState) {}

    int GetMode() const override { return Mode; }
    bool GetTimeState(TimeState& o_rState) const override
    {
        o_rState = State;
        return bHasState;
    }
    std::shared_ptr<TQL::IChangeSignal> StateChanged() const override { return pSignal; }
    std::shared_ptr<TQL::IChangeSignal> SecondStateChanged() const override { return pSecondSignal; }

    int Mode;
    TimeState State;
    bool bHasState = true;
    const std::shared_ptr<NotificationSystem::VChangeSignal> pSignal =
        std::make_shared<NotificationSystem::VChangeSignal>();
    const std::shared_ptr<NotificationSystem::VChangeSignal> pSecondSignal =
        std::make_shared<NotificationSystem::VChangeSignal>();
};

class Controller : public OrvanePluginInterface::ITimeController, public OrvanePluginInterface::ISourceMap
{
public:
    std::shared_ptr<ISourceMap> GetSourceMap() const override
    {
        return {std::shared_ptr<void>(), const_cast<Controller*>(this)};
    }
    void GetCurrentSourceName(std::string& o_rName) const override { o_rName = Current; }
    std::shared_ptr<OrvanePluginInterface::ITimeSource> GetCurrentSource() const override { return Find(Current); }
    void SeekTo(std::int64_t i_Tick) override { Seeks.push_back(i_Tick); }
    std::shared_ptr<TQL::IChangeSignal> SourceListChanged() const override { return pListChanged; }
    std::shared_ptr<TQL::IChangeSignal> CurrentSourceChanged() const override { return pCurrentChanged; }

    std::set<std::string> GetNames() const override
    {
        std::set<std::string> names;
        for (const auto& [rName, rpSource] : Sources)
            names.insert(rName);
        return names;
    }
    std::shared_ptr<OrvanePluginInterface::ITimeSource> Find(std::string_view i_Name) const override
    {
        const auto found = Sources.find(i_Name);
        return found == Sources.end() ? nullptr : found->second;
    }
    void
    ForEach(const std::function<void(const std::string&, const std::shared_ptr<OrvanePluginInterface::ITimeSource>&)>&
                i_rVisit) const override
    {
        for (const auto& [rName, rpSource] : Sources)
            i_rVisit(rName, rpSource);
    }
    std::shared_ptr<TQL::IChangeSignal> Changed() const override { return pListChanged; }

    std::map<std::string, std::shared_ptr<Source>, std::less<>> Sources;
    std::string Current;
    std::vector<std::int64_t> Seeks;
    const std::shared_ptr<NotificationSystem::VChangeSignal> pListChanged =
        std::make_shared<NotificationSystem::VChangeSignal>();
    const std::shared_ptr<NotificationSystem::VChangeSignal> pCurrentChanged =
        std::make_shared<NotificationSystem::VChangeSignal>();
};

/// A controller with a live capture at frame 1000, a recording of frames 100 to 299 at 150, and one of another mode.
class PlotTime : public ::testing::Test
{
protected:
    PlotTime()
    {
        pController->Sources["Live"] = std::make_shared<Source>(0, StateOf(0, 1001, 1000));
        pController->Sources["Take"] = std::make_shared<Source>(2, StateOf(100, 200, 150));
        pController->Sources["Other"] = std::make_shared<Source>(7, StateOf(0, 11, 5));
        pController->Current = "Take";
        const auto note = [this](const char* i_pName)
        {
            return [this, i_pName]
            {
                Notes += i_pName;
            };
        };
        QObject::connect(pTime.get(), &VBaseGraphPlotTime::ModeChanged, note("mode "));
        QObject::connect(pTime.get(), &VBaseGraphPlotTime::CurrentTimeChanged, note("current "));
        QObject::connect(pTime.get(), &VBaseGraphPlotTime::LatestFrameIndexChanged, note("latest "));
        QObject::connect(pTime.get(), &VBaseGraphPlotTime::SessionTimeRangeChanged, note("session "));
        pTime->FramePeriodChanged()->AddDirect(note("period "));
    }

    void Use(const std::string& i_rName)
    {
        pController->Current = i_rName;
        pController->pCurrentChanged->Invoke();
        pUi->RunAll();
    }

    /// Mode, session range, current and latest frame, and what was told since the last call.
    std::string Look()
    {
        const QPointF range = pTime->GetSessionTimeRange();
        const std::string mode = pTime->IsLive() ? "live" : pTime->IsReview() ? "review" : "neither";
        return mode + " " + std::to_string(static_cast<int>(range.x())) + ".." +
               std::to_string(static_cast<int>(range.y())) + " at " + std::to_string(pTime->GetCurrentTime()) + " of " +
               std::to_string(pTime->GetLatestFrameIndex()) + ": " + std::exchange(Notes, {});
    }

    TestSupport::LogGuard Log;
    std::shared_ptr<TestSupport::ManualPostalService> pUi = std::make_shared<TestSupport::ManualPostalService>();
    std::shared_ptr<Controller> pController = std::make_shared<Controller>();
    std::shared_ptr<VOrvaneGraphPlotTime> pTime = MakeSharedObject<VOrvaneGraphPlotTime>(pUi, pController);
    std::string Notes;
};

} // namespace

TEST(PlotTimeRules, FramesAreFloored)
{
    struct Case
    {
        const char* pWhat;
        std::array<std::int64_t, 4> State; ///< first, length, period, current ticks
        bool bRelative;
        PlotTimeSample Sample;
    };
    const Case cases[] = {
        {"review", {1000, 500, 100, 1250}, false, {14, {10.0, 14.0}, 12, 100}},
        {"live", {1000, 500, 100, 1400}, true, {14, {-14.0, 0.0}, 0, 100}},
        {"live before the latest", {0, 500, 100, 250}, true, {4, {-4.0, 0.0}, -2, 100}},
        {"negative and off the grid", {-250, 500, 100, -101}, false, {1, {-3.0, 1.0}, -2, 100}},
        {"empty", {0, 0, 100, 0}, false, {-1, {0.0, -1.0}, 0, 100}},
    };
    for (const Case& rCase : cases)
    {
        TimeState state;
        state.FirstTick = rCase.State[0];
        state.LengthTicks = rCase.State[1];
        state.FramePeriodTicks = rCase.State[2];
        state.CurrentTick = rCase.State[3];
        EXPECT_EQ(SamplePlotTime(state, rCase.bRelative), rCase.Sample) << rCase.pWhat;
    }
    for (const std::int64_t period : {0, -5})
    {
        TimeState state = StateOf(0, 10, 0);
        state.FramePeriodTicks = period;
        EXPECT_EQ(SamplePlotTime(state, false), std::nullopt);
        EXPECT_EQ(SeekTickOfFrame(state, 3, false), std::nullopt);
    }
    EXPECT_EQ(SeekTickOfFrame(StateOf(0, 10, 0), -2, true), 7 * Period);
    EXPECT_EQ(SeekTickOfFrame(StateOf(0, 10, 0), 3, false), 3 * Period);
}

TEST_F(PlotTime, FollowsTheModesOfTheCurrentSource)
{
    pUi->RunAll();
    EXPECT_EQ(Look(), "neither 0..0 at 0 of 0: ") << "not active";
    pTime->SetActive(true);
    pUi->RunAll();
    EXPECT_EQ(Look(), "review 100..299 at 150 of 299: mode session current latest ");
    Use("Live");
    EXPECT_EQ(Look(), "live -1000..0 at 0 of 1000: mode session current latest ");
    Use("Other");
    EXPECT_EQ(Look(), "neither -10..0 at -5 of 10: mode session current latest ");
    Use("Take");
    Look();
    pController->Sources["Take"]->Mode = 0;
    pController->pCurrentChanged->Invoke();
    pController->pListChanged->Invoke();
    EXPECT_EQ(pUi->Pending(), 1u) << "one run for a burst";
    pUi->RunAll();
    EXPECT_EQ(Look(), "live -299..0 at -149 of 299: mode session current ") << "the same source, another mode";
}

TEST_F(PlotTime, FollowsTheStateOfItsSource)
{
    pTime->SetActive(true);
    pUi->RunAll();
    Look();
    const auto pTake = pController->Sources["Take"];
    const auto change = [&](const TimeState& i_rState, auto& o_rSignal)
    {
        pTake->State = i_rState;
        o_rSignal.Invoke();
        o_rSignal.Invoke();
        EXPECT_EQ(pUi->RunAll(), 1u) << "a burst is one sample";
        return Look();
    };
    EXPECT_EQ(change(StateOf(100, 200, 151), *pTake->pSignal), "review 100..299 at 151 of 299: current ");
    EXPECT_EQ(change(StateOf(100, 210, 151), *pTake->pSecondSignal), "review 100..309 at 151 of 309: session latest ");
    TimeState other = StateOf(100, 210, 151);
    other.FramePeriodTicks = 2 * Period;
    EXPECT_EQ(change(other, *pTake->pSignal), "review 50..154 at 75 of 154: session current period latest ");
    EXPECT_EQ(pTime->GetFramePeriod(), 2 * Period);
    other.FramePeriodTicks = 0;
    EXPECT_EQ(change(other, *pTake->pSignal), "review 50..154 at 75 of 154: ") << "no period";
    pTake->bHasState = false;
    EXPECT_EQ(change(StateOf(0, 1, 0), *pTake->pSignal), "review 50..154 at 75 of 154: ") << "no state";
}

TEST_F(PlotTime, PrefersTheSourcesOfTheChannels)
{
    struct Case
    {
        const char* pWhat;
        std::set<std::string> Preferred;
        const char* pBound;
    };
    const Case cases[] = {
        {"no preference", {}, "review"},
        {"the current source, though another is live", {"Live", "Take"}, "review"},
        {"another one: the first live source", {"Other"}, "live"},
        {"one that has gone since", {"Gone"}, "live"},
    };
    pTime->SetActive(true);
    for (const Case& rCase : cases)
    {
        pTime->SetPreferredSources(rCase.Preferred);
        pUi->RunAll();
        EXPECT_EQ(Look().substr(0, std::string_view(rCase.pBound).size()), rCase.pBound) << rCase.pWhat;
        pTime->SetPreferredSources(rCase.Preferred);
        EXPECT_EQ(pUi->Pending(), 0u) << "the same names again: " << rCase.pWhat;
    }
    EXPECT_TRUE(pTime->HasSource("Other"));
    EXPECT_FALSE(pTime->HasSource("Gone"));
    pController->Sources["Live"]->Mode = 2;
    pController->pListChanged->Invoke();
    pUi->RunAll();
    EXPECT_EQ(Look().substr(0, 19), "review 0..1000 at 1") << "none is live: the first of the map";
}

TEST_F(PlotTime, RebindsWhenItIsActivatedAgain)
{
    pTime->SetActive(true);
    pUi->RunAll();
    pTime->SetActive(false);
    EXPECT_EQ(pController->Sources["Take"]->pSignal->Count(), 0u);
    Look();
    Use("Live");
    EXPECT_EQ(Look(), "review 100..299 at 150 of 299: ") << "asleep";
    pTime->SetActive(true);
    pUi->RunAll();
    EXPECT_EQ(Look(), "live -1000..0 at 0 of 1000: mode session current latest ");
    EXPECT_EQ(pController->Sources["Live"]->pSignal->Count(), 1u);
}

TEST_F(PlotTime, SeeksInAnythingButLive)
{
    pTime->SetCurrentTime(1);
    pTime->SetActive(true);
    pUi->RunAll();
    pTime->setProperty("currentTime", 120);
    EXPECT_EQ(pTime->GetCurrentTime(), 150) << "it comes back from the host";
    Use("Live");
    pTime->SetCurrentTime(-20);
    Use("Other");
    pTime->SetCurrentTime(-2);
    EXPECT_EQ(pController->Seeks, (std::vector<std::int64_t>{120 * Period, 8 * Period}));
}

TEST_F(PlotTime, LeavesNothingBehind)
{
    pTime->SetActive(true);
    pUi->RunAll();
    pTime->SetPreferredSources({"Live"}); // leaves a job in the queue
    pTime.reset();
    pUi->RunAll();
    EXPECT_EQ(pController->pListChanged->Count() + pController->pCurrentChanged->Count(), 0u);
    for (const auto& [rName, rpSource] : pController->Sources)
        EXPECT_EQ(rpSource->pSignal->Count() + rpSource->pSecondSignal->Count(), 0u) << rName;
}
