#include "Channels/Blocks/VCacheChannel.h"
#include "Channels/Contexts/VLiveContext.h"
#include "Channels/Contexts/VRecordedContext.h"
#include "Channels/VChannelService.h"
#include "Reference.h"

#include <numbers>

namespace ChannelsTest
{

namespace
{

using Channels::VChannelService;
using Channels::VLiveContext;
using TQL::TickRange;

constexpr std::int64_t Period = TQL::DefaultFramePeriod;

/// A live context with one marker and one segment that spins at 1 rad a frame; everything counts in frames.
class CacheChannel : public testing::Test
{
protected:
    CacheChannel() : m_pLive(std::make_shared<VLiveContext>("Live", m_Service.GetSubTypes(), VLiveContext::Options{}))
    {
        m_Service.AddContext(m_pLive);
        EXPECT_TRUE(
            m_pLive->AddChannel({"Labelled Reconstructions", 0, 0, "", "Head", "mm", {}}, 0, m_Marker).IsSuccess());
        EXPECT_TRUE(
            m_pLive->AddChannel({"SubjectSegmentPose", 0, 0, "", "Pelvis", "mm", {}}, 0, m_Segment).IsSuccess());
    }

    void AddFrames(std::int64_t i_Count, bool i_bMissing = false)
    {
        for (; i_Count > 0; --i_Count, ++m_Frames)
        {
            const auto frame = static_cast<double>(m_Frames);
            const auto angle =
                i_bMissing ? std::nanf("") : static_cast<float>(std::remainder(frame, 2.0 * std::numbers::pi));
            const auto value = static_cast<float>(m_Frames);
            const std::vector<float> marker{value, -value, 0.0f};
            const std::vector<float> pose{0.0f, angle, 0.0f, value, 0.0f, 0.0f};
            const std::array<Channels::ChannelRows, 2> rows{{{m_Marker, marker}, {m_Segment, pose}}};
            ASSERT_TRUE(m_pLive->AppendFrames(m_Frames, 1, rows).IsSuccess());
        }
    }

    std::shared_ptr<TQL::IChannel> MakeCache(const char* i_pType, bool i_bUnwrap, std::int64_t i_Frames,
                                             const char* i_pContext = "Live")
    {
        const auto pInput = m_Service.GetChannel({i_pContext, i_pType, 0, 0, ""});
        const auto pCache = m_Service.CreateDerivedChannel("Cache", {}, {pInput});
        const auto pParameters = pCache->GetParameters();
        EXPECT_TRUE(pParameters->SetParameter("SupportLodding", true).IsSuccess());
        EXPECT_TRUE(pParameters->SetParameter("EnableRotationUnwrapping", i_bUnwrap).IsSuccess());
        EXPECT_TRUE(pParameters->SetParameter("CacheRangeTicks", i_Frames * Period).IsSuccess());
        return pCache;
    }

    /// Once the channel has everything.
    static TickRange RangeInFrames(TQL::IChannel& i_rChannel)
    {
        TickRange range;
        TickRange before;
        do
        {
            before = range;
            i_rChannel.GetOutput()->GetBlock()->GetRange(range);
        } while (range != before);
        return {range.First / Period, range.Last / Period};
    }

    /// Component 1 of every frame that the channel has.
    static std::vector<float> ReadSecond(TQL::IChannel& i_rChannel)
    {
        const auto pBlock = i_rChannel.GetOutput()->GetBlock();
        TickRange range;
        pBlock->GetRange(range);
        std::vector<float> values(static_cast<std::size_t>((range.Last - range.First) / Period));
        EXPECT_TRUE(pBlock->ReadComponent(range, values, 1).IsSuccess());
        return values;
    }

