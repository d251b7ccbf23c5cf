#include "RecordingText.h"

#include "Recordings/C3d/C3dHeader.h"
#include "Recordings/C3d/C3dParameters.h"
#include "Recordings/C3d/C3dWriter.h"
#include "Recordings/OpenRecording.h"

#include <gtest/gtest.h>

#include <sys/resource.h>

#include <algorithm>
#include <cmath>
#include <csignal>
#include <cstdint>
#include <cstring>
#include <limits>
#include <random>
#include <span>
#include <string>
#include <vector>

namespace TestRecordings
{

using Recordings::EChannelKind;
using Recordings::RecordedChannel;
using Recordings::VRecording;

namespace
{

constexpr float Missing = std::numeric_limits<float>::quiet_NaN();

RecordedChannel MakeChannel(EChannelKind i_Kind, std::string i_Name, std::string i_Units, std::size_t i_Rows)
{
    RecordedChannel channel;
    channel.Kind = i_Kind;
    channel.Name = std::move(i_Name);
    channel.Units = std::move(i_Units);
    const bool bMarker = i_Kind == EChannelKind::Marker;
    channel.ComponentNames = bMarker ? std::vector<std::string>{"X", "Y", "Z"} : std::vector<std::string>{""};
    channel.Rate = bMarker ? 120.0 : 1200.0;
    channel.SamplePeriod = bMarker ? 1125000 : 112500;
    channel.Samples.assign(i_Rows * channel.ComponentCount(), 0.0f);
    return channel;
}

// Any float but those that no file of reals keeps apart from a gap, with gaps.
void FillWithAnything(RecordedChannel& io_rChannel, std::mt19937& io_rRandom)
{
    for (float& rValue : io_rChannel.Samples)
    {
        const auto bits = static_cast<std::uint32_t>(io_rRandom());
        std::memcpy(&rValue, &bits, sizeof(rValue));
        if (std::isnan(rValue))
            rValue = -0.0f;
    }
    for (std::size_t row = 0; row < io_rChannel.RowCount(); ++row)
        if (io_rRandom() % 7 == 0)
            for (std::size_t i = 0; i < io_rChannel.ComponentCount(); ++i)
                io_rChannel.Samples[row * io_rChannel.ComponentCount() + i] = Missing;
}

VRecording MakeRecording(std::size_t i_Markers, std::size_t i_Analog, std::size_t i_Frames)
{
    std::mt19937 random(3);
    VRecording recording;
    recording.Format = "C3D";
    recording.Range = {0, static_cast<std::int64_t>(i_Frames) * recording.FramePeriod};
    for (std::size_t i = 0; i < i_Markers; ++i)
    {
        recording.Channels.push_back(MakeChannel(EChannelKind::Marker, "Ann:M" + std::to_string(i), "mm", i_Frames));
        recording.Channels.back().Subject = "Ann";
    }
    for (std::size_t i = 0; i < i_Analog; ++i)
        recording.Channels.push_back(
            MakeChannel(EChannelKind::Analog, "A" + std::to_string(i), i % 2 == 0 ? "V" : "", i_Frames * 10));
    for (RecordedChannel& rChannel : recording.Channels)
        FillWithAnything(rChannel, random);
    return recording;
}

void MoveTo(VRecording& io_rRecording, std::int64_t i_FirstTick)
{
    io_rRecording.Range = {i_FirstTick, i_FirstTick + io_rRecording.Range.Last - io_rRecording.Range.First};
    for (RecordedChannel& rChannel : io_rRecording.Channels)
        rChannel.FirstTick = i_FirstTick;
}

// Same text, and the samples the same to the bit.
void ExpectRoundTrip(const VRecording& i_rRecording)
{
    const TemporaryFolder folder;
    std::string error;
    ASSERT_EQ(Recordings::WriteC3d(i_rRecording, folder / "written.c3d", error), TQL::Result::Ok) << error;
    EXPECT_EQ(folder.FileNames(), std::vector<std::string>{"written.c3d"});
    VRecording again;
    ASSERT_TRUE(Recordings::OpenRecording(folder / "written.c3d", again, error).IsSuccess()) << error;
    EXPECT_EQ(again.Name, "written");
    // Compared as booleans: the difference of two long texts takes longer to print than anybody would read.
    EXPECT_TRUE(TextOf(again) == TextOf(i_rRecording)) << WarningsOf(again);
    ASSERT_EQ(again.Channels.size(), i_rRecording.Channels.size());
    for (std::size_t i = 0; i < again.Channels.size(); ++i)
    {
        const std::vector<float>& rA = again.Channels[i].Samples;
        const std::vector<float>& rB = i_rRecording.Channels[i].Samples;
        ASSERT_EQ(rA.size(), rB.size());
        EXPECT_TRUE(std::equal(rA.begin(), rA.end(), rB.begin(),
                               [](float i_A, float i_B) {
                                   return (std::isnan(i_A) && std::isnan(i_B)) ||
                                          std::memcmp(&i_A, &i_B, sizeof(float)) == 0;
                               }))
            << again.Channels[i].Name;
    }
}

} // namespace

TEST(C3dWriter, RoundTripIsExact)
{
    ExpectRoundTrip(MakeRecording(3, 2, 50));
    ExpectRoundTrip(MakeRecording(0, 3, 5));
    ExpectRoundTrip(MakeRecording(2, 0, 5));
    ExpectRoundTrip(MakeRecording(600, 300, 3)); // labels, units, scales and offsets go on in further parameters

    VRecording outputs = MakeRecording(300, 1, 4); // the list of the angles goes on in a further parameter
    for (std::size_t i = 1; i < 300; ++i)
    {
        constexpr std::pair<const char*, const char*> quantities[] = {
            {"Angle", "rad"}, {"Force", "N/kg"}, {"Moment", "Nm"}, {"Power", "W"}, {"Scalar", ""}, {"Reaction", "N"}};
        const auto [pQuantity, pUnits] = quantities[i < 260 ? 0 : i % 6];
        outputs.Channels[i].Kind = EChannelKind::ModelOutput;
        outputs.Channels[i].Quantity = pQuantity;
        outputs.Channels[i].Units = pUnits;
    }
    ExpectRoundTrip(outputs);

    VRecording partial = MakeRecording(1, 0, 2);
    partial.Channels[0].Samples = {1.0f, Missing, 3.0f, Missing, Missing, Missing};
    ExpectRoundTrip(partial);

    VRecording late = MakeRecording(1, 1, 40);
    MoveTo(late, 1125000ll * 65520); // ends behind the last frame number of 16 bits
    ExpectRoundTrip(late);
}

TEST(C3dWriter, RoundTripOfALongRecording)
{
    ExpectRoundTrip(MakeRecording(2, 1, 70000));
}

TEST(C3dWriter, HeaderAndParametersNameTheSameData)
{
    const TemporaryFolder folder;
    std::string error;
    ASSERT_EQ(Recordings::WriteC3d(MakeRecording(3, 0, 5), folder / "a.c3d", error), TQL::Result::Ok) << error;
    const std::string text = ReadText(folder / "a.c3d");
    const auto file = std::as_bytes(std::span(text));
    Recordings::C3dHeader header;
    Recordings::VC3dParameters parameters;
    ASSERT_TRUE(Recordings::ReadC3dHeader(file, header, error).IsSuccess()) << error;
    ASSERT_TRUE(Recordings::VC3dParameters::Read(file, header, parameters, error).IsSuccess()) << error;
    ASSERT_GT(header.DataOffset, 0u);
    EXPECT_EQ((parameters.Number("POINT", "DATA_START").value_or(0.0) - 1.0) * 512.0,
              static_cast<double>(header.DataOffset));
}

TEST(C3dWriter, RoundTripOfEvents)
{
    VRecording recording = MakeRecording(1, 0, 5);
    for (int i = 0; i < 300; ++i)
        recording.Events.push_back(
            {i % 2 == 0 ? "Ann" : "", "Foot Strike " + std::to_string(i), i * 7.5, i % 3 == 0 ? "Left" : "Right"});
    ExpectRoundTrip(recording);
}

TEST(C3dWriter, SaysWhatItCannotHold)
{
    struct Case
    {
        const char* Name;
        void (*pChange)(VRecording& io_rRecording);
        TQL::IResult Expected;
        const char* Message; ///< part of it
    };
    const Case cases[] = {
        {"other kinds are left out",
         [](VRecording& io_r)
         {
             io_r.Channels[0].Kind = EChannelKind::SegmentPose;
             io_r.Channels[0].ComponentNames.resize(6);
         },
         TQL::Result::OkButPartial, "1 channels are left out"},
        {"nothing to write", [](VRecording& io_r) { io_r.Channels.clear(); }, TQL::Result::InvalidArgument,
         "no frames"},
        {"no grid", [](VRecording& io_r) { io_r.FramePeriod = 0; }, TQL::Result::InvalidArgument, "no frames"},
        {"units differ", [](VRecording& io_r) { io_r.Channels[1].Units = "m"; }, TQL::Result::InvalidArgument,
         "differ in units"},
        {"outputs differ in units",
         [](VRecording& io_r)
         {
             for (std::size_t i = 0; i < 2; ++i)
             {
                 io_r.Channels[i].Kind = EChannelKind::ModelOutput;
                 io_r.Channels[i].Quantity = "Angle";
                 io_r.Channels[i].Units = i == 0 ? "deg" : "rad";
             }
         },
         TQL::Result::InvalidArgument, "differ in units"},
        {"lengths differ", [](VRecording& io_r) { io_r.Channels[1].Samples.resize(3); }, TQL::Result::InvalidArgument,
         "rate or length"},
        {"off the grid", [](VRecording& io_r) { MoveTo(io_r, 1000); }, TQL::Result::InvalidArgument, "rate or length"},
        {"before the first frame", [](VRecording& io_r) { MoveTo(io_r, -11250000); }, TQL::Result::InvalidArgument,
         "cannot hold"},
        {"analog not whole", [](VRecording& io_r) { io_r.Channels[3].Samples.pop_back(); },
         TQL::Result::InvalidArgument, "same whole number"},
        {"name too long", [](VRecording& io_r) { io_r.Channels[0].Name.assign(256, 'n'); },
         TQL::Result::InvalidArgument, "255 bytes"},
        {"names too many",
         [](VRecording& io_r)
         {
             for (int i = 0; i < 600; ++i)
             {
                 io_r.Channels.push_back(io_r.Channels[0]);
                 io_r.Channels.back().Name = std::string(250, 'n');
             }
         },
         TQL::Result::NotSupported, "Choose fewer channels"},
    };
    for (const Case& rCase : cases)
    {
        VRecording recording = MakeRecording(2, 2, 4);
        rCase.pChange(recording);
        const TemporaryFolder folder;
        std::string error;
        EXPECT_EQ(Recordings::WriteC3d(recording, folder / "a.c3d", error), rCase.Expected) << rCase.Name;
        EXPECT_NE(error.find(rCase.Message), std::string::npos) << rCase.Name << ": " << error;
        EXPECT_EQ(folder.FileNames().empty(), rCase.Expected.IsError()) << rCase.Name;
    }
}

TEST(C3dWriter, DiskThatFillsUpLeavesTheOldFile)
{
    const TemporaryFolder folder;
    WriteBytes(folder / "a.c3d", {std::byte{'o'}, std::byte{'l'}, std::byte{'d'}});
    const VRecording recording = MakeRecording(10, 0, 20000);

    // A file of this process may grow to 100 kB, then writing fails like on a full disk.
    rlimit before{};
    ASSERT_EQ(getrlimit(RLIMIT_FSIZE, &before), 0);
    rlimit limit = before;
    limit.rlim_cur = 100000;
    const auto oldHandler = std::signal(SIGXFSZ, SIG_IGN);
    ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &limit), 0);
    std::string error;
    const TQL::IResult result = Recordings::WriteC3d(recording, folder / "a.c3d", error);
    ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &before), 0);
    std::signal(SIGXFSZ, oldHandler);

    EXPECT_EQ(result, TQL::Result::FileIOFailure);
    EXPECT_NE(error.find("a.c3d: the file cannot be written (File too large)"), std::string::npos) << error;
    EXPECT_EQ(folder.FileNames(), std::vector<std::string>{"a.c3d"});
    EXPECT_EQ(ReadText(folder / "a.c3d"), "old");
}

