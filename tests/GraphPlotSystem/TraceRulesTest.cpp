#include "GraphPlotSystem/Traces/TraceLevelChoice.h"
#include "GraphPlotSystem/Traces/TraceTimeRules.h"

#include <gtest/gtest.h>

#include <limits>

using namespace GraphPlotUI;

namespace
{

constexpr std::int64_t Period = TQL::DefaultFramePeriod;
constexpr double Infinity = std::numeric_limits<double>::infinity();
constexpr double NotANumber = std::numeric_limits<double>::quiet_NaN();

} // namespace

TEST(TraceRules, LevelFollowsTheSamplesOfAPixel)
{
    struct Case
    {
        const char* pWhat;
        std::int64_t SamplePeriod;
        TQL::FrameRange Range;
        int Width;
        int Level;
    };
    const Case cases[] = {
        {"a sample a pixel", Period, {0.0, 999.0}, 1000, 0},
        {"less than a sample a pixel", Period, {0.0, 9.0}, 1000, 0},
        {"just below two", Period, {0.0, 1998.0}, 1000, 0},
        {"two", Period, {0.0, 1999.0}, 1000, 1},
        {"twice the range is one level more", Period, {0.0, 3999.0}, 1000, 2},
        {"ten samples a frame", Period / 10, {0.0, 999.0}, 1000, 3},
        {"a tenth of a sample a frame", Period * 10, {0.0, 19999.0}, 1000, 1},
        {"a day at 1 kHz on 500 px", 135'000, {-10368000.0, 0.0}, 500, 17},
        {"an inverted range has no logarithm", Period, {10.0, 0.0}, 1000, 0},
        {"no number", Period, {0.0, NotANumber}, 1000, 0},
        {"out of all bounds", Period, {0.0, Infinity}, 1000, 255},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(ChooseLevel(Period, rCase.SamplePeriod, rCase.Range, rCase.Width), rCase.Level) << rCase.pWhat;
}

TEST(TraceRules, LevelRisesUntilTheRowsHoldTheRead)
{
    struct Case
    {
        const char* pWhat;
        int Level;
        TQL::TickRange Read; ///< in samples
        std::int64_t Offset; ///< in samples
        int Raised;
    };
    const Case cases[] = {
        {"exactly full", 0, {0, 4096}, 0, 0},
        {"one more", 0, {0, 4097}, 0, 1},
        {"rows cut at both ends count", 1, {1, 8193}, 0, 2},
        {"counted from the grid", 1, {1, 8193}, 1, 1},
        {"3840 px of almost two samples", 0, {-7681, 0}, 0, 1},
        {"a coarser level stays", 5, {0, 100}, 0, 5},
        {"an empty read", 3, {10, 10}, 0, 3},
        {"a huge one ends at the clock", 0, {std::numeric_limits<std::int64_t>::min() / 4 / Period, 0}, 0, 29},
    };
    for (const Case& rCase : cases)
    {
        const TQL::TickRange read{rCase.Read.First * Period, rCase.Read.Last * Period};
        EXPECT_EQ(RaiseLevelToFit(static_cast<std::uint8_t>(rCase.Level), read, Period, rCase.Offset * Period),
                  rCase.Raised)
            << rCase.pWhat;
    }
    EXPECT_EQ(RaiseLevelToFit(255, {0, 100}, Period, 0), 255) << "a level that no shift can reach";
}

TEST(TraceRules, DisplayIsRefreshedLessOftenTheMoreItShows)
{
    const std::pair<double, int> cases[] = {{1.0, 20},   {10.0, 20},    {11.0, 20},
                                            {100.0, 44}, {1800.0, 500}, {3600.0, 500}};
    for (const auto& [seconds, milliseconds] : cases)
        EXPECT_EQ(DisplayUpdatePeriodMillis({-seconds * 120.0, 0.0}, Period), milliseconds) << seconds;
    EXPECT_EQ(DisplayUpdatePeriodMillis({-1.0, 0.0}, 0), 500) << "a period of 0 leaves no frames a second";
}

TEST(TraceRules, PresetsAreCountsOfSecondsMinutesOrHours)
{
    const std::pair<std::string_view, double> good[] = {{"1s", 120.0},     {"10s", 1200.0},  {"1m", 7200.0},
                                                        {"30m", 216000.0}, {"1h", 432000.0}, {"24h", 10368000.0}};
    for (const auto& [text, frames] : good)
        EXPECT_EQ(PresetRange(text, Period), TQL::FrameRange(-frames, 0.0)) << text;
    EXPECT_EQ(PresetRange("1s", 2'252'250)->first, -135'000'000.0 / 2'252'250) << "59.94 Hz: a part of a frame stays";
    for (const std::string_view bad : {"", "s", "10", "10d", "ten s", "1.5s", "99999999999s", "2147483647h", "10 s"})
        EXPECT_EQ(PresetRange(bad, Period), std::nullopt) << bad;
    EXPECT_EQ(PresetRange("10s", 0), std::nullopt);

    EXPECT_EQ(PresetIndex("24h"), 8);
    for (const std::string_view unknown : {"", "10S", "2s"})
        EXPECT_EQ(PresetIndex(unknown), StandardLiveTimePreset) << unknown;
}

TEST(TraceRules, AFittedLiveRangeHasAFloorAndALimit)
{
    const auto cached = [](double i_Seconds)
    {
        return TQL::TickRange{0, static_cast<std::int64_t>(i_Seconds * 135'000'000)};
    };
    EXPECT_EQ(FitLiveRange(cached(1), Period, {-1200.0, 0.0}), TQL::FrameRange(-360.0, 0.0)) << "three seconds";
    EXPECT_EQ(FitLiveRange(cached(5), Period, {-1200.0, 0.0}), TQL::FrameRange(-600.0, 0.0));
    EXPECT_EQ(FitLiveRange(cached(50), Period, {-1200.0, 0.0}), TQL::FrameRange(-1200.0, 0.0));
    EXPECT_EQ(FitLiveRange(cached(1), Period, {-100.0, 0.0}), TQL::FrameRange(-100.0, 0.0));
    EXPECT_EQ(FitLiveRange({5, 500 * Period + 1}, Period, {-1200.0, 0.0}), TQL::FrameRange(-501.0, 0.0))
        << "part frames count whole";
}

TEST(TraceRules, ReadsThePartInsideTheDefaultRangeWithAMargin)
{
    struct Case
    {
        TQL::FrameRange Time;
        TQL::FrameRange Default;
        std::int64_t Latest;
        TQL::TickRange Frames;
    };
    const Case cases[] = {
        {{-600.0, 0.0}, {-1200.0, 0.0}, 5000, {4399, 5002}},
        {{-2400.0, 100.0}, {-1200.0, 0.0}, 5000, {3799, 5002}},
        {{10.5, 20.5}, {0.0, 100.0}, 0, {9, 23}},
        {{-10.5, -0.5}, {-100.0, 0.0}, 0, {-12, 2}},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(ReadRange(rCase.Time, rCase.Default, rCase.Latest, Period),
                  (TQL::TickRange{rCase.Frames.First * Period, rCase.Frames.Last * Period}))
            << rCase.Time.first;
    const TQL::TickRange huge = ReadRange({-1e300, 1e300}, {-1e300, 1e300}, 0, Period);
    EXPECT_LT(huge.First, -(std::int64_t{1} << 60)) << "saturates instead of wrapping";
    EXPECT_GT(huge.Last, std::int64_t{1} << 60);
}

TEST(TraceRules, ARangeIsFiniteAndAscending)
{
    for (const TQL::FrameRange& rBad :
         {TQL::FrameRange{5.0, 5.0}, {NotANumber, 1.0}, {0.0, Infinity}, {-Infinity, 0.0}, {1.0, 0.0}})
        EXPECT_FALSE(IsUsableRange(rBad)) << rBad.first << " " << rBad.second;
    EXPECT_TRUE(IsUsableRange({-1e300, 1e300}));
}
