#include "GraphPlotSystem/MemoryBlock.h"
#include "support/ManualPostalService.h"

#include "CoreGraphics/RenderContext.h"
#include "GraphPlotSystem/Traces/VTraceDataProvider.h"

#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <limits>
#include <sstream>
#include <string>
#include <vector>

using GraphPlotUI::Colour4f;
using GraphPlotUI::TraceRenderInfo;
using GraphPlotUI::VTraceDataProvider;
using TestSupport::Gap;
using TestSupport::MemoryBlock;
using TestSupport::Ramp;
using TQL::IChannelInstanceId;
using TQL::IResult;
using TQL::ITraceId;
namespace Result = TQL::Result;

namespace
{

IChannelInstanceId Channel(std::uint64_t i_Number, std::string i_Type = "Marker")
{
    return {"Take 1", std::move(i_Type), i_Number, 0, ""};
}

constexpr Colour4f Red = {1, 0, 0, 1};
constexpr Colour4f Green = {0, 1, 0, 1};
constexpr Colour4f Blue = {0, 0, 1, 1};
constexpr Colour4f Grey = {0.5f, 0.5f, 0.5f, 1};

std::string ColourName(const Colour4f& i_rColour)
{
    return i_rColour == Red ? "red" : i_rColour == Green ? "green" : i_rColour == Blue ? "blue" : "grey";
}

} // namespace

class Provider : public ::testing::Test
{
protected:
    Provider()
    {
        const auto count = [this](char i_Letter)
        {
            return [this, i_Letter]
            {
                m_Signals += i_Letter;
            };
        };
        m_Provider.DataChanged()->AddDirect(count('d'));
        m_Provider.ValueRangeChanged()->AddDirect(count('v'));
        m_Provider.ColoursChanged()->AddDirect(count('c'));
        m_Provider.InspectionChanged()->AddDirect(count('i'));
    }

    void Update(const IChannelInstanceId& i_rChannel, const MemoryBlock& i_rBlock)
    {
        m_Provider.UpdateTrace(i_rChannel, i_rBlock, i_rBlock.Range(), i_rBlock.Range(), 0);
    }

    /// Which signals were raised since the last call: d data, v values, c colours, i inspection.
    std::string TakeSignals() { return std::exchange(m_Signals, {}); }

    std::string RangeText(const std::vector<ITraceId>& i_rTraces) const
    {
        GraphPlotUI::ValueRange range;
        m_Provider.GetValueRange(range, i_rTraces);
        std::ostringstream text;
        text << range.Minimum << " to " << range.Maximum;
        return text.str();
    }

    std::string TracesText() const
    {
        std::vector<ITraceId> traces;
        m_Provider.GetTraces(traces);
        EXPECT_EQ(traces.size(), m_Provider.GetTraceCount());
        std::string text;
        for (const ITraceId& rTrace : traces)
            text += std::to_string(rTrace.Channel().First) + "." + std::to_string(rTrace.Component()) + " ";
        return text;
    }

    IResult InfoResult(const IChannelInstanceId& i_rChannel)
    {
        IResult result;
        TraceRenderInfo info;
        m_Provider.GetTraceRenderInfo(result, i_rChannel, info);
        return result;
    }

    std::string ColourOf(const ITraceId& i_rTrace) const
    {
        Colour4f colour = {};
        m_Provider.GetTraceColour(colour, i_rTrace);
        return ColourName(colour);
    }

    IResult Assign(const ITraceId& i_rTrace, std::uint32_t i_Components = 0)
    {
        IResult result;
        if (i_Components == 0)
            m_Provider.AssignTraceColour(result, i_rTrace);
        else
            m_Provider.AssignChannelColour(result, i_rTrace, i_Components);
        return result;
    }

    std::shared_ptr<TestSupport::ManualPostalService> m_pUi = std::make_shared<TestSupport::ManualPostalService>();
    VTraceDataProvider m_Provider{m_pUi};
    std::string m_Signals;
};

