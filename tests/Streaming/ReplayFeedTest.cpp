#include "Channels/Contexts/VRecordedContext.h"
#include "OscSupport.h"
#include "Simulation/RecordWalk.h"
#include "Simulation/VWalkSimulator.h"
#include "Streaming/VReplayFeed.h"

#include <cstring>

namespace StreamingTest
{

namespace
{

using Recordings::VRecording;
using Streaming::VReplayFeed;

std::shared_ptr<Channels::VLiveContext> ContextFor(const VRecording& i_rRecording)
{
    return std::make_shared<Channels::VLiveContext>("Live", std::make_shared<Channels::VSubTypeTable>(),
                                                    VReplayFeed::ContextOptions(i_rRecording));
}

std::shared_ptr<const VRecording> Walk(std::int64_t i_FirstFrame, std::int64_t i_Frames)
{
    const Simulation::VWalkSimulator simulator({2, 1});
    auto pRecording = std::make_shared<VRecording>(Simulation::RecordWalk(simulator, 0, i_Frames));
    const std::int64_t shift = i_FirstFrame * pRecording->FramePeriod;
    pRecording->Range = {shift, pRecording->Range.Last + shift};
    for (Recordings::RecordedChannel& rChannel : pRecording->Channels)
        rChannel.FirstTick = shift;
    return pRecording;
}

std::vector<float> ReadAll(const Channels::VSourceChannel& i_rChannel, const TQL::TickRange& i_rRange)
{
    const auto& rSamples = *i_rChannel.GetSamples();
    std::vector<float> values(static_cast<std::size_t>((i_rRange.Last - i_rRange.First) / rSamples.Period()) *
                              rSamples.Components());
    EXPECT_TRUE(rSamples.ReadSamples(i_rRange, values).IsSuccess());
    return values;
}

bool SameBits(const std::vector<float>& i_rLeft, const std::vector<float>& i_rRight)
{
    return i_rLeft.size() == i_rRight.size() &&
           std::memcmp(i_rLeft.data(), i_rRight.data(), i_rLeft.size() * sizeof(float)) == 0;
}

} // namespace

TEST(ReplayFeed, EqualsTheRecordingSampleForSample)
{
    const auto pRecording = Walk(30, 600);
    const Channels::VRecordedContext recorded("Live", std::make_shared<Channels::VSubTypeTable>(), pRecording);
    const auto pLive = ContextFor(*pRecording);
    VReplayFeed feed(pRecording, pLive, {});
    EXPECT_EQ(feed.Warnings(), std::vector<std::string>());
    EXPECT_EQ(feed.FramesPerSecond(), 120.0);
    EXPECT_EQ(feed.FirstFrame(), 30);
    for (std::int64_t frame = 30, step = 1; frame < 630; frame += step, step = step % 97 + 13)
        EXPECT_TRUE(feed.Produce(frame, std::min<std::int64_t>(step, 630 - frame)).IsSuccess());
    EXPECT_EQ(feed.Produce(630, 10), TQL::Result::OkButNoEffect);
    EXPECT_EQ(pLive->GetTickRange(), recorded.GetTickRange());

    const auto pExpected = recorded.GetChannels();
    ASSERT_EQ(pLive->GetChannels()->size(), pExpected->size());
    for (const auto& rpExpected : *pExpected)
    {
        const auto pChannel = pLive->FindChannel(rpExpected->GetInstanceId());
        ASSERT_TRUE(pChannel) << rpExpected->GetDefinition().Name;
        EXPECT_EQ(pChannel->GetDescription(), rpExpected->GetDescription());
        EXPECT_TRUE(
            SameBits(ReadAll(*pChannel, recorded.GetTickRange()), ReadAll(*rpExpected, recorded.GetTickRange())))
            << rpExpected->GetDefinition().Name;
    }
}

TEST(ReplayFeed, ALoopGoesOnBehindTheEnd)
{
    const auto pRecording = Walk(0, 50);
    const auto pLive = ContextFor(*pRecording);
    VReplayFeed feed(pRecording, pLive, {true});
    EXPECT_TRUE(feed.Produce(0, 130).IsSuccess());
    const std::int64_t pass = 50 * TQL::DefaultFramePeriod;
    for (const auto& rpChannel : *pLive->GetChannels())
    {
        const auto first = ReadAll(*rpChannel, {0, pass});
        EXPECT_TRUE(SameBits(first, ReadAll(*rpChannel, {pass, 2 * pass})));
        const auto third = ReadAll(*rpChannel, {2 * pass, pass * 13 / 5});
        EXPECT_TRUE(SameBits({first.begin(), first.begin() + static_cast<std::ptrdiff_t>(third.size())}, third));
    }
}

TEST(ReplayFeed, UnevenRatesAndEdgesAreLaidOnTheFrames)
{
    auto pRecording = std::make_shared<VRecording>();
    pRecording->FramePeriod = 1000;
    pRecording->Range = {1000, 5000};
    const auto add = [&](const char* i_pName, std::int64_t i_Period, std::int64_t i_First, std::vector<float> i_Values)
    {
        Recordings::RecordedChannel channel;
        channel.Name = i_pName;
        channel.ComponentNames = {""};
        channel.SamplePeriod = i_Period;
        channel.FirstTick = i_First;
        channel.Samples = std::move(i_Values);
        pRecording->Channels.push_back(channel);
    };
    add("begins late", 1000, 3000, {3, 4, 5, 6});
    add("slow", 1500, 0, {0, 1, 2, 3});
    add("rounded", 333, 999, {10, 11, 12, 13, 14, 15, 16, 17, 18});
    add("broken", 0, 0, {1});
    const auto pLive = ContextFor(*pRecording);
    VReplayFeed feed(pRecording, pLive, {});
    EXPECT_TRUE(feed.Produce(1, 4).IsSuccess());
    EXPECT_EQ(Describe(*pLive), "begins late@1: - - 3 4\nslow@1: 1 1 2 3\nrounded@1: 10 13 16 -\n");
    EXPECT_EQ(feed.Warnings().size(), 3u);
}

} // namespace StreamingTest
