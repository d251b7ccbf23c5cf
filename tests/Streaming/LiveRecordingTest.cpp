#include "Streaming/LiveRecording.h"
#include "OscSupport.h"
#include "Recordings/C3d/C3dReader.h"
#include "Recordings/OpenRecording.h"
#include "Streaming/SaveLive.h"

#include <algorithm>
#include <atomic>
#include <filesystem>
#include <fstream>
#include <limits>

#include <unistd.h>

namespace StreamingTest
{

namespace
{

using Channels::ChannelRows;
using Channels::VLiveContext;
using Recordings::VRecording;

constexpr float Gap = std::numeric_limits<float>::quiet_NaN();
constexpr std::int64_t Period = 1'350'000;

std::string Describe(const VRecording& i_rRecording)
{
    std::ostringstream text;
    for (const Recordings::RecordedChannel& rChannel : i_rRecording.Channels)
    {
        text << rChannel.Name << " " << rChannel.Quantity << rChannel.Units << " " << rChannel.Rate << " "
             << rChannel.FirstTick << ":";
        for (const float value : rChannel.Samples)
            text << " " << (std::isnan(value) ? "-" : testing::PrintToString(value));
        text << "\n";
    }
    return text.str();
}

class LiveData : public testing::Test
{
protected:
    void SetUp() override { std::filesystem::create_directories(m_Folder); }
    void TearDown() override { std::filesystem::remove_all(m_Folder); }

    std::uint32_t Add(Channels::ChannelDefinition i_Definition, std::int64_t i_Period = 0)
    {
        std::uint32_t channel = 0;
        EXPECT_TRUE(m_pContext->AddChannel(i_Definition, i_Period, channel).IsSuccess());
        return channel;
    }