    VChannelService m_Service;
    std::shared_ptr<VLiveContext> m_pLive;
    std::uint32_t m_Marker = 0;
    std::uint32_t m_Segment = 0;
    std::int64_t m_Frames = 0;
};

} // namespace

TEST_F(CacheChannel, WindowFollowsTheRangeParameterWithAndWithoutAStoreOfItsOwn)
{
    for (const bool bUnwrap : {false, true})
    {
        SCOPED_TRACE(bUnwrap ? "unwrapped" : "shared");
        AddFrames(10000);
        const auto pCache = MakeCache("SubjectSegmentPose", bUnwrap, 500);
        const auto pOutput = pCache->GetOutput();
        EXPECT_EQ(RangeInFrames(*pCache), (TickRange{m_Frames - 500, m_Frames})) << "history at once";
        AddFrames(1500);
        EXPECT_EQ(RangeInFrames(*pCache), (TickRange{m_Frames - 500, m_Frames}));
        EXPECT_TRUE(pCache->GetParameters()->SetParameter("CacheRangeTicks", 9000 * Period).IsSuccess());
        EXPECT_EQ(RangeInFrames(*pCache), (TickRange{m_Frames - 9000, m_Frames})) << "grown";
        EXPECT_TRUE(pCache->GetParameters()->SetParameter("CacheRangeTicks", 50 * Period).IsSuccess());
        EXPECT_EQ(RangeInFrames(*pCache), (TickRange{m_Frames - 50, m_Frames})) << "shrunk";
        EXPECT_TRUE(pCache->GetParameters()->SetParameter("CacheRangeTicks", std::int64_t{1} << 60).IsSuccess());
        EXPECT_EQ(RangeInFrames(*pCache), (TickRange{0, m_Frames})) << "all that the input has";
        EXPECT_EQ(pCache->GetOutput(), pOutput) << "none of this replaces the data";
        EXPECT_FALSE(pOutput->IsStale());
    }
}

TEST_F(CacheChannel, ReportedRangeStaysReadableUntilAskedAgain)
{
    AddFrames(2000);
    for (const bool bUnwrap : {false, true})
    {
        const auto pCache = MakeCache("SubjectSegmentPose", bUnwrap, 100);
        const auto pBlock = pCache->GetOutput()->GetBlock();
        TickRange range;
        pBlock->GetRange(range);
        AddFrames(30);
        std::vector<float> rows(100 * 6);
        EXPECT_TRUE(pBlock->ReadSamples(range, rows).IsSuccess());
        EXPECT_EQ(rows[3], static_cast<float>(range.First / Period));
        std::vector<float> more(101 * 6);
        EXPECT_EQ(pBlock->ReadSamples({range.First - Period, range.Last}, more), TQL::Result::InvalidArgument);
        std::vector<LodRecord> records(6);
        const TickRange coarse{TQL::AlignDown(range.First, Period << 12), range.Last};
        ASSERT_EQ(pBlock->ReadSummary(coarse, 11, records), 6u);
        EXPECT_EQ(records[3].Minimum, static_cast<float>(range.First / Period)) << "the window is the border";
        ASSERT_TRUE(pBlock->Summarise(range, records).IsSuccess());
        EXPECT_EQ(records[3].Count, 100u);
    }
}

TEST_F(CacheChannel, UnwrapsFromTheFirstFrameThroughHistoryThatIsFetchedLater)
{
    AddFrames(9000);
    const auto pCache = MakeCache("SubjectSegmentPose", true, 100);
    const auto expectOneRadianAFrame = [&]
    {
        const std::vector<float> angles = ReadSecond(*pCache);
        for (std::size_t i = 1; i < angles.size(); ++i)
            ASSERT_NEAR(angles[i] - angles[i - 1], 1.0, 2e-3) << "row " << i << " of " << angles.size();
    };
    expectOneRadianAFrame();
    AddFrames(300);
    expectOneRadianAFrame();
    EXPECT_TRUE(pCache->GetParameters()->SetParameter("CacheRangeTicks", 8000 * Period).IsSuccess());
    AddFrames(10);
    ASSERT_EQ(ReadSecond(*pCache).size(), 8000u);
    expectOneRadianAFrame();
    const auto pBlock = pCache->GetOutput()->GetBlock();
    ASSERT_EQ(pBlock->GetShape().SummaryPeriods.size(), 24u);
}

TEST_F(CacheChannel, UnwrapsAcrossAGapThatTheWindowHadNarrowedInto)
{
    AddFrames(3000);
    const auto pCache = MakeCache("SubjectSegmentPose", true, 10);
    RangeInFrames(*pCache);
    for (int batch = 0; batch < 25; ++batch) // until nothing but the gap is kept
    {
        AddFrames(100, true);
        RangeInFrames(*pCache);
    }
    EXPECT_TRUE(pCache->GetParameters()->SetParameter("CacheRangeTicks", 4000 * Period).IsSuccess());
    ASSERT_EQ(RangeInFrames(*pCache), (TickRange{1500, 5500}));
    AddFrames(100);
    std::vector<float> angles = ReadSecond(*pCache);
    ASSERT_EQ(angles.size(), 4000u);
    EXPECT_EQ(std::erase_if(angles, [](float i_Angle) { return std::isnan(i_Angle); }), 2500u);
    for (std::size_t i = 1; i < angles.size(); ++i)
        ASSERT_LT(std::abs(angles[i] - angles[i - 1]), std::numbers::pi + 1e-2) << "row " << i;
}

TEST_F(CacheChannel, SharesTheStoreOfItsInputWhereNothingIsAltered)
{
    AddFrames(10);
    const auto storeOf = [](TQL::IChannel& i_rChannel)
    {
        return i_rChannel.GetOutput()->GetBlock()->GetStore();
    };
    const auto pMarker = m_Service.GetChannel({"Live", "Labelled Reconstructions", 0, 0, ""});
    const auto pPose = m_Service.GetChannel({"Live", "SubjectSegmentPose", 0, 0, ""});
    EXPECT_EQ(storeOf(*MakeCache("Labelled Reconstructions", true, 5)), storeOf(*pMarker));
    EXPECT_EQ(storeOf(*MakeCache("SubjectSegmentPose", false, 5)), storeOf(*pPose));
    EXPECT_NE(storeOf(*MakeCache("SubjectSegmentPose", true, 5)), storeOf(*pPose));
    // A cache of a cache shows the window of the first.
    const auto pInner = MakeCache("Labelled Reconstructions", false, 5);
    const auto pOuter = m_Service.CreateDerivedChannel("Cache", {}, {pInner});
    EXPECT_EQ(RangeInFrames(*pOuter), (TickRange{5, 10}));
    EXPECT_EQ(pOuter->GetOutput()->GetBlock()->GetShape().SummaryPeriods.size(), 1u) << "without SupportLodding";
}

TEST_F(CacheChannel, KnowsWhenItsReaderHasReadWhatItWants)
{
    AddFrames(100);
    EXPECT_FALSE(m_Service.IsReadEnough()) << "nobody reads";
    const auto pCache = MakeCache("Labelled Reconstructions", false, 0);
    EXPECT_FALSE(m_Service.IsReadEnough()) << "nobody asked for data yet";
    const auto look = [&](int i_Times)
    {
        for (TickRange range; i_Times > 0; --i_Times)
            pCache->GetOutput()->GetBlock()->GetRange(range);
    };
    look(10);
    EXPECT_FALSE(m_Service.IsReadEnough()) << "looked, and never read";
    ReadSecond(*pCache);
    EXPECT_FALSE(m_Service.IsReadEnough()) << "may read on";
    look(4);
    EXPECT_TRUE(m_Service.IsReadEnough());
    m_Service.ForgetReads();
    EXPECT_FALSE(m_Service.IsReadEnough()) << "was told to show something else";
    look(4);
    EXPECT_TRUE(m_Service.IsReadEnough());
}

TEST_F(CacheChannel, OutputIsStaleForEverAfterReplacement)
{
    struct Case
    {
        const char* pName;
        std::function<void(TQL::IChannel&)> Replace;
    };
    const std::vector<Case> cases{
        {"restart",
         [this](TQL::IChannel&)
         {
             m_pLive->Restart(m_Frames = 0);
             AddFrames(20);
         }},
        {"unwrapping switched",
         [](TQL::IChannel& i_rCache)
         {
             EXPECT_TRUE(i_rCache.GetParameters()->SetParameter("EnableRotationUnwrapping", false).IsSuccess());
         }},
        {"leap ahead beyond the history",
         [this](TQL::IChannel&)
         {
             m_Frames += 1'000'000;
             AddFrames(20);
         }},
    };
    for (const Case& rCase : cases)
    {
        SCOPED_TRACE(rCase.pName);
        AddFrames(100);
        const auto pCache = MakeCache("SubjectSegmentPose", true, 50);
        const auto pOld = pCache->GetOutput();
        const auto pStore = pOld->GetBlock()->GetStore();
        const std::uint64_t token = pStore->AcquireLease(0);
        ASSERT_FALSE(pOld->IsStale());
        rCase.Replace(*pCache);
        EXPECT_TRUE(pOld->IsStale());
        const auto pNew = pCache->GetOutput();
        ASSERT_NE(pNew, nullptr);
        EXPECT_NE(pNew, pOld);
        EXPECT_FALSE(pNew->IsStale());
        EXPECT_TRUE(pOld->IsStale()) << "for ever";
        EXPECT_NE(pNew->GetBlock()->GetStore()->AcquireLease(0), token);
    }
}

TEST_F(CacheChannel, KeepsAllOfARecordingWhateverTheRange)
{
    const auto pRecording = std::make_shared<Recordings::VRecording>();
    Recordings::RecordedChannel channel;
    channel.Kind = Recordings::EChannelKind::SegmentPose;
    channel.ComponentNames = {"RX", "RY", "RZ", "TX", "TY", "TZ"};
    channel.FirstTick = 3 * Period;
    channel.Samples = RandomSamples(6 * 20000, 1);
    pRecording->Channels.push_back(channel);
    pRecording->Range = channel.GetTickRange();
    for (const bool bUnwrap : {false, true})
    {
        m_Service.AddContext(std::make_shared<Channels::VRecordedContext>("Walk", m_Service.GetSubTypes(), pRecording));
        const auto pCache = MakeCache("SubjectSegmentPose", bUnwrap, 10, "Walk");
        EXPECT_EQ(RangeInFrames(*pCache), (TickRange{3, 20003}));
        const auto pOutput = pCache->GetOutput();
        EXPECT_FALSE(pOutput->IsStale());
        EXPECT_TRUE(m_Service.RemoveContext("Walk").IsSuccess());
        EXPECT_TRUE(pOutput->IsStale()) << "the recording was closed";
        EXPECT_EQ(pCache->GetOutput(), nullptr);
    }
}

TEST_F(CacheChannel, ParametersAreCheckedAndInherited)
{
    AddFrames(1);
    const auto pCache = MakeCache("Labelled Reconstructions", false, 5);
    const auto pParameters = pCache->GetParameters();
    EXPECT_EQ(pParameters->SetParameter("CacheRangeTicks", std::int32_t{5}), TQL::Result::InvalidType);
    EXPECT_EQ(pParameters->SetParameter("InstanceDisplayName", std::string("x")), TQL::Result::NotFound);
    EXPECT_EQ(pParameters->SetParameter("SupportLodding", true), TQL::Result::OkButNoEffect);
    const auto pInputParameters = m_Service.GetChannel({"Live", "Labelled Reconstructions", 0, 0, ""})->GetParameters();
    EXPECT_EQ(pInputParameters->SetParameter("InstanceDisplayName", std::string("x")), TQL::Result::NotPermitted);
    TQL::ParameterValue value;
    ASSERT_TRUE(pParameters->Read("", "InstanceDisplayName", value).IsSuccess());
    EXPECT_EQ(std::get<std::string>(value), "Head");
    ASSERT_TRUE(pParameters->Read("ChannelTypeParameters", "ComponentDisplayNames", value).IsSuccess());
    EXPECT_EQ(std::get<std::string>(value), "TX,TY,TZ");
    EXPECT_EQ(pParameters->Read("ChannelInstanceParameters", "ComponentDisplayNames", value), TQL::Result::NotFound);
    EXPECT_EQ(pParameters->Read("", "NoSuchThing", value), TQL::Result::NotFound);
}

TEST_F(CacheChannel, OutputAloneKeepsTheChannel)
{
    AddFrames(1);
    auto pCache = MakeCache("Labelled Reconstructions", false, 5);
    const std::weak_ptr<TQL::IChannel> pWatch = pCache;
    auto pOutput = pCache->GetOutput();
    pCache = nullptr;
    ASSERT_FALSE(pWatch.expired());
    EXPECT_EQ(pOutput->GetChannel(), pWatch.lock());
    pOutput = nullptr;
    EXPECT_TRUE(pWatch.expired());
}

} // namespace ChannelsTest
