#include "GraphPlotSystem/MemoryBlock.h"

#include "GraphPlotSystem/Traces/VTraceInspector.h"

#include <gtest/gtest.h>

#include <cmath>
#include <deque>
#include <limits>
#include <stdexcept>
#include <vector>

using GraphPlotUI::RollingStatistics;
using GraphPlotUI::VTraceInspector;
using TestSupport::Gap;
using TestSupport::MemoryBlock;
using TestSupport::Ramp;

namespace
{

constexpr std::int64_t Period = 1'125'000; ///< 120 samples a second

struct Statistics
{
    double Mean = 0.0;
    double Deviation = 0.0;
};

/// In double and from the start, over the newest samples with a number.
Statistics Naive(const std::vector<float>& i_rSamples, std::size_t i_Window)
{
    std::deque<double> newest;
    for (const float sample : i_rSamples)
        if (std::isfinite(sample))
        {
            newest.push_back(static_cast<double>(sample));
            if (newest.size() > i_Window)
                newest.pop_front();
        }
    Statistics result;
    if (newest.empty())
        return result;
    for (const double sample : newest)
        result.Mean += sample / static_cast<double>(newest.size());
    double squares = 0.0;
    for (const double sample : newest)
        squares += (sample - result.Mean) * (sample - result.Mean);
    if (newest.size() > 1)
        result.Deviation = std::sqrt(squares / static_cast<double>(newest.size() - 1));
    return result;
}

/// A slow wave with a fast one on it; every i_GapEvery-th sample is missing.
std::vector<float> Wave(std::int64_t i_Count, std::int64_t i_GapEvery = 0)
{
    std::vector<float> samples;
    for (std::int64_t n = 0; n < i_Count; ++n)
    {
        const auto t = static_cast<float>(n);
        samples.push_back(i_GapEvery != 0 && n % i_GapEvery == 3 ? Gap
                                                                 : 5.0f + std::sin(0.01f * t) + 0.2f * std::sin(t));
    }
    return samples;
}

void ExpectNear(float i_Mean, float i_Deviation, const Statistics& i_rExpected)
{
    EXPECT_NEAR(static_cast<double>(i_Mean), i_rExpected.Mean, 1e-3);
    EXPECT_NEAR(static_cast<double>(i_Deviation), i_rExpected.Deviation, 1e-3);
}

} // namespace

TEST(RollingStatistics, AgreeWithAllSamplesOfTheWindow)
{
    const float infinity = std::numeric_limits<float>::infinity();
    struct Case
    {
        const char* pName;
        std::vector<float> Samples;
        std::int64_t Window;
    };
    const Case cases[] = {
        {"no sample", {}, 4},
        {"one sample", {7}, 4},
        {"not full", {1, 2, 4}, 4},
        {"just full", {1, 2, 4, 8}, 4},
        {"rolling", {1, 2, 4, 8, 16, 32, 1, 1}, 4},
        {"gaps and infinities", {1, Gap, 2, infinity, 4, -infinity, 8, Gap, 16}, 3},
        {"window of one", {1, 5, 9}, 1},
        {"constant", std::vector<float>(100, 3.25f), 10},
        {"constant after a jump", {1000, 1000, 1, 1, 1, 1, 1}, 3},
        {"long wave", Wave(20000), 1200},
        {"long wave with gaps", Wave(20000, 7), 1200},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        RollingStatistics statistics(rCase.Window);
        statistics.Push(rCase.Samples);
        ExpectNear(statistics.Mean(), statistics.StandardDeviation(),
                   Naive(rCase.Samples, static_cast<std::size_t>(rCase.Window)));
    }
}

TEST(RollingStatistics, RefusesAnImpossibleWindow)
{
    EXPECT_THROW(RollingStatistics(std::numeric_limits<std::int64_t>::max()), std::length_error);
}

TEST(Inspector, ReadsTheSampleNearestToTheTick)
{
    struct Case
    {
        std::int64_t Tick;
        float Expected; ///< NaN: none
    };
    const Case cases[] = {
        {30, 3},   {34, 3},   {26, 3},   {-4, 0},    {0, 0},    {90, 9},
        {94, 9},   {96, Gap}, {-6, Gap}, {500, Gap}, {35, Gap}, // half-way between two samples: neither
        {70, Gap},                                              // a sample without a number
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.Tick);
        MemoryBlock block;
        block.Append(Ramp(0, 10, [](std::int64_t n) { return n == 7; }));
        VTraceInspector inspector;
        std::vector<float> scratch;
        const bool bRead = inspector.UpdateValue(block, 0, rCase.Tick, scratch);
        EXPECT_EQ(bRead, !std::isnan(rCase.Expected) || rCase.Tick == 70);
        if (std::isnan(rCase.Expected))
            EXPECT_TRUE(std::isnan(inspector.Values().Value));
        else
            EXPECT_EQ(inspector.Values().Value, rCase.Expected);
    }
}

TEST(Inspector, ReadsAValueOnceAndKeepsItWhereThereIsNone)
{
    MemoryBlock block(2, 10, 4, 3);
    block.Append({0, 0, 1, 10, 2, 20});
    VTraceInspector inspector;
    std::vector<float> scratch;
    EXPECT_TRUE(inspector.UpdateValue(block, 1, 20, scratch));
    EXPECT_EQ(inspector.Values().Value, 20.0f);
    EXPECT_EQ(block.TakeReads(), "component 1 [2, 3)\n");
    EXPECT_FALSE(inspector.UpdateValue(block, 1, 20, scratch));
    EXPECT_FALSE(inspector.UpdateValue(block, 1, 900, scratch));
    EXPECT_FALSE(inspector.UpdateValue(block, 2, 10, scratch)) << "a component that the block lacks";
    EXPECT_EQ(inspector.Values().Value, 20.0f);
}