TEST_F(Provider, ValueRangesArePadded)
{
    const float infinity = std::numeric_limits<float>::infinity();
    struct Case
    {
        const char* pName;
        std::vector<float> Samples;
        const char* pRange;
        const char* pType = "Marker";
    };
    const Case cases[] = {
        {"span", {0, 10, 5}, "-0.5 to 10.5"},
        {"constant", {5, 5, 5}, "0 to 10"},
        {"negative constant", {-2}, "-4 to 0"},
        {"zero", {0, 0}, "-1 to 1"},
        {"gaps do not count", {Gap, 2, Gap, 4, Gap}, "1.9 to 4.1"},
        {"only gaps", {Gap, Gap}, "0 to 1"},
        {"infinite", {1, infinity}, "0 to 1"},
        {"fixed for monitors", {100, 200}, "-0.05 to 1.05", "Monitor"},
    };
    std::uint64_t number = 0;
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        MemoryBlock block;
        block.Append(rCase.Samples);
        const IChannelInstanceId channel = Channel(++number, rCase.pType);
        Update(channel, block);
        EXPECT_EQ(RangeText({{channel, 0}}), rCase.pRange);
    }
    EXPECT_EQ(RangeText({}), "0 to 1");
    EXPECT_EQ(RangeText({{Channel(99), 0}}), "0 to 1");
    EXPECT_EQ(RangeText({{Channel(1), 0}, {Channel(3), 0}}), "-2.6 to 10.6") << "together";
    EXPECT_EQ(RangeText({{Channel(1), 0}, {Channel(6), 0}}), "-0.5 to 10.5") << "one without values adds nothing";
}

TEST_F(Provider, ValueRangesFollowTheBlockAndRememberAllTime)
{
    const ITraceId trace(Channel(1), 0);
    MemoryBlock block;
    block.Append({100, 0, 10});
    Update(Channel(1), block);
    block.TrimHead(1);
    Update(Channel(1), block);
    EXPECT_EQ(RangeText({trace}), "-0.5 to 10.5") << "what the block holds now";
    block.Append({Gap, Gap});
    block.TrimHead(2);
    Update(Channel(1), block);
    EXPECT_EQ(RangeText({trace}), "-5 to 105") << "without any, all that was ever seen";
}

TEST_F(Provider, SignalsTellWhatChanged)
{
    MemoryBlock block(2);
    block.Append({1, 10, 2, 20});
    Update(Channel(1), block);
    EXPECT_EQ(TakeSignals(), "d") << "components were added";
    Update(Channel(1), block);
    EXPECT_EQ(TakeSignals(), "");
    block.Append({1.5f, 15});
    Update(Channel(1), block);
    EXPECT_EQ(TakeSignals(), "") << "new samples inside the range of values";
    block.Append({1.5f, 25});
    Update(Channel(1), block);
    EXPECT_EQ(TakeSignals(), "v");

    MemoryBlock plain(1, 10, 0);
    plain.Append({1, 2});
    Update(Channel(2), plain);
    EXPECT_EQ(TakeSignals(), "") << "a block without summary levels is not plotted";
    EXPECT_EQ(TracesText(), "1.0 1.1 ");
    EXPECT_EQ(m_pUi->Pending(), 0u);

    int notices = 0;
    m_Provider.DataChanged()->Add([&notices] { ++notices; });
    Update(Channel(3), block);
    EXPECT_EQ(notices, 0);
    m_pUi->RunAll();
    EXPECT_EQ(notices, 1) << "by default through the service of the user interface";
}

TEST_F(Provider, RemovalWaitsForTheRenderThread)
{
    MemoryBlock block(2);
    block.Append({1, 10, 2, 20});
    for (const std::uint64_t number : {2, 1, 3})
        Update(Channel(number), block);
    const std::vector<Colour4f> palette = {Red, Green, Blue};
    m_Provider.SetPalette(palette);
    EXPECT_EQ(Assign({Channel(2), 0}, 2), Result::Ok);
    EXPECT_EQ(TracesText(), "1.0 1.1 2.0 2.1 3.0 3.1 ");
    EXPECT_EQ(InfoResult(Channel(9)), Result::NotFound);
    EXPECT_EQ(InfoResult(Channel(2)), Result::Ok);

    TakeSignals();
    m_Provider.RemoveTraces([](const IChannelInstanceId& i_rChannel) { return i_rChannel.First == 2; });
    EXPECT_EQ(TakeSignals(), "dci");
    EXPECT_EQ(TracesText(), "1.0 1.1 3.0 3.1 ");
    EXPECT_EQ(InfoResult(Channel(2)), Result::NotAvailable);
    EXPECT_EQ(ColourOf({Channel(2), 1}), "grey");
    EXPECT_EQ(Assign({Channel(3), 0}), Result::Ok);
    EXPECT_EQ(ColourOf({Channel(3), 0}), "red") << "its colour is free again";

    TakeSignals();
    Update(Channel(2), block);
    EXPECT_EQ(TakeSignals(), "") << "a removed channel does not come back";
    EXPECT_EQ(InfoResult(Channel(2)), Result::NotAvailable);

    m_Provider.RemoveTrace(Channel(9));
    EXPECT_EQ(TakeSignals(), "");
    m_Provider.RemoveTrace(Channel(1));
    EXPECT_EQ(TakeSignals(), "dci");
    m_Provider.Clear();
    EXPECT_EQ(TakeSignals(), "dci");
    EXPECT_EQ(TracesText(), "");

    CoreGraphics::RenderContext context; // nothing is left to upload, so OpenGL is not asked
    m_Provider.UpdateTextures(context);
    EXPECT_EQ(InfoResult(Channel(2)), Result::NotFound);
    Update(Channel(2), block);
    EXPECT_EQ(TakeSignals(), "d") << "until the render thread has been there";
    EXPECT_EQ(TracesText(), "2.0 2.1 ");
}

