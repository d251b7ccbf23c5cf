#include "GraphPlotUI/Geometry/AxisRange.h"

#include <gtest/gtest.h>

#include <limits>
#include <vector>

using namespace GraphPlotUI;

namespace
{

constexpr double Infinity = std::numeric_limits<double>::infinity();

struct Divisions
{
    double Major = -1.0;
    double Minor = -1.0;
    double Fade = -1.0;
    std::vector<float> Values;
    std::vector<int> Majors; ///< positions among the values
};

Divisions Divide(const AxisRange& i_rRange, EDivisionMode i_Mode = EDivisionMode::MajorAndMinor)
{
    Divisions divisions;
    DivideRange(
        i_rRange, i_Mode,
        [&](float i_Value, bool i_bIsMajor)
        {
            if (i_bIsMajor)
                divisions.Majors.push_back(static_cast<int>(divisions.Values.size()));
            divisions.Values.push_back(i_Value);
        },
        divisions.Major, divisions.Minor, divisions.Fade);
    return divisions;
}

} // namespace

TEST(AxisRangeTest, ConvertsBetweenValuesAndPixels)
{
    const AxisRange range{-20.0, 30.0, 100};
    EXPECT_EQ(range.UnitsPerPixel(), 0.5);
    EXPECT_EQ(range.PixelsPerUnit(), 2.0);
    EXPECT_EQ(range.ValueToPixels(-5.0), 30.0);
    EXPECT_EQ(range.PixelsToValue(30.0), -5.0);

    EXPECT_EQ((AxisRange{0.0, 1.0, 0}.UnitsPerPixel()), 0.0);
    EXPECT_EQ((AxisRange{3.0, 3.0, 10}.PixelsPerUnit()), 0.0);
}

TEST(AxisRangeTest, FindsRoundDivisions)
{
    struct Case
    {
        AxisRange Range;
        double Minor;
        double Major;
        int Subdivisions;
        double Fade;
    };
    const Case cases[] = {
        {{0.0, 1.0, 1000}, 0.05, 0.2, 4, 1.0},
        {{0.0, 100.0, 1000}, 5.0, 20.0, 4, 1.0}, // gap 1, equal to the power of ten
        {{0.0, 30.0, 1000}, 1.0, 5.0, 5, 0.14 / 0.24},
        {{0.0, 10.0, 1000}, 0.2, 1.0, 5, 0.025 / 0.075}, // gap 0.1, an odd power of ten: step 0.05
        {{0.0, 3.0, 1000}, 0.05, 0.2, 4, 0.004 / 0.024},
        {{0.0, 499.9, 1000}, 5.0, 20.0, 4, 0.0}, // minors all but ten pixels apart
        {{0.0, 500.0, 1000}, 20.0, 100.0, 5, 1.0},
        {{-3000.0, 0.0, 1000}, 100.0, 500.0, 5, 0.14 / 0.24},
        {{1e6, 1e6 + 1.0, 1000}, 0.05, 0.2, 4, 1.0},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.Range.Maximum);
        double major = 0.0;
        double minor = 0.0;
        double fade = 0.0;
        int subdivisions = 0;
        ASSERT_TRUE(FindDivisions(rCase.Range, major, minor, subdivisions, fade));
        EXPECT_NEAR(minor, rCase.Minor, 1e-9);
        EXPECT_NEAR(major, rCase.Major, 1e-9);
        EXPECT_EQ(subdivisions, rCase.Subdivisions);
        EXPECT_NEAR(fade, rCase.Fade, 1e-3);
    }
}

TEST(AxisRangeTest, LeavesTheOutputsOfARangeThatCannotBeDivided)
{
    const AxisRange cases[] = {
        {0.0, 1.0, 0}, {0.0, 1.0, -5}, {2.0, 2.0, 100}, {0.0, Infinity, 100}, {-Infinity, Infinity, 100}};
    for (const AxisRange& rRange : cases)
    {
        double major = 7.0;
        double minor = 8.0;
        double fade = 9.0;
        int subdivisions = 10;
        EXPECT_FALSE(FindDivisions(rRange, major, minor, subdivisions, fade));
        DivideRange(
            rRange, EDivisionMode::MajorAndMinor, [](float, bool) { FAIL(); }, major, minor, fade);
        EXPECT_EQ(major, 7.0);
        EXPECT_EQ(minor, 8.0);
        EXPECT_EQ(fade, 9.0);
        EXPECT_EQ(subdivisions, 10);
    }
}

TEST(AxisRangeTest, CallsBackInOrderFromBelowTheRangeToAboveIt)
{
    const Divisions divisions = Divide({0.0, 1.0, 1000});
    ASSERT_EQ(divisions.Values.size(), 32u);
    EXPECT_NEAR(divisions.Values.front(), -0.2, 1e-6);
    EXPECT_NEAR(divisions.Values.back(), 1.35, 1e-6);
    for (std::size_t i = 1; i < divisions.Values.size(); ++i)
        EXPECT_NEAR(divisions.Values[i] - divisions.Values[i - 1], 0.05, 1e-6);
    EXPECT_EQ(divisions.Majors, (std::vector<int>{0, 4, 8, 12, 16, 20, 24, 28}));
}