    const std::filesystem::path m_Folder =
        std::filesystem::temp_directory_path() / ("graphplots-live-" + std::to_string(::getpid()));
    const std::shared_ptr<VLiveContext> m_pContext = MakeContext(Period);
};

} // namespace

TEST_F(LiveData, SavedAsC3dReadBackEqualWithGaps)
{
    const auto marker = Add({"Labelled Reconstructions", 0, 0, "", "W:LFHD", "mm", {}});
    const auto pose = Add({"SubjectSegmentPose", 0, 0, "", "W:Head", "mm", {}});
    const auto odd = Add({"Labelled Reconstructions", 0, 1, "", "W:RFHD", "m", {}});
    const auto knee = Add({"ModelSetSamplesOutput", 2, 0, "Knee", "Knee", "deg", {"X", "Y", "Z"}, "", "Angle"});
    const auto force = Add({"DeviceOutput", 0, 0, "", "Fz", "N", {""}}, Period / 2);
    const auto column = Add({"ModelSetSamplesOutput", 0, 0, "emg", "emg", "mV", {"1", "2"}});
    const std::vector<float> positions{1, 2, 3, Gap, Gap, Gap, 7, 8, 9};
    const std::vector<float> poses(18, 1.0f);
    const std::vector<float> forces{1, 2, 3, Gap, 5, 6};
    const std::vector<float> columns{10, 20, Gap, Gap, 30, 40};
    const ChannelRows rows[] = {{marker, positions, 0}, {pose, poses, 0},   {odd, positions, 0},
                                {knee, positions, 0},   {force, forces, 0}, {column, columns, 0}};
    ASSERT_TRUE(m_pContext->AppendFrames(0, 3, rows).IsSuccess());
    const auto late = Add({"ModelSetSamplesOutput", 1, 0, "late", "late", "", {""}});
    const std::vector<float> one{77};
    const ChannelRows last[] = {{late, one, 0}};
    ASSERT_TRUE(m_pContext->AppendFrames(4, 1, last).IsSuccess());

    const auto path = m_Folder / "live.c3d";
    std::vector<std::string> remarks;
    std::string error;
    ASSERT_TRUE(Streaming::SaveAsC3d(*m_pContext, path, remarks, error).IsSuccess()) << error;
    EXPECT_EQ(remarks, (std::vector<std::string>{
                           "2 columns and joint angles were written as analog channels",
                           "2 analog channels were brought to the rate of the fastest by repeating their samples",
                           "1 segment pose was left out: a C3D file has no place for it",
                           "1 marker was left out: all have to have the unit of the first"}));
    VRecording read;
    ASSERT_TRUE(Recordings::OpenRecording(path, read, error).IsSuccess()) << error;
    EXPECT_EQ(Describe(read), "W:LFHD mm 100 0: 1 2 3 - - - 7 8 9 - - - - - -\n"
                              "Knee Angledeg 100 0: 1 2 3 - - - 7 8 9 - - - - - -\n"
                              "Fz N 200 0: 1 2 3 - 5 6 - - - -\n"
                              "emg.1 mV 200 0: 10 10 - - 30 30 - - - -\n"
                              "emg.2 mV 200 0: 20 20 - - 40 40 - - - -\n"
                              "late  200 0: - - - - - - - - 77 77\n");
}

TEST_F(LiveData, WhatCannotBeSavedLeavesTheOldFile)
{
    const auto path = m_Folder / "old.c3d";
    std::ofstream(path) << "old";
    const auto contents = [&]
    {
        std::ostringstream text;
        text << std::ifstream(path).rdbuf();
        return text.str();
    };
    std::vector<std::string> remarks;
    std::string error;
    EXPECT_TRUE(Streaming::SaveAsC3d(*m_pContext, path, remarks, error).IsError());
    EXPECT_EQ(error, "there are no live data yet to save");
    const auto pose = Add({"SubjectSegmentPose", 0, 0, "", "W:Head", "mm", {}});
    const std::vector<float> poses(6, 1.0f);
    const ChannelRows rows[] = {{pose, poses, 0}};
    ASSERT_TRUE(m_pContext->AppendFrames(0, 1, rows).IsSuccess());
    EXPECT_TRUE(Streaming::SaveAsC3d(*m_pContext, path, remarks, error).IsError()) << "nothing is left of it";
    EXPECT_EQ(contents(), "old");
    const auto column = Add({"ModelSetSamplesOutput", 0, 0, "a", "a", "", {""}});
    const std::vector<float> one{1};
    const ChannelRows more[] = {{column, one, 0}};
    ASSERT_TRUE(m_pContext->AppendFrames(1, 1, more).IsSuccess());
    EXPECT_TRUE(Streaming::SaveAsC3d(*m_pContext, m_Folder / "no" / "such.c3d", remarks, error).IsError());
    EXPECT_EQ(error.find('\n'), std::string::npos);
    EXPECT_TRUE(Streaming::SaveAsC3d(*m_pContext, path, remarks, error).IsSuccess()) << error;
    EXPECT_NE(contents(), "old");
}

TEST_F(LiveData, StraysAreLeftOutWhereTheFileHasNoRoomForThem)
{
    std::vector<std::string> numbers(64, "n");
    for (std::uint32_t i = 0; i < 200; ++i)
        Add({"ModelSetSamplesOutput", i, 0, "stray", "stray" + std::to_string(i), "", numbers});
    const auto good = Add({"ModelSetSamplesOutput", 200, 0, "good", std::string(300, 'g'), "", {""}});
    const std::vector<float> row(64);
    std::vector<ChannelRows> rows;
    for (std::uint32_t i = 0; i < 200; ++i)
        rows.push_back({i, row, 0});
    ASSERT_TRUE(m_pContext->AppendFrames(0, 1, rows).IsSuccess());
    const ChannelRows last[] = {{good, std::span(row).first(50), 0}};
    ASSERT_TRUE(m_pContext->AppendFrames(1, 50, last).IsSuccess());
    std::vector<std::string> remarks;
    std::string error;
    ASSERT_TRUE(Streaming::SaveAsC3d(*m_pContext, m_Folder / "live.c3d", remarks, error).IsSuccess()) << error;
    EXPECT_NE(remarks.front().find(" channels were left out, for which a C3D file has no room: stray"),
              std::string::npos)
        << remarks.front();
    VRecording read;
    ASSERT_TRUE(Recordings::OpenRecording(m_Folder / "live.c3d", read, error).IsSuccess()) << error;
    const std::string name(255, 'g');
    EXPECT_TRUE(std::ranges::any_of(read.Channels, [&](const auto& i_r) { return i_r.Name == name; }));
}

TEST_F(LiveData, CopiesAreWholeWhileFramesComeAndGo)
{
    VLiveContext::Options options;
    options.FramePeriod = Period;
    options.HistoryTicks = 3000 * Period;
    const auto pContext = std::make_shared<VLiveContext>("Live", std::make_shared<Channels::VSubTypeTable>(), options);
    std::uint32_t channels[4] = {};
    for (std::uint32_t i = 0; i < 4; ++i)
        ASSERT_TRUE(
            pContext->AddChannel({"ModelSetSamplesOutput", i, 0, "c", "c", "", {""}}, 0, channels[i]).IsSuccess());
    std::atomic<bool> bStop{false};
    std::thread producer(
        [&]
        {
            std::vector<float> values(100);
            for (std::int64_t frame = 0; !bStop.load(); frame += 100)
            {
                for (std::size_t i = 0; i < values.size(); ++i)
                    values[i] = static_cast<float>((frame + static_cast<std::int64_t>(i)) % 1'000'000);
                std::vector<ChannelRows> rows;
                for (const std::uint32_t channel : channels)
                    rows.push_back({channel, values, 0});
                (void)pContext->AppendFrames(frame, 100, rows);
            }
        });
    EXPECT_TRUE(Eventually([&] { return pContext->GetTickRange().First > 0; }));
    std::size_t wrong = 0;
    for (int turn = 0; turn < 50; ++turn)
    {
        const VRecording copy = Streaming::CopyContext(*pContext);
        for (const auto& rChannel : copy.Channels)
            for (std::size_t row = 0; row < rChannel.RowCount(); ++row)
            {
                const std::int64_t frame = copy.Range.First / Period + static_cast<std::int64_t>(row);
                wrong += rChannel.Samples[row] == static_cast<float>(frame % 1'000'000) ? 0 : 1;
            }
    }
    bStop.store(true);
    producer.join();
    EXPECT_EQ(wrong, 0u);
}

} // namespace StreamingTest