TEST_F(Provider, RevisionCountsWhatAFrameShows)
{
    MemoryBlock block;
    block.Append({1, 2, 3});
    IResult result;
    const std::vector<Colour4f> palette = {Red};
    struct Case
    {
        const char* pName;
        std::function<void()> Change;
        bool bShown = true;
    };
    const auto update = [&]
    {
        Update(Channel(1), block);
    };
    const Case cases[] = {
        {"rows", update},
        {"no new rows", update, false},
        {"a read that failed",
         [&]
         {
             block.Append({4});
             block.bFail = true;
             update();
             block.bFail = false;
         },
         false},
        {"one more row", update},
        {"another limit",
         [&]
         {
             m_Provider.UpdateTrace(Channel(1), block, {0, 20}, {0, 20}, 0);
         }},
        {"latest frame",
         [&]
         {
             m_Provider.SetLatestFrame(5);
         }},
        {"the same frame", [&] { m_Provider.SetLatestFrame(5); }, false},
        {"frame period",
         [&]
         {
             m_Provider.SetTicksPerFrame(10);
         }},
        {"palette",
         [&]
         {
             m_Provider.SetPalette(palette);
         }},
        {"the same palette", [&] { m_Provider.SetPalette(palette); }, false},
        {"colour",
         [&]
         {
             EXPECT_EQ(Assign({Channel(1), 0}), Result::Ok);
         }},
        {"a second colour for it",
         [&] {
             EXPECT_EQ(Assign({Channel(1), 0}), Result::OkButNoEffect);
         },
         false},
        {"no colours",
         [&]
         {
             m_Provider.ResetColours();
         }},
        {"inspection", [&] { m_Provider.SetInspectionTime(1.0); }, false},
        {"lost textures",
         [&]
         {
             m_Provider.ReleaseTextures();
         }},
        {"removed",
         [&]
         {
             m_Provider.RemoveTrace(Channel(1));
         }},
        {"a channel that waits for its release", update, false},
        {"all removed",
         [&]
         {
             m_Provider.Clear();
         }},
    };
    for (const Case& rCase : cases)
    {
        const std::uint64_t before = m_Provider.GetRevision();
        rCase.Change();
        EXPECT_EQ(m_Provider.GetRevision() != before, rCase.bShown) << rCase.pName;
    }
}

TEST_F(Provider, ColoursGoToTracesSmallestFirst)
{
    const std::vector<Colour4f> palette = {Red, Green, Blue};
    EXPECT_EQ(Assign({Channel(1), 0}), Result::NotAvailable) << "no palette yet";
    m_Provider.SetPalette(palette);
    EXPECT_EQ(TakeSignals(), "c");

    EXPECT_EQ(Assign({Channel(1), 0}, 3), Result::Ok);
    EXPECT_EQ(Assign({Channel(1), 0}, 3), Result::OkButNoEffect);
    EXPECT_EQ(Assign({Channel(1), 2}, 3), Result::OkButNoEffect) << "it shares the colour of its channel";
    EXPECT_EQ(Assign({Channel(2), 2}, 3), Result::Ok) << "component 0 is not enabled yet";
    EXPECT_EQ(TakeSignals(), "cc");
    EXPECT_EQ(ColourOf({Channel(1), 1}), "red");
    EXPECT_EQ(ColourOf({Channel(2), 1}), "green");
    EXPECT_EQ(ColourOf({Channel(2), 0}), "grey");
    EXPECT_EQ(Assign({Channel(2), 0}, 3), Result::Ok);
    EXPECT_EQ(ColourOf({Channel(2), 0}), "blue");
    EXPECT_EQ(ColourOf({Channel(2), 1}), "green") << "those that have one keep it";
    EXPECT_EQ(Assign({Channel(3), 0}), Result::NotAvailable);

    TakeSignals();
    m_Provider.SetPalette(palette);
    EXPECT_EQ(TakeSignals(), "") << "the same palette changes nothing";
    EXPECT_EQ(ColourOf({Channel(1), 0}), "red");
    m_Provider.SetPalette(std::vector<Colour4f>{Blue, Red});
    EXPECT_EQ(TakeSignals(), "c");
    EXPECT_EQ(ColourOf({Channel(1), 0}), "grey");
    EXPECT_EQ(Assign({Channel(3), 1}), Result::Ok);
    EXPECT_EQ(ColourOf({Channel(3), 1}), "blue");
    m_Provider.ResetColours();
    EXPECT_EQ(ColourOf({Channel(3), 1}), "grey");
}