TEST(Inspector, TakesInOneSecondACall)
{
    MemoryBlock block(1, Period);
    const std::vector<float> samples = Wave(5 * 120 + 30, 11);
    block.Append(samples);
    VTraceInspector inspector;
    std::vector<float> scratch;
    EXPECT_EQ(inspector.Progress(), 1.0) << "nothing is under way yet";
    std::vector<double> progress;
    while (inspector.UpdateWindow(block, 0, 240, scratch))
        progress.push_back(inspector.Progress());
    ASSERT_EQ(progress.size(), 6u);
    EXPECT_DOUBLE_EQ(progress.front(), 120.0 / 630.0);
    EXPECT_DOUBLE_EQ(progress.back(), 1.0);
    EXPECT_EQ(block.TakeReads(), "component 0 [0, 120)\ncomponent 0 [120, 240)\ncomponent 0 [240, 360)\n"
                                 "component 0 [360, 480)\ncomponent 0 [480, 600)\ncomponent 0 [600, 630)\n");
    ExpectNear(inspector.Values().Mean, inspector.Values().StandardDeviation, Naive(samples, 240));

    block.Append(Wave(3));
    block.TrimHead(3);
    EXPECT_TRUE(inspector.UpdateWindow(block, 0, 240, scratch));
    EXPECT_EQ(block.TakeReads(), "component 0 [630, 633)\n") << "no sample is read twice";
}

TEST(Inspector, StartsAnewWhenTheWindowIsNoLongerTheSame)
{
    struct Case
    {
        const char* pName;
        std::int64_t Window;
        std::int64_t TrimHead;
        std::int64_t TrimEnd;
        std::int64_t Append;
        const char* pReads;
        std::int64_t Prepend = 0;
    };
    const Case cases[] = {
        {"unchanged", 50, 0, 0, 0, ""},
        {"more data", 50, 0, 0, 10, "component 0 [100, 110)\n"},
        {"another window", 60, 0, 0, 0, "component 0 [0, 100)\n"},
        {"data went back", 50, 0, 20, 0, "component 0 [0, 80)\n"},
        {"a hole in the data", 50, 105, 0, 110, "component 0 [105, 210)\n"},
        {"more history", 150, 0, 0, 0, "component 0 [-20, 100)\n", 20},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        MemoryBlock block(1, Period);
        std::vector<float> samples = Ramp(0, 100);
        block.Append(samples);
        VTraceInspector inspector;
        std::vector<float> scratch;
        ASSERT_TRUE(inspector.UpdateWindow(block, 0, rCase.Prepend > 0 ? rCase.Window : 50, scratch));
        block.TakeReads();
        block.Append(Ramp(100, 100 + rCase.Append));
        block.Prepend(Ramp(-rCase.Prepend, 0));
        block.TrimHead(rCase.TrimHead);
        block.TrimEnd(rCase.TrimEnd);
        inspector.UpdateWindow(block, 0, rCase.Window, scratch);
        EXPECT_EQ(block.TakeReads(), rCase.pReads);
        const auto expected = Naive(Ramp(block.First(), block.End()), static_cast<std::size_t>(rCase.Window));
        ExpectNear(inspector.Values().Mean, inspector.Values().StandardDeviation, expected);
        EXPECT_EQ(inspector.Progress(), 1.0);
    }
}

TEST(Inspector, ProgressIsOneOnlyWhereAllWasTakenIn)
{
    MemoryBlock block(1, Period);
    block.Append(Wave(3 * 120));
    VTraceInspector inspector;
    std::vector<float> scratch;
    for (int call = 1; inspector.UpdateWindow(block, 0, 10'000, scratch); ++call)
    {
        const double taken = std::min(120.0 * call, static_cast<double>(block.End()));
        EXPECT_DOUBLE_EQ(inspector.Progress(), taken / static_cast<double>(block.End())) << call;
        if (call < 4)
            block.Append(Wave(30));
    }
    EXPECT_EQ(inspector.Progress(), 1.0);
}

TEST(Inspector, FollowsBlocksOfAnyPeriodAndPlace)
{
    struct Case
    {
        const char* pName;
        std::int64_t Period;
        std::int64_t FirstSample;
    };
    const Case cases[] = {
        {"before time zero", Period, -200},
        {"slower than a second", 3 * VTraceInspector::TicksPerAdvance, 5},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        MemoryBlock block(1, rCase.Period);
        const std::vector<float> samples = Wave(150);
        block.Replace(rCase.FirstSample, samples);
        VTraceInspector inspector;
        std::vector<float> scratch;
        int calls = 0;
        while (calls < 1000 && inspector.UpdateWindow(block, 0, 100, scratch))
            ++calls;
        EXPECT_LT(calls, 1000);
        ExpectNear(inspector.Values().Mean, inspector.Values().StandardDeviation, Naive(samples, 100));
        EXPECT_EQ(inspector.Progress(), 1.0);
    }
}

TEST(Inspector, AFailedReadOnlySkipsACall)
{
    MemoryBlock block(1, Period);
    block.Append(Ramp(0, 100));
    VTraceInspector inspector;
    std::vector<float> scratch;
    block.bFail = true;
    EXPECT_FALSE(inspector.UpdateWindow(block, 0, 100, scratch));
    EXPECT_TRUE(std::isnan(inspector.Values().Mean));
    block.bFail = false;
    EXPECT_TRUE(inspector.UpdateWindow(block, 0, 100, scratch));
    EXPECT_FLOAT_EQ(inspector.Values().Mean, 49.5f);
}
