#include "GraphPlotUI/Traces/TraceStrips.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

using namespace GraphPlotUI;

TEST(TraceStripsTest, StripsAreAsWideAsTheirRowsAllow)
{
    struct Case
    {
        float RowDistance;
        float Thickness;
        int Width;
    };
    const Case cases[] = {
        {0.51f, 1.5f, 4},
        {0.6554f, 1.5f, 8},
        {0.95f, 1.5f, 12},
        {1.2f, 1.5f, 16},
        {2.0f, 1.5f, 16},
        {2.01f, 1.5f, 0}, // single rows are quicker
        {0.3f, 1.5f, 0},  // too many rows
        {0.51f, 2.5f, 4},
        {0.6554f, 2.5f, 4},
        {0.95f, 2.5f, 8},
        {0.0f, 1.5f, 0},
        {std::numeric_limits<float>::quiet_NaN(), 1.5f, 0},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(StripWidth(rCase.RowDistance, rCase.Thickness), rCase.Width)
            << rCase.RowDistance << " " << rCase.Thickness;
}

TEST(TraceStripsTest, AStripHasRoomForEveryRowInReach)
{
    for (const float thickness : {1.5f, 2.5f})
        for (float distance = 0.3f; distance < 2.0f; distance += 0.013f)
        {
            const int width = StripWidth(distance, thickness);
            // Rows at the distance from each other between a thickness left of the first pixel centre and as much right
            // of the last one.
            const float span = static_cast<float>(width - 1) + 2.0f * thickness;
            EXPECT_TRUE(width == 0 || std::floor(span / distance) + 1.0f <= 16.0f) << distance;
        }
}

TEST(TraceStripsTest, StripsStartAtMultiplesOfFourAndCoverTheViewport)
{
    struct Case
    {
        QRect Viewport;
        int Width;
        int Origin;
        int Count;
        RowRange Inside; ///< of all strips
    };
    const Case cases[] = {
        {{0, 0, 64, 10}, 8, 0, 8, {0, 8}},   {{8, 0, 64, 10}, 8, 0, 8, {0, 8}},  {{3, 0, 64, 10}, 8, -3, 9, {1, 7}},
        {{-1, 0, 64, 10}, 8, -3, 9, {1, 7}}, {{1, 0, 63, 10}, 8, -1, 8, {1, 7}}, {{0, 0, 5, 10}, 8, 0, 1, {0, 0}},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(testing::Message() << rCase.Viewport.left() << " " << rCase.Viewport.width());
        const StripLayout layout = MakeStripLayout(rCase.Viewport, rCase.Width);
        EXPECT_EQ(layout.Origin, rCase.Origin);
        EXPECT_EQ(layout.Count, rCase.Count);
        const RowRange inside = layout.Inside({0, layout.Count}, rCase.Viewport.width());
        EXPECT_EQ(inside, rCase.Inside) << inside.First << " " << inside.Count;
    }
}

TEST(TraceStripsTest, StripsThatNoRowReachesAreLeftOut)
{
    const StripLayout layout = MakeStripLayout(QRect(0, 0, 80, 10), 8);
    const auto strips = [&](float i_Start, float i_Length, std::uint32_t i_Count)
    {
        ChannelDraw channel;
        channel.AxisStart = i_Start;
        channel.AxisLength = i_Length;
        channel.Info.SampleCount = i_Count;
        return VisibleStrips(layout, channel, 80.0f, 2.0f);
    };
    EXPECT_EQ(strips(0.0f, 80.0f, 81), (RowRange{0, 10}));
    EXPECT_EQ(strips(-40.0f, 80.0f, 10), (RowRange{4, 3})); // pixels 38 to 51
    EXPECT_EQ(strips(-200.0f, 80.0f, 10).Count, 0);
    EXPECT_EQ(strips(200.0f, 80.0f, 10).Count, 0);
    EXPECT_EQ(strips(0.0f, 80.0f, 0).Count, 0);
}
