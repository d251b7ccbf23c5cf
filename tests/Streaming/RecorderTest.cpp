#include "OscSupport.h"
#include "Recordings/OpenRecording.h"
#include "Streaming/VC3dRecorder.h"

#include <csignal>
#include <filesystem>
#include <fstream>
#include <limits>
#include <sys/resource.h>
#include <unistd.h>

namespace StreamingTest
{

namespace
{

using Channels::ChannelRows;
using Channels::VLiveContext;
using Streaming::LocalTime;
using Streaming::VC3dRecorder;

constexpr std::int64_t Period = 1'350'000;

/// While it lives no file can become longer: what a full disk is to the one who writes.
class FileLimit
{
public:
    explicit FileLimit(std::uint64_t i_Bytes)
    {
        m_Handler = std::signal(SIGXFSZ, SIG_IGN);
        ::getrlimit(RLIMIT_FSIZE, &m_Before);
        const rlimit limit{i_Bytes, m_Before.rlim_max};
        ::setrlimit(RLIMIT_FSIZE, &limit);
    }
    ~FileLimit()
    {
        ::setrlimit(RLIMIT_FSIZE, &m_Before);
        std::signal(SIGXFSZ, m_Handler);
    }

private:
    rlimit m_Before{};
    void (*m_Handler)(int);
};

class Recorder : public testing::Test
{
protected:
    Recorder()
    {
        std::filesystem::create_directories(m_Folder);
        VLiveContext::Options options;
        options.FramePeriod = Period;
        options.HistoryTicks = 400 * Period; // four seconds of what takes much longer
        m_pContext = std::make_shared<VLiveContext>("Live", std::make_shared<Channels::VSubTypeTable>(), options);
        m_Recorder.SetContext(m_pContext, 100.0);
    }
    ~Recorder() override { std::filesystem::remove_all(m_Folder); }

    void Add(const char* i_pName, std::size_t i_Numbers)
    {
        std::uint32_t channel = 0;
        Channels::ChannelDefinition definition;
        definition.Name = definition.Text = i_pName;
        definition.First = m_Numbers.size();
        definition.TypeName = i_Numbers == 3 ? "Labelled Reconstructions" : "ModelSetSamplesOutput";
        if (i_Numbers != 3)
            definition.ComponentNames =
                i_Numbers == 1 ? std::vector<std::string>{""} : std::vector<std::string>(i_Numbers, "n");
        ASSERT_TRUE(m_pContext->AddChannel(definition, 0, channel).IsSuccess());
        m_Numbers.push_back(i_Numbers);
    }

    static float Value(std::int64_t i_Frame, std::size_t i_Number)
    {
        return static_cast<float>(i_Frame * 10 + static_cast<std::int64_t>(i_Number));
    }

    /// Frames for the channels named, and the recorder at its work behind them.
    TQL::IResult Play(std::int64_t i_Frames, const std::vector<std::uint32_t>& i_rChannels)
    {
        TQL::IResult result = TQL::Result::Ok;
        for (const std::int64_t end = m_Frame + i_Frames; m_Frame < end && result.IsSuccess();)
        {
            const std::int64_t count = std::min<std::int64_t>(20, end - m_Frame);
            std::vector<std::vector<float>> values;
            std::vector<ChannelRows> rows;
            for (const std::uint32_t channel : i_rChannels)
            {
                auto& rValues = values.emplace_back();
                for (std::int64_t frame = 0; frame < count; ++frame)
                    for (std::size_t number = 0; number < m_Numbers[channel]; ++number)
                        rValues.push_back(Value(m_Frame + frame, number));
            }
            for (std::size_t i = 0; i < values.size(); ++i)
                rows.push_back({i_rChannels[i], values[i], 0});
            EXPECT_TRUE(m_pContext->AppendFrames(m_Frame, count, rows).IsSuccess());
            m_Frame += count;
            m_Now += std::chrono::milliseconds(10 * count);
            result = m_Recorder.Work(m_Now, m_Error);
        }
        return result;
    }

