#include "RecordingText.h"

#include "Recordings/Common/NamePattern.h"
#include "Recordings/Tables/CsvExport.h"

#include <gtest/gtest.h>

#include <unistd.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

namespace TestRecordings
{

using Recordings::RecordedChannel;
using Recordings::VRecording;

namespace
{

RecordedChannel MakeChannel(std::string i_Name, std::vector<std::string> i_Components, std::int64_t i_FirstTick,
                            std::int64_t i_Period, std::vector<float> i_Samples)
{
    RecordedChannel channel;
    channel.Name = std::move(i_Name);
    channel.ComponentNames = std::move(i_Components);
    channel.FirstTick = i_FirstTick;
    channel.SamplePeriod = i_Period;
    channel.Samples = std::move(i_Samples);
    return channel;
}

// Markers at 100 Hz from 0.01 s, a plain channel at 200 Hz from 0, one sample alone in between.
VRecording MakeRecording()
{
    VRecording recording;
    recording.FramePeriod = 1350000;
    recording.Channels.push_back(
        MakeChannel("Ann:Head", {"X", "Y", "Z"}, 1350000, 1350000, {0.1f, -2.0f, 3e-40f, NAN, NAN, NAN}));
    recording.Channels.push_back(MakeChannel("Fz", {""}, 0, 675000, {1.0f, 16777216.0f, 3.4028235e38f, -0.0f, 5.5f}));
    recording.Channels.push_back(MakeChannel("a \"b\", c", {"Q"}, 1000000, 1, {7.0f}));
    recording.Channels.push_back(MakeChannel("Ann:Toe", {"X", "Y", "Z"}, 1350000, 1350000, {1, 2, 3, 4, NAN, 6}));
    return recording;
}

std::string Export(const VRecording& i_rRecording, const std::vector<std::string>& i_rPatterns)
{
    const TemporaryFolder folder;
    std::string error;
    const TQL::IResult result = Recordings::ExportCsv(i_rRecording, folder / "a.csv", i_rPatterns, error);
    EXPECT_EQ(folder.FileNames().size(), result.IsSuccess() ? 1u : 0u);
    return result.IsSuccess() ? ReadText(folder / "a.csv") : "error: " + error;
}

} // namespace

TEST(CsvExport, Table)
{
    EXPECT_EQ(Export(MakeRecording(), {}),
              "frame,time,Ann:Head.X,Ann:Head.Y,Ann:Head.Z,Fz,\"a \"\"b\"\", c.Q\",Ann:Toe.X,Ann:Toe.Y,Ann:Toe.Z\n"
              "1,0,,,,1,,,,\n"
              "1,0.005,,,,16777216,,,,\n"
              "1,0.007407407407407408,,,,,7,,,\n"
              "2,0.01,0.1,-2,3e-40,3.4028235e+38,,1,2,3\n"
              "2,0.015,,,,-0,,,,\n"
              "3,0.02,,,,5.5,,4,,6\n");
}

TEST(CsvExport, Patterns)
{
    const VRecording recording = MakeRecording();
    EXPECT_EQ(Export(recording, {"Fz"}),
              "frame,time,Fz\n1,0,1\n1,0.005,16777216\n2,0.01,3.4028235e+38\n2,0.015,-0\n3,0.02,5.5\n");
    EXPECT_EQ(Export(recording, {"*Toe", "a*"}), "frame,time,\"a \"\"b\"\", c.Q\",Ann:Toe.X,Ann:Toe.Y,Ann:Toe.Z\n"
                                                 "1,0.007407407407407408,7,,,\n2,0.01,,1,2,3\n3,0.02,,4,,6\n");
    // Rows where all are missing stay: the recording has a sample there, without a value.
    EXPECT_EQ(Export(recording, {"Ann:Head"}),
              "frame,time,Ann:Head.X,Ann:Head.Y,Ann:Head.Z\n2,0.01,0.1,-2,3e-40\n3,0.02,,,\n");
    EXPECT_EQ(Export(recording, {"Fz", "toe"}),
              "error: no channel is named like \"toe\". Capitals count; look the names up in the list of channels.");
    EXPECT_EQ(Export({}, {}), "error: the recording holds no channels, so there is nothing to export.");
}

TEST(CsvExport, ManyRowsAndAFullDisk)
{
    VRecording recording;
    std::vector<float> samples(300000);
    for (std::size_t i = 0; i < samples.size(); ++i)
        samples[i] = static_cast<float>(i) / 3.0f;
    recording.Channels.push_back(MakeChannel("a", {""}, 0, 1125000, samples));
    const std::string text = Export(recording, {});
    EXPECT_EQ(std::count(text.begin(), text.end(), '\n'), 300001);
    EXPECT_TRUE(text.ends_with("\n300000,2499.991666666667,99999.664\n")) << text.substr(text.size() - 60);
    std::size_t row = 0;
    for (std::size_t line = text.find('\n') + 1; line < text.size(); line = text.find('\n', line) + 1, ++row)
    {
        const std::size_t time = text.find(',', line) + 1;
        ASSERT_EQ(std::strtoull(text.c_str() + line, nullptr, 10), row + 1);
        ASSERT_EQ(std::strtof(text.c_str() + text.find(',', time) + 1, nullptr), samples[row]);
        ASSERT_EQ(std::llround(std::strtod(text.c_str() + time, nullptr) * 135e6),
                  static_cast<long long>(row) * 1125000);
    }

    if (!std::filesystem::is_character_file("/dev/full"))
        GTEST_SKIP() << "no /dev/full here";
    std::string error;
    EXPECT_EQ(Recordings::ExportCsv(recording, "/dev/full", {}, error), TQL::Result::DiskFull);
    EXPECT_NE(error.find("No space left on device"), std::string::npos) << error;
}

TEST(CsvExport, IntoAPipe)
{
    int ends[2] = {};
    ASSERT_EQ(pipe(ends), 0);
    const std::filesystem::path place = "/proc/self/fd/" + std::to_string(ends[1]);
    std::string error;
    const std::vector<std::string> patterns{"a*"};
    EXPECT_EQ(Recordings::ExportCsv(MakeRecording(), place, patterns, error), TQL::Result::Ok) << error;
    close(ends[1]);
    char text[200] = {};
    EXPECT_GT(read(ends[0], text, sizeof(text) - 1), 0);
    EXPECT_STREQ(text, "frame,time,\"a \"\"b\"\", c.Q\"\n1,0.007407407407407408,7\n");
    close(ends[0]);
}

TEST(NamePattern, Globs)
{
    struct Case
    {
        const char* Name;
        const char* Pattern;
        bool bMatches;
    };
    const Case cases[] = {
        {"Ann:Head", "Ann:Head", true},
        {"Ann:Head", "Ann:head", false},
        {"Ann:Head", "Ann", false},
        {"Ann:Head", "Ann:*", true},
        {"Ann:Head", "*Head", true},
        {"Ann:Head", "*", true},
        {"Ann:Head", "A*:*d", true},
        {"Ann:Head", "A*:*x", false},
        {"Ann:Head", "???:????", true},
        {"Ann:Head", "???:?????", false},
        {"Ann:Head", "*?", true},
        {"", "*", true},
        {"", "", true},
        {"", "?", false},
        {"a", "", false},
        {"abcabd", "*abd", true},
        {"abab", "*ab*ab", true},
        {"aab", "a*ab*b", false},
        {"[x]", "[x]", true},
        {"x", "[x]", false},
        {"F\xC3\xBC"
         "r",
         "F?r", true},
        {"F\xC3\xBC"
         "r",
         "F??r", false},
        {"a*b", "a*b", true},
        {"a", "a**", true},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(Recordings::MatchesPattern(rCase.Name, rCase.Pattern), rCase.bMatches)
            << rCase.Name << " ~ " << rCase.Pattern;
    // Many stars on a long name that fails at its end: no explosion of retries.
    EXPECT_FALSE(Recordings::MatchesPattern(std::string(20000, 'a'), "*a*a*a*a*a*a*a*a*a*a*b"));
}

} // namespace TestRecordings