TEST(C3dWriter, PlacesThatCannotBeWritten)
{
    const VRecording recording = MakeRecording(1, 0, 10);
    const TemporaryFolder folder;
    std::string error;
    EXPECT_EQ(Recordings::WriteC3d(recording, folder.Path(), error), TQL::Result::InvalidArgument);
    EXPECT_NE(error.find("this is a folder"), std::string::npos) << error;
    EXPECT_EQ(Recordings::WriteC3d(recording, folder / "none/a.c3d", error), TQL::Result::FileIOFailure);
    EXPECT_NE(error.find("No such file or directory"), std::string::npos) << error;
    if (!std::filesystem::is_character_file("/dev/full"))
        GTEST_SKIP() << "no /dev/full here";
    EXPECT_EQ(Recordings::WriteC3d(recording, "/dev/full", error), TQL::Result::DiskFull);
    EXPECT_NE(error.find("full: the file cannot be written (No space left on device)"), std::string::npos) << error;
    EXPECT_TRUE(std::filesystem::is_character_file("/dev/full"));
}

TEST(C3dWriter, KeepsLinksAndPermissions)
{
    const TemporaryFolder folder;
    const std::string longest = std::string(251, 'x') + ".c3d";
    WriteBytes(folder / "real.c3d", {std::byte{'o'}});
    std::filesystem::create_symlink(folder / "real.c3d", folder / "link.c3d");
    std::filesystem::create_symlink("fresh.c3d", folder / "nowhere.c3d");
    std::filesystem::create_symlink("victim", folder / "real.c3d.part"); // a name that could have been guessed
    const auto permissions = std::filesystem::perms::owner_read | std::filesystem::perms::owner_write;
    std::filesystem::permissions(folder / "real.c3d", permissions);
    std::string error;
    for (const std::string& rName : {std::string("link.c3d"), std::string("nowhere.c3d"), longest})
        EXPECT_EQ(Recordings::WriteC3d(MakeRecording(1, 0, 10), folder / rName, error), TQL::Result::Ok) << error;
    EXPECT_TRUE(std::filesystem::is_symlink(folder / "link.c3d"));
    EXPECT_TRUE(std::filesystem::is_symlink(folder / "nowhere.c3d"));
    EXPECT_EQ(std::filesystem::status(folder / "real.c3d").permissions(), permissions);
    for (const std::string& rName : {std::string("real.c3d"), std::string("fresh.c3d"), longest})
        EXPECT_GT(std::filesystem::file_size(folder / rName), 512u);
    EXPECT_FALSE(std::filesystem::exists(folder / "victim"));
    EXPECT_EQ(Recordings::WriteC3d(MakeRecording(1, 0, 10), folder / ("x" + longest), error),
              TQL::Result::FileIOFailure);
    EXPECT_EQ(folder.FileNames().size(), 6u) << "nothing is left beside them";
}

} // namespace TestRecordings