    Recordings::VRecording Read(const std::filesystem::path& i_rPath)
    {
        Recordings::VRecording read;
        std::string error;
        EXPECT_TRUE(Recordings::OpenRecording(i_rPath, read, error).IsSuccess()) << error;
        return read;
    }

    /// Each channel: its name, its frames, and how many of them have the wrong value or should not be there.
    static std::string Check(const Recordings::VRecording& i_rRecording,
                             const std::vector<std::pair<std::int64_t, std::int64_t>>& i_rRanges)
    {
        std::ostringstream text;
        for (std::size_t i = 0; i < i_rRecording.Channels.size(); ++i)
        {
            const auto& rChannel = i_rRecording.Channels[i];
            const std::size_t numbers = rChannel.ComponentCount();
            std::size_t wrong = 0;
            for (std::size_t at = 0; at < rChannel.Samples.size(); ++at)
            {
                const auto frame = static_cast<std::int64_t>(at / numbers);
                const bool bThere = frame >= i_rRanges[i].first && frame < i_rRanges[i].second;
                const float value = rChannel.Samples[at];
                wrong += bThere ? value != Value(frame, at % numbers) : !std::isnan(value);
            }
            text << rChannel.Name << " " << rChannel.RowCount() << " " << wrong << "; ";
        }
        return text.str();
    }

    std::filesystem::path GrowingFile() const
    {
        for (const auto& rEntry : std::filesystem::directory_iterator(m_Folder))
            if (rEntry.path() != m_Path)
                return rEntry.path();
        return {};
    }

