#include "GraphPlotUI/Traces/TraceDrawList.h"
#include "RingProvider.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace GraphPlotUI;
using namespace TestGraphPlotUI;

namespace
{

Ring MakeRing(int i_Components, int i_Rows, std::uint8_t i_Level = 0, std::int64_t i_TicksPerSample = 100)
{
    const std::vector<Row> rows(static_cast<std::size_t>(i_Rows), Row::Sample(1.0f));
    return Ring(std::vector<std::vector<Row>>(static_cast<std::size_t>(i_Components), rows), i_Level, i_TicksPerSample);
}

std::vector<TQL::ITraceId> Traces(const std::vector<std::pair<const char*, int>>& i_rTraces)
{
    std::vector<TQL::ITraceId> traces;
    for (const auto& [pChannel, component] : i_rTraces)
        traces.emplace_back(MakeChannel(pChannel), static_cast<std::uint8_t>(component));
    return traces;
}

// One word a trace: channel, component, "+" for thick, "~" for dimmed.
std::string ToText(const TraceDrawList& i_rList)
{
    std::string text;
    for (const TraceDraw& rDraw : i_rList.Draws)
    {
        text += (text.empty() ? "" : " ") + rDraw.pTrace->Channel().Text + std::to_string(rDraw.pTrace->Component());
        text += rDraw.Thickness == 2.5f ? "+" : rDraw.Thickness == 1.5f ? "" : "?";
        if (rDraw.Colour)
            text += (*rDraw.Colour)[0] == 0.65f ? "~" : "";
        else
            text += "-";
    }
    return text;
}

} // namespace

TEST(TraceDrawListTest, FocusGoesLastIsThickAndDimsTheOthers)
{
    RingProvider provider;
    provider.Add(MakeChannel("a"), MakeRing(3, 10));
    provider.Add(MakeChannel("b"), MakeRing(1, 10));
    const auto traces = Traces({{"a", 0}, {"a", 1}, {"a", 2}, {"b", 0}});
    const auto order = [&](const TraceFocus& i_rFocus)
    {
        TraceDrawList list = BuildTraceDrawList(provider, traces, i_rFocus, {0, 10, 100}, 0.0);
        for (TraceDraw& rDraw : list.Draws) // white dims to 0.65
            EXPECT_EQ((*rDraw.Colour)[3], 1.0f);
        return ToText(list);
    };
    EXPECT_EQ(order({}), "a0 a1 a2 b0");
    EXPECT_EQ(order({MakeChannel("a"), std::nullopt}), "a1~ a2~ b0~ a0+");
    EXPECT_EQ(order({std::nullopt, TQL::ITraceId(MakeChannel("a"), 1)}), "a0~ a2~ b0~ a1+");
    EXPECT_EQ(order({MakeChannel("nowhere"), std::nullopt}), "a0 a1 a2 b0");

    TQL::IChannelInstanceId other = MakeChannel("a");
    other.DataContextName = "Review"; // the same channel of another context is another one
    EXPECT_EQ(order({other, std::nullopt}), "a0 a1 a2 b0");
}

TEST(TraceDrawListTest, AsksOnceAChannelAndLeavesOutWhatHasNoData)
{
    RingProvider provider;
    provider.Add(MakeChannel("a"), MakeRing(3, 10));
    provider.Add(MakeChannel("still"), MakeRing(1, 10, 0, 0)); // no sample period
    const auto traces = Traces({{"a", 0}, {"none", 0}, {"a", 2}, {"still", 0}, {"a", 1}});
    const TraceDrawList list = BuildTraceDrawList(provider, traces, {}, {0, 10, 100}, 0.0);
    EXPECT_EQ(ToText(list), "a0 a2 a1");
    EXPECT_EQ(provider.InfoQueries, 3);
}

TEST(TraceDrawListTest, AComponentBeyondTheColoursHasNone)
{
    RingProvider provider;
    Ring ring = MakeRing(2, 10);
    ring.Info.Colours.resize(1);
    provider.Add(MakeChannel("a"), ring);
    const auto traces = Traces({{"a", 0}, {"a", 1}}); // the list refers to them
    const TraceDrawList list =
        BuildTraceDrawList(provider, traces, {MakeChannel("a"), std::nullopt}, {0, 10, 100}, 0.0);
    EXPECT_EQ(ToText(list), "a1- a0+");
}