TEST(AxisRangeTest, FirstDivisionBelowANegativeMinimum)
{
    // fmod keeps the sign of the minimum, so the run starts one major below the multiple above it.
    const Divisions divisions = Divide({-103.0, -3.0, 1000});
    EXPECT_EQ(divisions.Major, 20.0);
    EXPECT_EQ(divisions.Values.front(), -120.0f);
    EXPECT_EQ(divisions.Values.back(), 35.0f);
    EXPECT_EQ(divisions.Majors.front(), 0);

    EXPECT_EQ(Divide({-100.0, 0.0, 1000}).Values.front(), -120.0f);
    EXPECT_EQ(Divide({7.0, 107.0, 1000}).Values.front(), -20.0f);
}

TEST(AxisRangeTest, MajorOnlyLeavesTheMinorsOut)
{
    const Divisions divisions = Divide({0.0, 100.0, 1000}, EDivisionMode::MajorOnly);
    EXPECT_EQ(divisions.Values, (std::vector<float>{-20, 0, 20, 40, 60, 80, 100, 120, 140}));
    EXPECT_EQ(divisions.Majors.size(), divisions.Values.size());
    EXPECT_EQ(divisions.Minor, 5.0);
}

TEST(AxisRangeTest, NarrowRangesGetFinerMajors)
{
    struct Case
    {
        AxisRange Range;
        double Major;
        double Minor;
        bool bMinors;
    };
    const Case cases[] = {
        // gap 1: minor 5, major 20. Two majors, 100 and 120, fit: nothing is refined.
        {{100.0, 120.0, 200}, 20.0, 5.0, true},
        // Only 100 fits: major 5, minor 1, which is exactly the gap and still drawn.
        {{95.0, 105.0, 100}, 5.0, 1.0, true},
        // One refinement does not do: the second one divides the other way round.
        {{0.1, 0.9, 27}, 0.25, 0.05, false},
        // Two refinements at most, then it stays as it is.
        {{0.11, 0.14, 10}, 0.01, 0.0025, false},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.Range.Maximum);
        const Divisions divisions = Divide(rCase.Range);
        EXPECT_NEAR(divisions.Major, rCase.Major, 1e-9);
        EXPECT_NEAR(divisions.Minor, rCase.Minor, 1e-9);
        ASSERT_GE(divisions.Values.size(), 2u);
        const float step = divisions.Values[1] - divisions.Values[0];
        EXPECT_NEAR(step, rCase.bMinors ? rCase.Minor : rCase.Major, 1e-6);
    }
}

TEST(AxisRangeTest, EndsWhereAStepIsLostInRounding)
{
    const Divisions divisions = Divide({1e17, 1e17 + 16.0, 1000});
    EXPECT_LE(divisions.Values.size(), 3u);
}

TEST(AxisRangeTest, PanOffsetKeepsTicksOnMultiplesOfTheMajor)
{
    struct Case
    {
        const char* pName;
        bool bLive;
        bool bRelative;
        double Minimum;
        double Offset;
        double FirstTick;
        float Translation;
    };
    const Case cases[] = {
        {"review", false, false, 1234.0, 0.0, 1100.0, 1100.0f},
        {"review, relative", false, true, 1234.0, 0.0, 1100.0, 1100.0f},
        {"live, relative: ticks stand still", true, true, -1200.0, 7777.0, -1300.0, -1300.0f},
        {"live, absolute: ticks move with the frames", true, false, -1200.0, 7777.0, -1377.0, -1377.0f},
        {"live, before frame 0", true, false, -1200.0, 50.0, -1250.0, -1250.0f},
        {"an offset without a live context", false, false, -1200.0, 7777.0, -1377.0, 6400.0f},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        double firstTick = 0.0;
        QVector3D translation;
        PanOffset({rCase.Minimum, rCase.Minimum + 1000.0, 1000}, rCase.bLive, rCase.bRelative, rCase.Offset, 100.0,
                  firstTick, translation);
        EXPECT_DOUBLE_EQ(firstTick, rCase.FirstTick);
        EXPECT_EQ(translation, QVector3D(rCase.Translation, 0.0f, 0.0f));
    }
}

TEST(AxisRangeTest, MinorsFadeInExponentially)
{
    EXPECT_FLOAT_EQ(MinorAlpha(1.0), 1.0f);
    EXPECT_FLOAT_EQ(MinorAlpha(0.5), 0.0067379470f);
    EXPECT_FLOAT_EQ(MinorAlpha(0.0), 4.539993e-5f);
}
