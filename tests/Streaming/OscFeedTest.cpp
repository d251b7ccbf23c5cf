#include "OscSupport.h"
#include "Streaming/VOscFeed.h"

namespace StreamingTest
{

namespace
{

using Streaming::EOscTrouble;
using Streaming::LocalTime;
using Streaming::OscSamples;

constexpr double Rate = 100.0;

/// A feed at 100 Hz; times are in frames from the first sample.
class OscFeed : public testing::Test
{
protected:
    OscFeed() : m_pContext(MakeContext(1'350'000)), m_Feed(m_pContext, Rate, m_Troubles) {}

    static LocalTime At(double i_Frame)
    {
        return std::chrono::seconds(1000) +
               std::chrono::duration_cast<LocalTime>(std::chrono::duration<double>(i_Frame / Rate + 1e-9));
    }

    void AddChannels(std::size_t i_Count, std::size_t i_Components = 1)
    {
        while (i_Count-- > 0)
        {
            std::string name = "c";
            name += std::to_string(m_Channels.size());
            m_Channels.push_back({{false, "", name}, i_Components});
        }
        EXPECT_TRUE(m_Feed.AddChannels(m_Channels).IsSuccess());
    }

    void Sample(std::uint32_t i_Channel, double i_Frame, float i_Value)
    {
        m_Samples.Samples.push_back({At(i_Frame), i_Channel, m_Samples.Values.size()});
        m_Samples.Values.push_back(i_Value);
    }

    void Take(double i_Now)
    {
        EXPECT_TRUE(m_Feed.Take(m_Samples, At(i_Now)).IsSuccess());
        m_Samples.Clear();
    }

    std::string Finished()
    {
        EXPECT_TRUE(m_Feed.Finish().IsSuccess());
        return Describe(*m_pContext);
    }

