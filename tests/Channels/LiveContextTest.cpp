#include "Channels/Contexts/VLiveContext.h"
#include "Channels/VChannelService.h"
#include "Reference.h"
#include "support/ManualPostalService.h"

#include <array>
#include <atomic>
#include <thread>

namespace ChannelsTest
{

namespace
{

using Channels::ChannelRows;
using Channels::VLiveContext;
using TQL::TickRange;

constexpr std::int64_t Period = TQL::DefaultFramePeriod;

/// A context of one marker and one device of two outputs with ten samples a frame.
class LiveContext : public testing::Test
{
protected:
    void Make(const VLiveContext::Options& i_rOptions)
    {
        m_pContext = std::make_shared<VLiveContext>("Live", std::make_shared<Channels::VSubTypeTable>(), i_rOptions);
        m_pContext->RangeChanged()->AddDirect([this] { ++m_RangeChanges; });
        EXPECT_TRUE(
            m_pContext->AddChannel({"Labelled Reconstructions", 0, 0, "", "Head", "mm", {}}, 0, m_Marker).IsSuccess());
        for (std::uint32_t output = 0; output < 2; ++output)
            EXPECT_TRUE(
                m_pContext
                    ->AddChannel({"DeviceOutput", 0, output, "", "Force", "N", {}}, Period / 10, m_Outputs[output])
                    .IsSuccess());
    }

    TQL::IResult Append(std::int64_t i_Frame, std::int64_t i_Count = 1)
    {
        std::vector<float> marker;
        std::vector<float> device;
        for (std::int64_t i = 0; i < i_Count; ++i)
        {
            marker.insert(marker.end(), 3, static_cast<float>(i_Frame + i));
            for (int sample = 0; sample < 10; ++sample)
                device.insert(device.end(), {static_cast<float>(sample), static_cast<float>(-sample)});
        }
        const std::span<const float> interleaved(device);
        const std::array<ChannelRows, 3> rows{
            {{m_Marker, marker}, {m_Outputs[0], interleaved, 2}, {m_Outputs[1], interleaved.subspan(1), 2}}};
        return m_pContext->AppendFrames(i_Frame, i_Count, rows);
    }

    std::vector<float> Read(std::uint32_t i_Channel, std::int64_t i_FirstFrame, std::int64_t i_EndFrame) const
    {
        const auto pSamples = (*m_pContext->GetChannels())[i_Channel]->GetSamples();
        const TickRange range{i_FirstFrame * Period, i_EndFrame * Period};
        std::vector<float> values(static_cast<std::size_t>((range.Last - range.First) / pSamples->Period()) *
                                  pSamples->Components());
        EXPECT_TRUE(pSamples->ReadSamples(range, values).IsSuccess());
        return values;
    }