    const std::filesystem::path m_Folder =
        std::filesystem::temp_directory_path() / ("graphplots-recorder-" + std::to_string(::getpid()));
    const std::filesystem::path m_Path = m_Folder / "out.c3d";
    std::shared_ptr<VLiveContext> m_pContext;
    VC3dRecorder m_Recorder{m_Path};
    std::vector<std::size_t> m_Numbers;
    std::vector<std::string> m_Remarks;
    std::string m_Error;
    std::string m_Stopped;
    std::int64_t m_Frame = 0;
    LocalTime m_Now = std::chrono::seconds(100);
};

} // namespace

TEST_F(Recorder, WritesMoreThanTheContextHoldsWithChannelsThatComeLate)
{
    std::ofstream(m_Path) << "old";
    ASSERT_TRUE(m_Recorder.Open(m_Error).IsSuccess()) << m_Error;
    Add("emg", 1);
    Add("W:LFHD", 3);
    EXPECT_TRUE(Play(1000, {0, 1}).IsSuccess());
    EXPECT_EQ(std::filesystem::file_size(m_Path), 3u) << "the old file stays until the new one is whole";
    EXPECT_EQ(Check(Read(GrowingFile()), {{0, 1000}, {0, 1000}}).substr(0, 7), "W:LFHD ") << "and it can be saved";
    Add("late", 3);
    Add("once", 1);
    EXPECT_TRUE(Play(500, {0, 1, 2}).IsSuccess());
    const std::vector<float> one{7.0f};
    const ChannelRows single[] = {{3, one, 0}};
    ASSERT_TRUE(m_pContext->AppendFrames(m_Frame++, 1, single).IsSuccess());
    EXPECT_TRUE(m_Recorder.Work(m_Now, m_Error).IsSuccess());
    m_Now += VC3dRecorder::Quiet; // a pause
    EXPECT_TRUE(m_Recorder.Work(m_Now, m_Error).IsSuccess());
    m_Frame += 700; // longer than the context keeps
    EXPECT_TRUE(Play(799, {0}).IsSuccess());
    ASSERT_TRUE(m_Recorder.Finish(m_Remarks, m_Stopped, m_Error).IsSuccess()) << m_Error;

    const Recordings::VRecording read = Read(m_Path);
    EXPECT_EQ(read.Range.Last / Period, 3000);
    EXPECT_EQ(m_Stopped, "");
    ASSERT_EQ(read.Channels.size(), 4u);
    EXPECT_EQ(Check(read, {{0, 1500}, {1000, 1500}, {0, 1500}, {0, 0}}),
              "W:LFHD 3000 0; late 3000 0; emg 3000 799; once 3000 1; ");
    EXPECT_EQ(read.Channels[3].Samples[1500], 7.0f) << "a single sample has its place";
    EXPECT_EQ(read.Channels[2].Samples[2999], Value(2999, 0));
    EXPECT_EQ(GrowingFile(), std::filesystem::path());
}

TEST_F(Recorder, AFullDiskKeepsWhatWasWritten)
{
    constexpr std::uint64_t head = 256 * 512;
    ASSERT_TRUE(m_Recorder.Open(m_Error).IsSuccess()) << m_Error;
    Add("emg", 1);
    Add("W:LFHD", 3);
    {
        const FileLimit limit(head + 20 * 600 + 7); // twenty bytes a frame
        EXPECT_EQ(Play(1000, {0, 1}), TQL::Result::DiskFull);
        ASSERT_TRUE(m_Recorder.Finish(m_Remarks, m_Stopped, m_Error).IsSuccess()) << m_Error;
    }
    EXPECT_DOUBLE_EQ(m_Recorder.Seconds(), 6.0);
    EXPECT_EQ(Check(Read(m_Path), {{0, 600}, {0, 600}}), "W:LFHD 600 0; emg 600 0; ");
}

TEST_F(Recorder, WithoutRoomForChannelsThatCameLateTheOthersStay)
{
    constexpr std::uint64_t head = 256 * 512;
    ASSERT_TRUE(m_Recorder.Open(m_Error).IsSuccess()) << m_Error;
    Add("emg", 1);
    EXPECT_TRUE(Play(1000, {0}).IsSuccess());
    Add("late", 3);
    EXPECT_TRUE(Play(1000, {0, 1}).IsSuccess());
    {
        const FileLimit limit(head + 4 * 1000 + 20 * 1000 + 100);
        ASSERT_TRUE(m_Recorder.Finish(m_Remarks, m_Stopped, m_Error).IsSuccess()) << m_Error;
    }
    EXPECT_EQ(m_Remarks.back(), "1 channel was left out, for which the file or the disk has no room: late");
    EXPECT_EQ(Check(Read(m_Path), {{0, 2000}}), "emg 2000 0; ");
}

TEST_F(Recorder, StraysDoNotTakeThePlaceOfOthers)
{
    ASSERT_TRUE(m_Recorder.Open(m_Error).IsSuccess()) << m_Error;
    for (int i = 0; i < 200; ++i)
        Add(("stray" + std::to_string(i)).c_str(), 64);
    Add("good", 1);
    std::vector<std::uint32_t> all(201);
    for (std::uint32_t i = 0; i < all.size(); ++i)
        all[i] = i;
    const std::vector<float> zeros(64);
    std::vector<ChannelRows> rows;
    for (std::uint32_t i = 0; i < 200; ++i)
        rows.push_back({i, zeros, 0});
    ASSERT_TRUE(m_pContext->AppendFrames(m_Frame++, 1, rows).IsSuccess());
    EXPECT_TRUE(Play(999, {200}).IsSuccess());
    ASSERT_TRUE(m_Recorder.Finish(m_Remarks, m_Stopped, m_Error).IsSuccess()) << m_Error;
    const Recordings::VRecording read = Read(m_Path);
    ASSERT_FALSE(read.Channels.empty());
    EXPECT_EQ(read.Channels.front().Name, "good");
    EXPECT_NE(m_Remarks.back().find(" channels were left out, for which the file or the disk has no room: stray"),
              std::string::npos)
        << m_Remarks.back();
}

TEST_F(Recorder, WhatCannotBeWrittenIsToldBeforeAnythingComes)
{
    std::filesystem::create_directory(m_Folder / "folder.c3d");
    for (const char* pName : {"no/such.c3d", "folder.c3d"})
    {
        VC3dRecorder recorder(m_Folder / pName);
        EXPECT_TRUE(recorder.Open(m_Error).IsError()) << pName;
        EXPECT_NE(m_Error.find(std::filesystem::path(pName).filename().string()), std::string::npos) << m_Error;
    }
}

} // namespace StreamingTest