TEST(TraceDrawListTest, AxisIsCountedInSamplesAndShiftedByOneFrame)
{
    RingProvider provider;
    provider.TicksPerFrame = 1000;
    Ring ring = MakeRing(1, 10, 3, 250); // four samples a frame
    ring.Info.OriginTick = 5000;
    provider.Add(MakeChannel("a"), ring);
    const auto traces = Traces({{"a", 0}});
    const auto axis = [&](double i_Minimum, double i_Maximum, double i_Offset)
    {
        const TraceDrawList list = BuildTraceDrawList(provider, traces, {}, {i_Minimum, i_Maximum, 100}, i_Offset);
        return list.Channels.begin()->second;
    };
    const ChannelDraw review = axis(20.0, 30.0, 0.0);
    EXPECT_EQ(review.LodScale, 8.0f);
    EXPECT_EQ(review.AxisLength, 40.0f);
    EXPECT_EQ(review.AxisStart, 60.0f - 4.0f);
    EXPECT_EQ(axis(-10.0, 0.0, 30.0).AxisStart, 56.0f);

    // A sample period that does not go into the frame: the shift is a whole number of samples.
    provider.Add(MakeChannel("a"), MakeRing(1, 10, 0, 300));
    EXPECT_FLOAT_EQ(axis(3.0, 6.0, 0.0).AxisStart, 10.0f - 3.0f);
}

TEST(TraceDrawListTest, VisibleRowsAndSegments)
{
    struct Case
    {
        const char* pName;
        float Start;
        float Length;
        float LodScale;
        RowRange Rows;
        RowRange Segments;
        RowRange StepsOfFive;
    };
    // 101 rows, 100 pixels, reach 2 pixels.
    const Case cases[] = {
        {"all", 0.0f, 100.0f, 1.0f, {0, 101}, {0, 100}, {0, 100}},
        {"middle", 40.0f, 20.0f, 1.0f, {40, 21}, {39, 22}, {39, 26}},
        {"level 2", 160.0f, 80.0f, 4.0f, {40, 21}, {39, 22}, {39, 26}},
        {"left of the view", 110.0f, 50.0f, 1.0f, {101, 0}, {100, 0}, {100, 0}},
        {"right of the view", -60.0f, 50.0f, 1.0f, {0, 0}, {0, 0}, {0, 4}},
        {"between two rows", 50.2f, 0.5f, 1.0f, {51, 0}, {50, 1}, {50, 5}},
        {"cannot be told", 0.0f, 0.0f, 1.0f, {0, 101}, {0, 100}, {0, 100}},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        ChannelDraw channel;
        channel.Info.SampleCount = 101;
        channel.LodScale = rCase.LodScale;
        channel.AxisStart = rCase.Start;
        channel.AxisLength = rCase.Length;
        const RowRange rows = VisibleRows(channel, 100.0f, 2.0f);
        EXPECT_EQ(rows, rCase.Rows) << rows.First << " " << rows.Count;
        const RowRange segments = VisibleSegments(rows, 101, 1);
        EXPECT_EQ(segments, rCase.Segments) << segments.First << " " << segments.Count;
        const RowRange steps = VisibleSegments(rows, 101, 5);
        EXPECT_EQ(steps, rCase.StepsOfFive) << steps.First << " " << steps.Count;
    }
}

TEST(TraceDrawListTest, VisibleRowsAllowForWhatFloatsLose)
{
    // A coarse ring under a view that has been zoomed far in: a float knows positions to a few samples only.
    ChannelDraw channel;
    channel.Info.SampleCount = 4096;
    channel.LodScale = 131072.0f;
    channel.AxisStart = 4.0e8f;
    channel.AxisLength = 10.0f;
    const RowRange rows = VisibleRows(channel, 1000.0f, 2.0f);
    const RowRange segments = VisibleSegments(rows, 4096, 1);
    EXPECT_LE(segments.First, 3051); // 4e8 / 131072 = 3051.76
    EXPECT_GE(segments.First + segments.Count, 3052);
    EXPECT_LE(segments.Count, 3);
}

TEST(TraceDrawListTest, EveryStepLengthIsAllowedFor)
{
    EXPECT_EQ(VisibleSegments({10, 5}, 100, std::numeric_limits<int>::max()), (RowRange{9, 90}));
    EXPECT_EQ(VisibleSegments({0, 1}, 1, 1), (RowRange{0, 0}));
    EXPECT_EQ(VisibleSegments({0, 0}, 0, 1), (RowRange{0, 0}));
}