    std::shared_ptr<Channels::VLiveContext> m_pContext;
    Streaming::VOscTroubles m_Troubles;
    Streaming::VOscFeed m_Feed;
    std::vector<Streaming::OscChannel> m_Channels;
    OscSamples m_Samples;
};

} // namespace

TEST_F(OscFeed, TimesBecomeFrames)
{
    static const struct
    {
        const char* pWhat;
        std::vector<double> Times;
        const char* pExpected;
        std::uint64_t Shared;
    } rows[] = {
        {"even", {0, 1, 2, 3}, "0 1 2 3", 0},
        {"jitter of most of a frame", {0, 1.7, 2.1, 3.7, 4, 4.6, 6}, "0 1 2 3 4 5 6", 0},
        {"a gap", {0, 1, 4, 5}, "0 1 - - 2 3", 0},
        {"five at once every five frames", {0, 0, 0, 0, 0, 5, 5, 5, 5, 5}, "0 1 2 3 4 5 6 7 8 9", 0},
        {"a stall", {0, 1, 4, 4.1, 4.2, 5}, "0 1 - - 2 3 4 5", 0},
        {"in another order", {0, 3, 1, 2, 4}, "0 2 3 1 4", 0},
        {"slow", {0, 1.3, 2.6, 3.9, 5.2}, "0 1 2 - 3 4", 0},
        {"one that is missing, and jitter", {0, 1.1, 2, 4.1, 5, 5.9, 8}, "0 1 2 - 3 4 5 - 6", 0},
    };
    for (const auto& rRow : rows)
    {
        const auto pContext = MakeContext(1'350'000);
        Streaming::VOscTroubles troubles;
        Streaming::VOscFeed feed(pContext, Rate, troubles);
        ASSERT_TRUE(feed.AddChannels({{{false, "", "c"}, 1}}).IsSuccess());
        OscSamples samples;
        for (std::size_t i = 0; i < rRow.Times.size(); ++i)
        {
            samples.Samples.push_back({At(rRow.Times[i]), 0, i});
            samples.Values.push_back(static_cast<float>(i));
        }
        EXPECT_TRUE(feed.Take(samples, At(0)).IsSuccess());
        EXPECT_TRUE(feed.Finish().IsSuccess());
        EXPECT_EQ(Describe(*pContext), std::string("c@0: ") + rRow.pExpected + "\n") << rRow.pWhat;
        EXPECT_EQ(troubles.Count(EOscTrouble::SharedFrame), rRow.Shared) << rRow.pWhat;
    }
}

TEST_F(OscFeed, TooFastASenderLosesNoOrder)
{
    AddChannels(1);
    for (int i = 0; i < 200; ++i) // twice the rate for a second
    {
        Sample(0, i / 2.0, static_cast<float>(i));
        Take(i / 2.0);
    }
    ASSERT_TRUE(m_Feed.Finish().IsSuccess());
    const auto pSamples = m_pContext->GetChannels()->front()->GetSamples();
    const TQL::TickRange range = pSamples->GetRange();
    std::vector<float> values(static_cast<std::size_t>((range.Last - range.First) / pSamples->Period()));
    ASSERT_TRUE(pSamples->ReadSamples(range, values).IsSuccess());
    EXPECT_TRUE(std::ranges::is_sorted(values));
    EXPECT_NEAR(static_cast<double>(values.size()), 110.0, 2.0) << "a tenth of a second early at most";
    EXPECT_EQ(values.size() + m_Troubles.Count(EOscTrouble::SharedFrame) + m_Troubles.Count(EOscTrouble::TooLate),
              200u);
}

TEST_F(OscFeed, FramesWaitForTheOtherChannels)
{
    AddChannels(2);
    Sample(0, 0, 10);
    Sample(0, 1, 11);
    Take(1);
    EXPECT_EQ(Describe(*m_pContext), "c0@0:\nc1@0:\n") << "nothing is handed on yet";
    Sample(1, 0, 20);
    Take(4);
    Take(6.5);
    EXPECT_EQ(Describe(*m_pContext), "c0@0: 10 11\nc1@0: 20 -\n");
    Sample(1, 1, 21);
    AddChannels(1);
    Sample(0, 8, 12);
    Sample(2, 9, 30);
    Take(9);
    Take(20);
    EXPECT_EQ(Describe(*m_pContext),
              "c0@0: 10 11 - - - - - - 12 -\nc1@0: 20 - 21 - - - - - - -\nc2@2: - - - - - - - 30\n")
        << "a little late is the next frame";
    Sample(0, 20, 13);
    Take(20);
    Take(26);
    EXPECT_EQ(m_Troubles.Summary(), std::vector<std::string>());
    Sample(1, 3, 22);
    Take(26);
    EXPECT_EQ(m_Troubles.Count(EOscTrouble::TooLate), 1u);
}

TEST_F(OscFeed, APauseTakesNoTimeAndALongGapDoes)
{
    AddChannels(1);
    Sample(0, 0, 0);
    Take(0);
    EXPECT_TRUE(m_Feed.Finish().IsSuccess());
    m_Feed.SkipTime();
    Sample(0, 5000, 1);
    Take(5000);
    Sample(0, 5100, 2);
    Take(5100);
    EXPECT_TRUE(m_Feed.Finish().IsSuccess());
    EXPECT_EQ(m_pContext->GetTickRange().Last, 102 * 1'350'000);
    const std::string text = Describe(*m_pContext);
    EXPECT_TRUE(text.starts_with("c0@0: 0 1 - - ")) << text;
    EXPECT_TRUE(text.ends_with(" - 2\n")) << text;
    EXPECT_EQ(m_Troubles.Summary(), std::vector<std::string>());
}

TEST_F(OscFeed, ABacklogOfAllChannelsIsTakenInTheOrderOfTime)
{
    AddChannels(3);
    for (std::uint32_t channel = 0; channel < 3; ++channel)
        for (int i = 0; i < 300; ++i)
            Sample(channel, i, static_cast<float>(i));
    Take(300);
    EXPECT_TRUE(m_Feed.Finish().IsSuccess());
    EXPECT_EQ(m_Troubles.Summary(), std::vector<std::string>());
    for (const auto& rpChannel : *m_pContext->GetChannels())
        EXPECT_EQ(rpChannel->GetSamples()->GetRange(), (TQL::TickRange{0, 300 * 1'350'000}));
}

TEST_F(OscFeed, WhereTheRateWasStatedNobodyIsAskedToStateIt)
{
    for (const bool bStated : {false, true})
    {
        Streaming::VOscTroubles troubles;
        Streaming::VOscFeed feed(MakeContext(1'350'000), Rate, troubles, bStated);
        ASSERT_TRUE(feed.AddChannels({{{false, "", "c"}, 1}}).IsSuccess());
        OscSamples samples;
        for (std::size_t i = 0; i < 100; ++i)
        {
            samples.Samples.push_back({At(0), 0, i});
            samples.Values.push_back(0.0f);
        }
        EXPECT_TRUE(feed.Take(samples, At(0)).IsSuccess());
        ASSERT_EQ(troubles.Summary().size(), 1u);
        EXPECT_EQ(troubles.Summary()[0].find("State the rate") == std::string::npos, bStated) << troubles.Summary()[0];
    }
}

TEST_F(OscFeed, ABurstOfStraysCostsLittleMemoryAndNoHistory)
{
    constexpr std::size_t numbers = 64;
    AddChannels(500, numbers);
    AddChannels(1);
    for (std::uint32_t channel = 0; channel < 500; ++channel)
    {
        m_Samples.Samples.push_back({At(0), channel, m_Samples.Values.size()});
        m_Samples.Values.resize(m_Samples.Values.size() + numbers);
    }
    for (int frame = 0; frame < 5000; ++frame)
    {
        Sample(500, frame, 1.0f);
        Take(frame);
    }
    EXPECT_TRUE(m_Feed.Finish().IsSuccess());
    std::size_t bytes = 0;
    for (const auto& rpChannel : *m_pContext->GetChannels())
        bytes += rpChannel->GetSamples()->ByteCount();
    EXPECT_LT(bytes, 500u * 20'000u); // a row is 256 bytes, the 5000 rows of each would be 1.3 MB
    EXPECT_EQ(m_pContext->GetHistoryFrames(), 360'000) << "an hour, as without them";
}

} // namespace StreamingTest