    std::shared_ptr<VLiveContext> m_pContext;
    std::uint32_t m_Marker = 99;
    std::array<std::uint32_t, 2> m_Outputs{99, 99};
    int m_RangeChanges = 0;
};

} // namespace

TEST_F(LiveContext, FramesArriveInEveryChannelAndGrowTheRange)
{
    Make({Period, 7});
    EXPECT_EQ(m_pContext->GetTickRange(), (TickRange{7 * Period, 7 * Period}));
    EXPECT_TRUE(Append(7).IsSuccess());
    EXPECT_TRUE(Append(8, 4).IsSuccess());
    EXPECT_EQ(m_pContext->GetTickRange(), (TickRange{7 * Period, 12 * Period}));
    EXPECT_EQ(m_RangeChanges, 2) << "once a batch";
    EXPECT_EQ(Read(m_Marker, 11, 12), (std::vector<float>{11, 11, 11}));
    EXPECT_EQ(Read(m_Outputs[1], 8, 9), (std::vector<float>{0, -1, -2, -3, -4, -5, -6, -7, -8, -9}));
}

TEST_F(LiveContext, LostFramesAndSilentChannelsAreMissingSamples)
{
    Make({});
    EXPECT_TRUE(Append(0).IsSuccess());
    EXPECT_TRUE(Append(3).IsSuccess());
    const std::vector<float> late = Read(m_Marker, 0, 4);
    EXPECT_EQ(late[0], 0.0f);
    for (std::size_t i = 3; i < 9; ++i)
        EXPECT_TRUE(std::isnan(late[i])) << i;
    EXPECT_EQ(late[9], 3.0f);
    const std::vector<float> marker{5, 5, 5};
    const std::array<ChannelRows, 1> rows{{{m_Marker, marker}}};
    EXPECT_TRUE(m_pContext->AppendFrames(4, 1, rows).IsSuccess());
    EXPECT_TRUE(std::isnan(Read(m_Outputs[0], 4, 5).back()));
    std::uint32_t added = 0;
    EXPECT_TRUE(m_pContext->AddChannel({"Labelled Reconstructions", 0, 1, "", "Knee", "mm", {}}, 0, added).IsSuccess());
    EXPECT_TRUE(m_pContext->AppendFrames(5, 1, {}).IsSuccess());
    EXPECT_EQ((*m_pContext->GetChannels())[added]->GetSamples()->GetRange(), (TickRange{5 * Period, 6 * Period}));
}

TEST_F(LiveContext, BadBatchesAppendNothing)
{
    Make({});
    EXPECT_TRUE(Append(0, 2).IsSuccess());
    const std::vector<float> three(3);
    const std::vector<float> four(4);
    struct Case
    {
        const char* pName;
        std::int64_t Frame;
        std::int64_t Count;
        ChannelRows Rows;
    };
    const std::vector<Case> cases{
        {"a frame that is there", 1, 1, {m_Marker, three}},
        {"no frame", 2, 0, {m_Marker, {}}},
        {"no such channel", 2, 1, {17, three}},
        {"too few values", 2, 2, {m_Marker, three}},
        {"too many values", 2, 1, {m_Marker, four}},
        {"rows that overlap", 2, 1, {m_Marker, three, 2}},
    };
    for (const Case& rCase : cases)
    {
        EXPECT_EQ(m_pContext->AppendFrames(rCase.Frame, rCase.Count, std::span(&rCase.Rows, 1)),
                  TQL::Result::InvalidArgument)
            << rCase.pName;
        EXPECT_EQ(m_pContext->GetTickRange().Last, 2 * Period) << rCase.pName;
    }
    std::uint32_t channel = 0;
    EXPECT_EQ(m_pContext->AddChannel({"Labelled Reconstructions", 0, 0, "", "", "", {}}, 0, channel),
              TQL::Result::AlreadyPresent);
    EXPECT_EQ(m_pContext->AddChannel({"Labelled Reconstructions", 0, 5, "", "", "", {}}, 7, channel),
              TQL::Result::InvalidArgument);
    EXPECT_EQ(m_pContext->AddChannel({"NoSuchType", 0, 5, "", "", "", {}}, 0, channel), TQL::Result::InvalidType);
}

TEST_F(LiveContext, KeepsTheHistoryThatItMayAndForgetsTheRest)
{
    // 3 marker values and 2 x 10 device values a frame, 6 bytes each.
    constexpr std::uint64_t bytesPerFrame = 23 * 6 + 1;
    struct Case
    {
        std::int64_t HistoryFrames;
        std::uint64_t Bytes;
        std::int64_t Expected;
    };
    for (const Case& rCase : {Case{3000, 1ull << 30, 3000}, Case{1 << 30, 2001 * bytesPerFrame, 2000}})
    {
        Make({Period, 0, rCase.HistoryFrames * Period, rCase.Bytes});
        for (std::int64_t frame = 0; frame < 20000; frame += 10)
            ASSERT_TRUE(Append(frame, 10).IsSuccess());
        EXPECT_NEAR(static_cast<double>(m_pContext->GetHistoryFrames()), static_cast<double>(rCase.Expected), 10.0);
        const TickRange range = m_pContext->GetTickRange();
        const std::int64_t frames = (range.Last - range.First) / Period;
        EXPECT_GE(frames, m_pContext->GetHistoryFrames());
        EXPECT_LE(frames, m_pContext->GetHistoryFrames() + 300);
        EXPECT_EQ((*m_pContext->GetChannels())[m_Outputs[1]]->GetSamples()->GetRange(), range);
    }
}

TEST_F(LiveContext, ChannelTellsWhenItsOutputAppearsAndIsReplaced)
{
    Make({});
    const auto pChannel = (*m_pContext->GetChannels())[m_Marker];
    const auto pPostal = std::make_shared<TestSupport::ManualPostalService>();
    int changes = 0;
    auto pHandle =
        pChannel->GetParameters()->GetChangeNotifier()->AddOutputChangedCallback([&] { ++changes; }, pPostal);
    const auto changesNow = [&]
    {
        pPostal->RunAll();
        return std::exchange(changes, 0);
    };
    EXPECT_EQ(pChannel->GetOutput(), nullptr);
    EXPECT_TRUE(Append(0).IsSuccess());
    EXPECT_EQ(changesNow(), 1);
    const auto pOutput = pChannel->GetOutput();
    ASSERT_NE(pOutput, nullptr);
    EXPECT_TRUE(Append(1).IsSuccess());
    EXPECT_EQ(changesNow(), 0);
    EXPECT_EQ(pChannel->GetOutput(), pOutput);
    m_pContext->Restart(100);
    EXPECT_EQ(changesNow(), 1);
    EXPECT_TRUE(pOutput->IsStale());
    EXPECT_EQ(pChannel->GetOutput(), nullptr);
    EXPECT_EQ(m_pContext->GetTickRange(), (TickRange{100 * Period, 100 * Period}));
    EXPECT_TRUE(Append(100).IsSuccess());
    EXPECT_EQ(changesNow(), 1);
    EXPECT_NE(pChannel->GetOutput(), nullptr);
    pHandle = nullptr;
    m_pContext->Retire();
    EXPECT_EQ(changesNow(), 0) << "the handle was released";
    EXPECT_EQ(pChannel->GetOutput(), nullptr);
}

TEST_F(LiveContext, PlotsReadWhileTheProducerAppends)
{
    Make({Period, 0, 2000 * Period});
    Channels::VChannelService service;
    service.AddContext(m_pContext);
    std::atomic<bool> bDone{false};
    std::atomic<std::size_t> wrong{0};
    std::atomic<std::size_t> reads{0};
    std::thread reader(
        [&]
        {
            std::shared_ptr<TQL::IChannel> pCache;
            std::vector<float> values;
            do
            {
                const auto pInput = service.GetChannel({"Live", "Labelled Reconstructions", 0, 0, ""});
                if (!pCache || reads % 64 == 0)
                    pCache = service.CreateDerivedChannel("Cache", {}, {pInput});
                (void)pCache->GetParameters()->SetParameter("SupportLodding", true);
                (void)pCache->GetParameters()->SetParameter("CacheRangeTicks", 300 * Period);
                const auto pOutput = pCache->GetOutput();
                if (!pOutput)
                    continue;
                TickRange range;
                pOutput->GetBlock()->GetRange(range);
                values.resize(static_cast<std::size_t>((range.Last - range.First) / Period) * 3);
                if (pOutput->GetBlock()->ReadSamples(range, values).IsError())
                    continue;
                ++reads;
                for (std::size_t i = 0; i < values.size(); i += 3)
                    wrong += values[i] != static_cast<float>(range.First / Period + static_cast<std::int64_t>(i / 3));
            } while (!bDone);
        });
    for (std::int64_t frame = 0; frame < 6000; frame += 2)
        EXPECT_TRUE(Append(frame, 2).IsSuccess());
    bDone = true;
    reader.join();
    EXPECT_EQ(wrong, 0u);
    EXPECT_GT(reads, 0u);
    EXPECT_EQ(m_RangeChanges, 3000);
}

} // namespace ChannelsTest
