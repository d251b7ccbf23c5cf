#include "C3dBuilder.h"
#include "RecordingText.h"

#include "Recordings/C3d/C3dWriter.h"
#include "Recordings/Common/VReadProgress.h"
#include "Recordings/OpenRecording.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <limits>
#include <string>
#include <vector>

#include <malloc.h>

namespace TestRecordings
{

using Recordings::VReadProgress;
using Recordings::VRecording;

namespace
{

/// What came of reading a file whose listener said stop when it was asked for the i_StopAt-th time, from 0.
struct Outcome
{
    TQL::IResult Result;
    std::string Error;
    VRecording Recording;
    std::vector<double> Fractions;
};

Outcome Read(const std::filesystem::path& i_rPath, std::size_t i_StopAt)
{
    Outcome outcome;
    outcome.Recording.Name = "before";
    VReadProgress progress(
        [&](double i_Fraction)
        {
            outcome.Fractions.push_back(i_Fraction);
            return outcome.Fractions.size() <= i_StopAt;
        });
    Recordings::ReadOptions options;
    options.pProgress = &progress;
    outcome.Result = Recordings::OpenRecording(i_rPath, outcome.Recording, outcome.Error, options);
    return outcome;
}

/// Markers that move, with a gap in each; about i_Megabytes as a C3D file.
VRecording LongWalk(double i_Megabytes)
{
    constexpr std::size_t markers = 40;
    const auto frames = static_cast<std::size_t>(i_Megabytes * 1e6 / (markers * 16.0));
    VRecording recording;
    recording.Range = {0, static_cast<std::int64_t>(frames) * recording.FramePeriod};
    for (std::size_t i = 0; i < markers; ++i)
    {
        Recordings::RecordedChannel channel;
        channel.Kind = Recordings::EChannelKind::Marker;
        channel.Name = "M" + std::to_string(i);
        channel.ComponentNames = {"X", "Y", "Z"};
        channel.Units = "mm";
        channel.Rate = 120.0;
        channel.Samples.resize(frames * 3);
        for (std::size_t n = 0; n < channel.Samples.size(); ++n)
            channel.Samples[n] = n / 3 == 7 * i ? std::numeric_limits<float>::quiet_NaN()
                                                : static_cast<float>(n % 1000) + static_cast<float>(i);
        recording.Channels.push_back(std::move(channel));
    }
    return recording;
}

std::string Table(char i_Separator, const std::string& i_rHead)
{
    std::string text = i_rHead;
    for (int row = 0; row < 40'000; ++row)
    {
        const std::string number = std::to_string(row);
        text += number + "e-2" + i_Separator + number + ".5" + i_Separator + "-" + number + "\n";
    }
    return text;
}

void WriteText(const std::filesystem::path& i_rPath, const std::string& i_rText)
{
    std::ofstream(i_rPath, std::ios::binary) << i_rText;
}

/// A line of /proc/self/status in bytes.
double StatusBytes(const std::string& i_rKey)
{
    std::ifstream stream("/proc/self/status");
    for (std::string word; stream >> word;)
    {
        double kilobytes = 0.0;
        if (word == i_rKey + ":" && stream >> kilobytes)
            return kilobytes * 1024.0;
    }
    return 0.0;
}

} // namespace

TEST(ReadProgress, ReadersStopWheneverTheyAreToldTo)
{
    const TemporaryFolder folder;
    std::string error;
    ASSERT_TRUE(Recordings::WriteC3d(LongWalk(4.0), folder / "walk.c3d", error).IsSuccess()) << error;
    WriteText(folder / "table.csv", Table(',', "time,a,b\n"));
    WriteText(folder / "table.sto", Table('\t', "table\nversion=1\nendheader\ntime\ta\tb\n"));
    for (const std::string name : {"walk.c3d", "table.csv", "table.sto"})
    {
        const Outcome whole = Read(folder / name, std::numeric_limits<std::size_t>::max());
        ASSERT_TRUE(whole.Result.IsSuccess()) << name << ": " << whole.Error;
        ASSERT_GT(whole.Fractions.size(), 20u) << name;
        EXPECT_LE(whole.Fractions.size(), VReadProgress::Steps + 1) << name;
        EXPECT_TRUE(std::is_sorted(whole.Fractions.begin(), whole.Fractions.end())) << name;
        EXPECT_GE(whole.Fractions.front(), 0.0) << name;
        EXPECT_GT(whole.Fractions.back(), 0.95) << name;
        for (std::size_t stop = 0; stop < whole.Fractions.size(); ++stop)
        {
            const Outcome stopped = Read(folder / name, stop);
            ASSERT_EQ(stopped.Result, TQL::Result::Canceled) << name << " at " << stop;
            ASSERT_EQ(stopped.Error, name + ": reading was cancelled.");
            ASSERT_EQ(stopped.Recording.Name, "before") << "nothing is handed over";
            ASSERT_EQ(stopped.Fractions.size(), stop + 1) << "nobody is asked again";
        }
    }
}

TEST(ReadProgress, AFileThatIsShortenedWhileItIsReadIsAnErrorAndNoCrash)
{
    const TemporaryFolder folder;
    std::string error;
    ASSERT_TRUE(Recordings::WriteC3d(LongWalk(8.0), folder / "walk.c3d", error).IsSuccess()) << error;
    VReadProgress progress(
        [&](double)
        {
            std::filesystem::resize_file(folder / "walk.c3d", 4096);
            return true;
        });
    Recordings::ReadOptions options;
    options.pProgress = &progress;
    VRecording recording;
    EXPECT_EQ(Recordings::OpenRecording(folder / "walk.c3d", recording, error, options), TQL::Result::FileIOFailure);
    EXPECT_EQ(error,
              "walk.c3d: the file became shorter while it was read. Wait until it is written, and open it again.");
}

TEST(ReadProgress, OpeningTakesLittleMemoryBesideTheSamples)
{
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    GTEST_SKIP() << "a sanitizer keeps memory of its own";
#endif
    constexpr double megabytes = 24.0;
    const TemporaryFolder folder;
    std::string error;
    const VRecording walk = LongWalk(megabytes);
    ASSERT_TRUE(Recordings::WriteC3d(walk, folder / "walk.c3d", error).IsSuccess()) << error;
    malloc_trim(0); // what earlier tests left in the heap would be used again, and not be seen
    std::ofstream reset("/proc/self/clear_refs");
    if (!(reset << "5" << std::flush))
        GTEST_SKIP() << "this system does not let the highest memory be measured anew";
    const double before = StatusBytes("VmRSS");
    VRecording recording;
    ASSERT_TRUE(Recordings::OpenRecording(folder / "walk.c3d", recording, error).IsSuccess()) << error;
    const double samples = megabytes * 0.75e6;
    EXPECT_LT(StatusBytes("VmHWM") - before, 1.5 * samples) << "at most, while it was read";
    EXPECT_LT(StatusBytes("VmRSS") - before, 1.2 * samples) << "afterwards";
    EXPECT_GT(StatusBytes("VmRSS") - before, 0.7 * samples) << "or nothing was measured";
    ASSERT_EQ(recording.Channels.size(), walk.Channels.size());
    EXPECT_EQ(recording.Channels[39].Samples.size(), walk.Channels[39].Samples.size());
    EXPECT_EQ(recording.Channels[39].MissingCount(), 1u) << "pages that were given back are read again";
}

} // namespace TestRecordings
