#include "FakeChannels.h"
#include "NotificationSystem/VSubscriptions.h"
#include "Services/Time/TimeRules.h"
#include "Services/Time/VContextTimeFeed.h"
#include "Services/Time/VPlaybackDriver.h"
#include "Services/Time/VTimeController.h"
#include "Services/Time/VTimeControllerRegistry.h"
#include "support/LogGuard.h"
#include "support/ManualPostalService.h"

#include <limits>

namespace Services
{
namespace
{

using namespace OrvanePluginInterface;

constexpr std::int64_t P = TQL::DefaultFramePeriod;

/// N frames from frame f.
TQL::TickRange Frames(std::int64_t i_First, std::int64_t i_Count)
{
    return {i_First * P, (i_First + i_Count) * P};
}

TEST(TimeRules, ClampsToTheFramesOfTheRange)
{
    struct Case
    {
        const char* pName;
        std::int64_t Tick;
        TQL::TickRange Range;
        std::int64_t Expected;
    };
    const Case cases[] = {
        {"inside", 50 * P + 7, Frames(10, 100), 50 * P + 7},
        {"first", 10 * P, Frames(10, 100), 10 * P},
        {"before", 0, Frames(10, 100), 10 * P},
        {"latest frame", 109 * P, Frames(10, 100), 109 * P},
        {"the end itself is no frame", 110 * P, Frames(10, 100), 109 * P},
        {"far behind", std::numeric_limits<std::int64_t>::max(), Frames(10, 100), 109 * P},
        {"negative frames", -500 * P, Frames(-20, 10), -20 * P},
        {"one frame", 99 * P, Frames(5, 1), 5 * P},
        {"empty range", 99 * P, Frames(5, 0), 5 * P},
        {"shorter than a frame", 99 * P, {0, P / 2}, 0},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(ClampToFrames(rCase.Tick, rCase.Range, P), rCase.Expected) << rCase.pName;
}

TEST(TimeRules, PlayStopsAtTheEndOfItsDirection)
{
    struct Case
    {
        const char* pName;
        std::int64_t Tick;
        std::int64_t Elapsed;
        double Rate;
        std::int64_t Expected;
        bool bEnded;
    };
    const Case cases[] = {
        {"real time", 10 * P, 3 * P, 1.0, 13 * P, false},
        {"half", 10 * P, 3 * P, 0.5, 11 * P + P / 2, false},
        {"double", 10 * P, 3 * P, 2.0, 16 * P, false},
        {"backwards", 10 * P, 3 * P, -1.0, 7 * P, false},
        {"no time", 10 * P, 0, 1.0, 10 * P, false},
        {"over the end", 98 * P, 3 * P, 1.0, 99 * P, true},
        {"onto the end", 98 * P, P, 1.0, 99 * P, true},
        {"short of the end", 98 * P, P - 1, 1.0, 99 * P - 1, false},
        {"at the end", 99 * P, 0, 1.0, 99 * P, true},
        {"backwards over the first", P, 2 * P, -1.0, 0, true},
        {"backwards from the end", 99 * P, P, -1.0, 98 * P, false},
        {"enormous rate", 0, P, 1e300, 99 * P, true},
        {"enormous rate backwards", P, P, -1e300, 0, true},
        {"standing", 5 * P, P, 0.0, 5 * P, false},
    };
    for (const Case& rCase : cases)
    {
        const PlayStep step = AdvancePlay(rCase.Tick, rCase.Elapsed, rCase.Rate, Frames(0, 100), P);
        EXPECT_EQ(step.Tick, rCase.Expected) << rCase.pName;
        EXPECT_EQ(step.bEnded, rCase.bEnded) << rCase.pName;
    }
}

TEST(TimeRules, ALoopGoesRoundWhateverTheSpeed)
{
    struct Case
    {
        const char* pName;
        std::int64_t Tick;
        std::int64_t Elapsed;
        double Rate;
        std::int64_t Expected;
    };
    const Case cases[] = {
        {"inside", 10 * P, 3 * P, 1.0, 13 * P},
        {"onto the latest frame", 98 * P, P, 1.0, 99 * P},
        {"over the end", 98 * P, 4 * P, 1.0, 3 * P},
        {"slowly from the latest frame", 99 * P, P, 0.1, P / 10},
        {"many times round", 5 * P, 990 * P, 1.0, 5 * P},
        {"backwards over the first", 2 * P, 5 * P, -1.0, 96 * P},
        {"backwards onto the first", 2 * P, P, -2.0, 0},
        {"from before", -50 * P, P, 1.0, 0},
        {"from behind, backwards", 500 * P, P, -1.0, 99 * P},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(AdvanceLoop(rCase.Tick, rCase.Elapsed, rCase.Rate, Frames(0, 100), P), rCase.Expected) << rCase.pName;
    EXPECT_EQ(AdvanceLoop(7 * P, 5 * P, 1.0, Frames(7, 1), P), 7 * P) << "one frame";
    const std::int64_t far = AdvanceLoop(0, P, 1e300, Frames(0, 100), P);
    EXPECT_TRUE(far >= 0 && far <= 99 * P) << "enormous rate";
}

TEST(TimeRules, MarksStayTheRightWayRound)
{
    const TQL::TickRange all = Frames(10, 90), none;
    EXPECT_EQ(MoveFirstMark(none, 30 * P + 5, all, P), Frames(30, 70));
    EXPECT_EQ(MoveLastMark(none, 30 * P + 5, all, P), Frames(10, 21));
    EXPECT_EQ(MoveFirstMark(Frames(20, 20), 30 * P, all, P), Frames(30, 10));
    EXPECT_EQ(MoveFirstMark(Frames(20, 20), 40 * P, all, P), Frames(40, 60)) << "behind the other one";
    EXPECT_EQ(MoveLastMark(Frames(20, 20), 19 * P, all, P), Frames(10, 10)) << "before the other one";
    EXPECT_EQ(MoveLastMark(Frames(20, 20), 20 * P, all, P), Frames(20, 1));

    EXPECT_EQ(LoopRange(none, all, P), all);
    EXPECT_EQ(LoopRange(Frames(50, 10), all, P), Frames(50, 10));
    EXPECT_EQ(LoopRange(Frames(0, 50), all, P), Frames(10, 40)) << "as far as it is in the range";
    EXPECT_EQ(LoopRange(Frames(200, 10), all, P), all) << "the recording was replaced by a shorter one";
}

TEST(TimeRules, NanosecondsToTicks)
{
    EXPECT_EQ(NanosecondsToTicks(1'000'000'000), TQL::DefaultTickRate);
    EXPECT_EQ(NanosecondsToTicks(200), 27);
    EXPECT_EQ(NanosecondsToTicks(-200), -27);
    EXPECT_EQ(NanosecondsToTicks(7), 1);
    EXPECT_EQ(NanosecondsToTicks(3600LL * 24 * 365 * 10 * 1'000'000'000), TQL::DefaultTickRate * 3600 * 24 * 365 * 10);
}

class TimeControllerTest : public ::testing::Test
{
protected:
    /// Waiting jobs hold the service that they wait in.
    ~TimeControllerTest() override { m_pUi->RunAll(); }

    std::shared_ptr<VTimeSource> AddReview(const std::string& i_rName, std::int64_t i_First, std::int64_t i_Count)
    {
        const auto pSource = m_pController->AddSource(i_rName, ETimeMode::Review);
        pSource->SetRange(Frames(i_First, i_Count), P);
        return pSource;
    }

    /// Counts a signal from now on.
    std::shared_ptr<int> Count(const std::shared_ptr<TQL::IChangeSignal>& i_rpSignal)
    {
        m_pUi->RunAll();
        const auto pCount = std::make_shared<int>(0);
        i_rpSignal->AddDirect([pCount] { ++*pCount; });
        return pCount;
    }

    std::int64_t CurrentFrame() const
    {
        TimeState state;
        EXPECT_TRUE(m_pController->GetCurrentSource()->GetTimeState(state));
        return TQL::FloorDivide(state.CurrentTick, state.FramePeriodTicks);
    }

    TestSupport::LogGuard m_Log;
    const std::shared_ptr<TestSupport::ManualPostalService> m_pUi =
        std::make_shared<TestSupport::ManualPostalService>();
    const std::shared_ptr<VTimeController> m_pController = std::make_shared<VTimeController>(m_pUi);
};

TEST_F(TimeControllerTest, LiveGrowsAndStandsAtTheLatestFrame)
{
    const auto pLive = m_pController->AddSource("Live", ETimeMode::Live);
    ASSERT_TRUE(m_pController->SetCurrentSource("Live"));
    TimeState state;
    EXPECT_FALSE(pLive->GetTimeState(state)) << "there is no state before the first frame";

    const auto pChanges = Count(pLive->StateChanged());
    for (std::int64_t frames = 1; frames <= 5; ++frames)
        pLive->SetRange(Frames(1000, frames), P);
    EXPECT_EQ(*pChanges, 0);
    m_pUi->RunAll();
    EXPECT_EQ(*pChanges, 1) << "a burst is told once";
    ASSERT_TRUE(pLive->GetTimeState(state));
    EXPECT_EQ(state.FirstTick, 1000 * P);
    EXPECT_EQ(state.LengthTicks, 5 * P);
    EXPECT_EQ(state.FramePeriodTicks, P);
    EXPECT_EQ(state.CurrentTick, 1004 * P);

    m_pController->SeekTo(1001 * P);
    m_pController->Play();
    EXPECT_FALSE(m_pController->IsPlaying());
    m_pUi->RunAll();
    EXPECT_EQ(CurrentFrame(), 1004) << "live cannot be moved";
    EXPECT_EQ(*pChanges, 1);
}

TEST_F(TimeControllerTest, SeekClampsAndTellsLater)
{
    const auto pSource = AddReview("Walk", 10, 100);
    m_pController->SetCurrentSource("Walk");
    const auto pChanges = Count(pSource->SecondStateChanged());
    EXPECT_EQ(CurrentFrame(), 10) << "a recording begins at its first frame";
    m_pController->SeekTo(50 * P);
    m_pController->SeekTo(5000 * P);
    EXPECT_EQ(CurrentFrame(), 109);
    EXPECT_EQ(*pChanges, 0) << "never inside the call";
    m_pUi->RunAll();
    EXPECT_EQ(*pChanges, 1);
    m_pController->SeekTo(6000 * P);
    m_pUi->RunAll();
    EXPECT_EQ(*pChanges, 1) << "nothing changed";

    pSource->SetRange(Frames(10, 20), P);
    EXPECT_EQ(CurrentFrame(), 29) << "a range that shrinks takes the current frame along";
}

TEST_F(TimeControllerTest, TellsOfSourcesAndOfTheModeOfTheCurrentOne)
{
    const auto pLists = Count(m_pController->SourceListChanged());
    const auto pCurrents = Count(m_pController->CurrentSourceChanged());
    const auto expect = [&](int i_Lists, int i_Currents, const char* i_pAfter)
    {
        m_pUi->RunAll();
        EXPECT_EQ(*pLists, i_Lists) << i_pAfter;
        EXPECT_EQ(*pCurrents, i_Currents) << i_pAfter;
    };
    const auto pLive = m_pController->AddSource("Live", ETimeMode::Live);
    const auto pWalk = AddReview("Walk", 0, 10);
    expect(1, 0, "two sources added");
    EXPECT_FALSE(m_pController->SetCurrentSource("Unknown"));
    expect(1, 0, "unknown name");
    EXPECT_TRUE(m_pController->SetCurrentSource("Live"));
    expect(1, 1, "current chosen");
    EXPECT_TRUE(m_pController->SetCurrentSource("Live"));
    expect(1, 1, "same again");
    pWalk->SetMode(ETimeMode::Live);
    expect(1, 1, "mode of another source");
    pLive->SetMode(ETimeMode::Review);
    expect(1, 2, "mode of the current source");
    EXPECT_TRUE(m_pController->SetCurrentSource("Walk"));
    expect(1, 3, "other source");
    pLive->SetMode(ETimeMode::Live);
    expect(1, 3, "mode of the former source");
    EXPECT_TRUE(m_pController->RemoveSource("Walk"));
    EXPECT_FALSE(m_pController->RemoveSource("Walk"));
    expect(2, 4, "current removed");
    EXPECT_EQ(m_pController->GetCurrentSource(), nullptr);
    m_pController->AddSource("Live", ETimeMode::Live);
    expect(3, 4, "replaced while not current");

    EXPECT_EQ(m_pController->GetSourceMap()->Changed(), m_pController->SourceListChanged());
    std::string names;
    const auto note = [&](void*)
    {
        m_pController->GetSourceMap()->ForEach([&](const std::string& i_rName, const auto&)
                                               { names += i_rName + " "; });
    };
    AddReview("Jump", 0, 1)->StateChanged()->Add([pOwned = std::shared_ptr<void>(nullptr, note)] {}, nullptr);
    m_pUi->RunAll(); // what is posted for a source keeps it
    note(nullptr);
    EXPECT_EQ(names, "Jump Live ");
    EXPECT_TRUE(m_pController->RemoveSource("Jump"));
    EXPECT_EQ(names, "Jump Live Live ") << "who listened to the source asks for the others as it goes";
}

TEST_F(TimeControllerTest, PlaysToTheEndAndStartsAgain)
{
    AddReview("Walk", 0, 10);
    m_pController->SetCurrentSource("Walk");
    const auto pPlays = Count(m_pController->PlayChanged());
    m_pController->Advance(3 * P);
    EXPECT_EQ(CurrentFrame(), 0) << "not playing";
    m_pController->Play(2.0);
    EXPECT_TRUE(m_pController->IsPlaying());
    m_pController->Advance(3 * P);
    EXPECT_EQ(CurrentFrame(), 6);
    m_pController->Advance(30 * P);
    EXPECT_EQ(CurrentFrame(), 9);
    EXPECT_FALSE(m_pController->IsPlaying()) << "no loop";
    m_pUi->RunAll();
    EXPECT_EQ(*pPlays, 1) << "begin and end in one burst";

    m_pController->Play();
    EXPECT_EQ(CurrentFrame(), 0) << "from the beginning again";
    m_pController->Pause();
    m_pController->Play(-1.0);
    EXPECT_EQ(CurrentFrame(), 9) << "backwards from the end";
    m_pController->FindSource("Walk")->SetMode(ETimeMode::Live);
    m_pUi->RunAll();
    EXPECT_FALSE(m_pController->IsPlaying()) << "live cannot be played";
}

TEST_F(TimeControllerTest, LoopsOverTheMarksOfItsSource)
{
    AddReview("Walk", 0, 100);
    AddReview("Run", 0, 50);
    m_pController->SetCurrentSource("Walk");
    const auto pPlays = Count(m_pController->PlayChanged());
    m_pController->SetLooping(true);
    m_pController->SetMarks(Frames(20, 11));
    m_pController->SetRate(2.0);
    m_pUi->RunAll();
    EXPECT_EQ(*pPlays, 1) << "a burst is told once";
    m_pController->Play(m_pController->Rate());
    for (const std::int64_t frame : {20, 26, 22, 28})
    {
        m_pController->Advance(3 * P);
        EXPECT_EQ(CurrentFrame(), frame);
    }
    EXPECT_TRUE(m_pController->IsPlaying());

    m_pController->SetCurrentSource("Run");
    EXPECT_TRUE(m_pController->Marks().IsEmpty());
    m_pController->SetCurrentSource("Walk");
    EXPECT_EQ(m_pController->Marks(), Frames(20, 11));
    m_pController->SetLooping(false);
    m_pController->Play(m_pController->Rate());
    m_pController->Advance(500 * P);
    EXPECT_EQ(CurrentFrame(), 99);
    EXPECT_FALSE(m_pController->IsPlaying()) << "marks without a loop hold nothing up";
}

TEST_F(TimeControllerTest, DriverMovesByItsClockWhilePlaying)
{
    std::chrono::nanoseconds now = std::chrono::hours(5);
    AddReview("Walk", 0, 1000);
    m_pController->SetCurrentSource("Walk");
    VPlaybackDriver driver(m_pController, m_pUi, [&] { return now; });
    m_pController->Play();
    m_pUi->RunAll();
    ASSERT_TRUE(driver.IsRunning());
    now += std::chrono::milliseconds(500);
    driver.Step();
    EXPECT_EQ(CurrentFrame(), 60);
    m_pController->Pause();
    m_pUi->RunAll();
    EXPECT_FALSE(driver.IsRunning());
    now += std::chrono::hours(1);
    m_pController->Play();
    m_pUi->RunAll();
    driver.Step();
    EXPECT_EQ(CurrentFrame(), 60) << "the time of the pause does not count";
}

TEST_F(TimeControllerTest, FeedFollowsItsContextAndIsTheHostsOwn)
{
    const auto pLedger = std::make_shared<VHostSubscriptionLedger>();
    const auto pContext = std::make_shared<Fakes::FakeContext>("Live", ChannelSystem::EContextType::Live);
    pContext->SetFrames(0, 3);
    const auto pSource = m_pController->AddSource("Live", ETimeMode::Live);
    {
        const VContextTimeFeed feed(pContext, pSource, pLedger);
        EXPECT_EQ(pSource->CurrentTick(), 2 * P) << "what is there already";
        pContext->SetFrames(0, 8);
        EXPECT_EQ(pSource->CurrentTick(), 7 * P);
        EXPECT_EQ(pLedger->Count(pContext->RangeChanged().get()), 1u);
    }
    EXPECT_EQ(pLedger->Count(pContext->RangeChanged().get()), 0u);
    EXPECT_EQ(pContext->RangeChanged()->Count(), 0u);
}

TEST_F(TimeControllerTest, RegistryKnowsWhatWasAdded)
{
    VTimeControllerRegistry registry;
    registry.Add("default", m_pController);
    std::shared_ptr<ITimeController> pFound;
    registry.GetTimeController("default", pFound);
    EXPECT_EQ(pFound, m_pController);
    registry.GetTimeController("other", pFound);
    EXPECT_EQ(pFound, nullptr);
}

} // namespace
} // namespace Services