TEST_F(Provider, InspectsTheChosenTraces)
{
    MemoryBlock block(2);
    block.Append({1, 10, 2, 20, 3, 30, 4, 40});
    Update(Channel(1), block);
    m_Provider.SetTicksPerFrame(10);
    const std::vector<ITraceId> traces = {{Channel(1), 0}, {Channel(1), 1}, {Channel(2), 0}};
    IResult result;
    const auto inspect = [&]
    {
        m_Provider.InspectTrace(Channel(1), block, 0, 4);
        m_Provider.InspectTrace(Channel(3), block, 0, 4);
        std::vector<GraphPlotUI::TraceInspectionValues> values(traces.size());
        float progress = 0.0f;
        m_Provider.GetInspectionValues(result, traces, values, progress);
        std::ostringstream text;
        for (const GraphPlotUI::TraceInspectionValues& rValue : values)
            if (rValue.bValid)
                text << rValue.Value << " of " << rValue.Mean << " ";
            else
                text << "none ";
        text << progress;
        return text.str();
    };
    TakeSignals();
    EXPECT_EQ(inspect(), "none none none 1");
    EXPECT_EQ(TakeSignals(), "");

    m_Provider.SetInspectedTraces(result, traces);
    m_Provider.SetInspectionTime(1.0);
    EXPECT_EQ(inspect(), "2 of 2.5 20 of 25 none 1");
    EXPECT_EQ(TakeSignals(), "i");
    EXPECT_EQ(inspect(), "2 of 2.5 20 of 25 none 1");
    EXPECT_EQ(TakeSignals(), "") << "nothing new";

    m_Provider.RemoveInspectedTraces(result, std::vector<ITraceId>{traces[1]});
    m_Provider.SetInspectionTime(2.4);
    EXPECT_EQ(inspect(), "3 of 2.5 20 of 25 none 1") << "what is not inspected keeps its last numbers";
    m_Provider.ClearInspectedTraces();
    m_Provider.SetInspectionTime(0.0);
    EXPECT_EQ(inspect(), "3 of 2.5 20 of 25 none 1");
    m_Provider.RemoveTrace(Channel(1));
    EXPECT_EQ(inspect(), "none none none 1");

    float progress = 0.0f;
    std::vector<GraphPlotUI::TraceInspectionValues> tooFew(1);
    m_Provider.GetInspectionValues(result, traces, tooFew, progress);
    EXPECT_EQ(result, Result::InvalidArgument);
}

TEST_F(Provider, NoInspectionTimeIsTooFarAway)
{
    MemoryBlock block;
    block.Append({1, 2, 3});
    m_Provider.SetTicksPerFrame(10);
    const double infinity = std::numeric_limits<double>::infinity();
    struct Case
    {
        double Time;
        float Expected; ///< NaN: none
    };
    IResult result;
    std::uint64_t number = 0;
    for (const Case& rCase : {Case{1.0, 2.0f}, Case{std::nan(""), 2.0f}, Case{1e300, Gap}, Case{-1e300, Gap},
                              Case{infinity, Gap}, Case{-infinity, Gap}, Case{1e17, Gap}})
    {
        const ITraceId trace(Channel(++number), 0);
        m_Provider.SetInspectedTraces(result, std::span(&trace, 1));
        m_Provider.SetInspectionTime(rCase.Time);
        for (const std::int64_t base : {std::int64_t{0}, std::int64_t{-10} << 50})
            m_Provider.InspectTrace(trace.Channel(), block, base, 4);
        GraphPlotUI::TraceInspectionValues values;
        float progress = 0.0f;
        m_Provider.GetInspectionValues(result, std::span(&trace, 1), std::span(&values, 1), progress);
        EXPECT_TRUE(std::isnan(rCase.Expected) ? std::isnan(values.Value) : values.Value == rCase.Expected)
            << rCase.Time << " gives " << values.Value;
    }
}

TEST_F(Provider, FramesAndTicksPassThrough)
{
    std::int64_t ticks = 0;
    m_Provider.GetTicksPerFrame(ticks);
    EXPECT_EQ(ticks, 1'125'000);
    EXPECT_EQ(m_Provider.GetLatestFrameIndex(), 0);
    m_Provider.SetTicksPerFrame(2'250'000);
    m_Provider.SetLatestFrame(77);
    m_Provider.GetTicksPerFrame(ticks);
    EXPECT_EQ(ticks, 2'250'000);
    EXPECT_EQ(m_Provider.GetLatestFrameIndex(), 77);
}
