#include "Channels/Contexts/VLiveContext.h"
#include "Channels/Contexts/VLiveMonitors.h"
#include "Channels/VChannelService.h"
#include "Reference.h"

#include <array>
#include <cstdio>
#include <string>

namespace ChannelsTest
{

namespace
{

using Channels::ChannelRows;
using Channels::VFrameRateMeter;
using Channels::VLiveContext;
using Channels::VLiveMonitors;
using std::chrono::milliseconds;

std::string Text(float i_Value)
{
    char text[32];
    std::snprintf(text, sizeof(text), "%.2f", static_cast<double>(i_Value));
    return std::isnan(i_Value) ? "-" : text;
}

/// The samples that a channel holds, in the order of time.
std::string SamplesOf(const std::shared_ptr<TQL::IChannel>& i_rpChannel)
{
    const auto pBlock = i_rpChannel->GetOutput()->GetBlock();
    TQL::TickRange range;
    pBlock->GetRange(range);
    std::vector<float> values(static_cast<std::size_t>((range.Last - range.First) / TQL::DefaultFramePeriod));
    EXPECT_TRUE(pBlock->ReadSamples(range, values).IsSuccess());
    std::string text = std::to_string(range.First / TQL::DefaultFramePeriod) + ":";
    for (const float value : values)
        text += " " + Text(value);
    return text;
}

} // namespace

TEST(FrameRateMeter, TellsHowFastFramesCame)
{
    struct Step
    {
        int Times;
        milliseconds After; ///< each
        std::int64_t Frames;
        const char* pRate; ///< after the last of them
    };
    struct Case
    {
        const char* pName;
        double FramesPerSecond;
        std::vector<Step> Steps;
    };
    const std::vector<Case> cases{
        {"on time", 100.0, {{20, milliseconds(10), 1, "-"}, {30, milliseconds(10), 1, "1.00"}}},
        {"half as fast", 100.0, {{200, milliseconds(20), 1, "0.50"}}},
        {"slower and slower", 100.0, {{200, milliseconds(10), 1, "1.00"}, {60, milliseconds(25), 1, "0.40"}}},
        {"in batches", 1000.0, {{100, milliseconds(20), 20, "1.00"}}},
        {"much faster than marks are kept", 1000.0, {{5000, milliseconds(1), 1, "1.00"}}},
        {"after a pause", 100.0, {{99, milliseconds(10), 1, "1.00"}, {1, milliseconds(5000), 1, "-"}}},
        {"slow", 0.5, {{4, milliseconds(2000), 1, "1.00"}, {20, milliseconds(4000), 1, "0.50"}}},
    };
    for (const Case& rCase : cases)
    {
        VFrameRateMeter meter(rCase.FramesPerSecond);
        VFrameRateMeter::Time now(0);
        for (const Step& rStep : rCase.Steps)
        {
            float rate = NaN;
            for (int i = 0; i < rStep.Times; ++i)
                rate = meter.Add(rStep.Frames, now += rStep.After);
            EXPECT_EQ(Text(rate), rStep.pRate) << rCase.pName;
        }
    }
}

TEST(LiveMonitors, MeasureWhatACaptureAppendsAndAreFoundInEveryContext)
{
    Channels::VChannelService service;
    const auto pLive = std::make_shared<VLiveContext>("Live", service.GetSubTypes(), VLiveContext::Options{});
    std::uint32_t marker = 0, output = 0, camera = 0;
    ASSERT_TRUE(pLive->AddChannel({"Labelled Reconstructions", 0, 0, "", "Head", "mm", {}}, 0, marker).IsSuccess());
    ASSERT_TRUE(
        pLive->AddChannel({"DeviceOutput", 0, 0, "", "Fz", "N", {}}, TQL::DefaultFramePeriod / 2, output).IsSuccess());
    ASSERT_TRUE(pLive->AddChannel({"CalibratedCameraPose", 0, 0, "", "Camera", "mm", {}}, 0, camera).IsSuccess());
    const std::vector<float> markers{1, 1, 1, NaN, NaN, NaN, 1, 1, 1, NaN, NaN, NaN};
    const std::vector<float> outputs{5, 5, 5, 5, NaN, 5, NaN, 5};
    const std::vector<float> poses(4 * 6, 1.0f);
    const auto append = [&](std::int64_t i_Frame, bool i_bOutputs)
    {
        std::vector<ChannelRows> rows{{marker, markers}, {camera, poses}};
        if (i_bOutputs)
            rows.push_back({output, outputs});
        EXPECT_TRUE(pLive->AppendFrames(i_Frame, 4, rows).IsSuccess());
    };
    append(0, true); // nobody measures yet
    VFrameRateMeter::Time now(0);
    const auto pMonitors =
        std::make_shared<VLiveMonitors>(*pLive, service.GetSubTypes(), 120.0, [&now] { return now; });
    service.AddContext(pLive);
    EXPECT_EQ(service.GetChannel({"", "Monitor", 2, 0, ""}), nullptr);
    service.SetGlobalChannels(pMonitors->GetContext());
    pLive->SetMeter(pMonitors);
    append(4, true);
    now += milliseconds(1000);
    append(10, false); // two frames were lost

    const auto pRate = service.GetChannel({"", "Monitor", 1, 0, ""});
    const auto pShare = service.GetChannel({"GlobalItems", "Monitor", 2, 0, ""});
    ASSERT_TRUE(pRate && pShare);
    EXPECT_EQ(SamplesOf(pRate), "4: - - - - - - 0.03 0.03 0.03 0.03");
    EXPECT_EQ(SamplesOf(pShare), "4: 1.00 0.50 0.50 0.00 - - 0.50 0.00 0.50 0.00");
    EXPECT_EQ(service.GetChannel(pRate->GetInstanceId()), pRate);
    EXPECT_EQ(service.GetChannel({"Live", "Monitor", 1, 0, ""}), nullptr);
    const std::vector<std::string> monitor{"Monitor"};
    EXPECT_EQ(service.GetChannelTypes(0, "Elsewhere"), monitor);
    EXPECT_EQ(service.GetChannelTypes(0, "Live").size(), 4u);

    pLive->Restart(0);
    append(0, true);
    EXPECT_EQ(SamplesOf(pShare), "0: 1.00 0.50 0.50 0.00") << "with the time of the capture";

    // Another context comes and this one goes; then another capture begins.
    EXPECT_TRUE(service.RemoveContext("Live").IsSuccess());
    EXPECT_EQ(service.GetChannel({"", "Monitor", 2, 0, ""}), pShare);
    EXPECT_NE(pShare->GetOutput(), nullptr);
    service.SetGlobalChannels(VLiveMonitors(*pLive, service.GetSubTypes(), 120.0).GetContext());
    EXPECT_NE(service.GetChannel({"", "Monitor", 2, 0, ""}), pShare);
    EXPECT_EQ(pShare->GetOutput(), nullptr);
    service.SetGlobalChannels(nullptr);
    EXPECT_EQ(service.GetChannel({"", "Monitor", 2, 0, ""}), nullptr);
}

} // namespace ChannelsTest
