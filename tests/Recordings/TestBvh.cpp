#include "Recordings/Bvh/BvhReader.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <span>
#include <string>
#include <vector>

namespace TestRecordings
{

namespace
{

using Recordings::EChannelKind;
using Recordings::RecordedChannel;
using Recordings::VRecording;

/// A hip with a fixed joint below it and an elbow below that.
const std::string s_Hierarchy = "HIERARCHY\nROOT Hip\n{\n OFFSET 1 2 3\n"
                                " CHANNELS 6 Xposition Yposition Zposition Zrotation Xrotation Yrotation\n"
                                " JOINT Spacer {\n  OFFSET 0 10 0\n"
                                "  JOINT Elbow\n  {\n   OFFSET 0 0 5\n   CHANNELS 3 Yrotation Xrotation Zrotation\n"
                                "   End Site\n   {\n    OFFSET 0 1 0\n   }\n  }\n }\n}\n";

std::string Motion(const std::string& i_rFrames, const std::string& i_rTime = "0.01")
{
    return s_Hierarchy + "MOTION\nFrames: 2\nFrame Time: " + i_rTime + "\n" + i_rFrames;
}

const std::string s_Rest = "0 0 0 0 0 0 0 0 0\n";

struct Read
{
    VRecording Recording;
    std::string Error;
    TQL::IResult Result; // made from those above

    explicit Read(const std::string& i_rText)
        : Result(Recordings::ReadBvh(std::as_bytes(std::span(i_rText)), {}, Recording, Error))
    {
    }

    /// One row of a channel, NaN as "nan"; rounded to a thousandth.
    std::string Row(EChannelKind i_Kind, const std::string& i_rName, std::size_t i_Row) const
    {
        for (const RecordedChannel& rChannel : Recording.Channels)
            if (rChannel.Kind == i_Kind && rChannel.Name == i_rName && i_Row < rChannel.RowCount())
            {
                std::string text;
                for (std::size_t i = 0; i < rChannel.ComponentCount(); ++i)
                {
                    const float value = rChannel.Samples[i_Row * rChannel.ComponentCount() + i];
                    char number[32];
                    std::snprintf(number, sizeof number, "%.3f", std::round(value * 1000.0) / 1000.0 + 0.0);
                    text += (i == 0 ? "" : " ") + std::string(std::isnan(value) ? "nan" : number);
                }
                return text;
            }
        return "absent";
    }
};

TEST(Bvh, RotationsTurnInTheOrderOfTheirColumnsAndPositionsAddUp)
{
    // A quarter turn about Z and then one about the new X: the hip's Y points along Z, its Z along X.
    const Read read(Motion("100 0 0 90 90 0 0 0 0\n0 0 0 0 90 0 0 0 90\n"));
    ASSERT_TRUE(read.Result.IsSuccess()) << read.Error;
    EXPECT_EQ(read.Row(EChannelKind::JointAngles, "Hip", 0), "90.000 90.000 0.000");
    EXPECT_EQ(read.Row(EChannelKind::Column, "Hip position", 0), "100.000 0.000 0.000");
    EXPECT_EQ(read.Row(EChannelKind::JointAngles, "Elbow", 1), "0.000 0.000 90.000");
    EXPECT_EQ(read.Row(EChannelKind::SegmentPose, "Hip", 0), "1.209 1.209 1.209 101.000 2.000 3.000");
    EXPECT_EQ(read.Row(EChannelKind::SegmentPose, "Elbow", 0), "1.209 1.209 1.209 106.000 2.000 13.000");
    EXPECT_EQ(read.Row(EChannelKind::SegmentPose, "Elbow", 1), "1.209 -1.209 1.209 1.000 -3.000 13.000");
    EXPECT_EQ(read.Row(EChannelKind::SegmentPose, "Spacer", 0), "absent") << "it moves with its parent";
    EXPECT_TRUE(read.Recording.Warnings.empty());
    EXPECT_EQ(read.Recording.Range.Last, 2 * Recordings::PeriodOfRate(100.0));
}

TEST(Bvh, QuirksAreReadAndTold)
{
    struct Row
    {
        const char* pWhat;
        std::string Text;
        const char* pWarning; ///< a part of the one warning; empty for none
        const char* pElbow;   ///< its angles in the last frame
    };
    const Row rows[] = {
        {"mixed line ends, small letters, no leading zero",
         "hierarchy\r\n" + s_Hierarchy.substr(10) + "Motion\r\nframes: 2\rframe time:\t.01\r\n" + s_Rest +
             "0 0 0 0 0 0 -.5 +.25 1e1\r\n",
         "", "-0.500 0.250 10.000"},
        {"a frame time cut to its digits", Motion(s_Rest + s_Rest, ".0083333"), "", "0.000 0.000 0.000"},
        {"no frame time", s_Hierarchy + "MOTION\nFrames: 2\n" + s_Rest + s_Rest, "no frame time", "0.000 0.000 0.000"},
        {"a frame time of ages", Motion(s_Rest + s_Rest, "055555555824"), "no usable time", "0.000 0.000 0.000"},
        {"a frame time below a tick", Motion(s_Rest + s_Rest, "1e-12"), "no usable time", "0.000 0.000 0.000"},
        {"a frame time of nothing", Motion(s_Rest + s_Rest, "0"), "no usable time", "0.000 0.000 0.000"},
        {"fewer frames than promised", Motion(s_Rest), "promises 2 frames and holds 1", "0.000 0.000 0.000"},
        {"more frames than promised", Motion(s_Rest + s_Rest + "0 0 0 0 0 0 7 8 9\n"), "holds 3", "7.000 8.000 9.000"},
        {"a promise of 2^31",
         "HIERARCHY" + s_Hierarchy.substr(9) + "MOTION\nFrames: 2147483648\nFrame Time: 0.01\n" + s_Rest,
         "promises 2147483648", "0.000 0.000 0.000"},
        {"frames across lines", Motion("0 0 0 0\n0 0 0\n0 0\n0 0 0 0 0 0 4\n5\n6\n"), "", "4.000 5.000 6.000"},
        {"a line that is short", Motion(s_Rest + "0 0 0 0 0 0 7 8\n"), "another number of values", "7.000 8.000 nan"},
        {"a file torn in a number", Motion(s_Rest + s_Rest + "0 0 0 0 0 0 7 8.7"), "not complete; it is left out",
         "0.000 0.000 0.000"},
        {"a word and a number beyond all", Motion(s_Rest + "0 0 0 0 0 0 x 1e999 2\n"), "2 numbers", "nan nan 2.000"},
    };
    for (const Row& rRow : rows)
    {
        const Read read(rRow.Text);
        ASSERT_TRUE(read.Result.IsSuccess()) << rRow.pWhat << ": " << read.Error;
        std::string warnings;
        for (const std::string& rWarning : read.Recording.Warnings)
            warnings += rWarning + '\n';
        EXPECT_EQ(read.Recording.Warnings.size(), *rRow.pWarning == '\0' ? 0u : 1u) << rRow.pWhat << '\n' << warnings;
        EXPECT_NE(warnings.find(rRow.pWarning), std::string::npos) << rRow.pWhat << '\n' << warnings;
        EXPECT_EQ(read.Recording.Remarks.size(), rRow.Text.find(".0083333") == std::string::npos ? 0u : 1u);
        const std::size_t frames = read.Recording.Channels.front().RowCount();
        EXPECT_EQ(read.Row(EChannelKind::JointAngles, "Elbow", frames - 1), rRow.pElbow) << rRow.pWhat;
    }
}

TEST(Bvh, AMissingNumberTakesThePosesThatHangFromIt)
{
    const Read read(Motion(s_Rest + "0 0 0 0 nan 0 0 0 0\n"));
    ASSERT_TRUE(read.Result.IsSuccess()) << read.Error;
    EXPECT_EQ(read.Row(EChannelKind::SegmentPose, "Hip", 0), "0.000 0.000 0.000 1.000 2.000 3.000");
    EXPECT_EQ(read.Row(EChannelKind::SegmentPose, "Elbow", 1), "nan nan nan nan nan nan");
}

TEST(Bvh, PositionsOfInnerJointsStandForTheirOffsets)
{
    const Read read(
        "HIERARCHY\nROOT A\n{\nOFFSET 0 0 0\nCHANNELS 1 Xrotation\nJOINT A\n{\nOFFSET 1 1 1\n"
        "CHANNELS 4 Xposition Yposition Zposition Wobble\n}\n}\nMOTION\nFrames: 1\nFrame Time: 1\n0 5 6 7 8\n");
    ASSERT_TRUE(read.Result.IsSuccess()) << read.Error;
    EXPECT_EQ(read.Row(EChannelKind::SegmentPose, "A#2", 0), "0.000 0.000 0.000 5.000 6.000 7.000");
    ASSERT_EQ(read.Recording.Warnings.size(), 1u);
    EXPECT_NE(read.Recording.Warnings.front().find("Wobble"), std::string::npos);
}

TEST(Bvh, BadFilesGetAClearError)
{
    struct Row
    {
        std::string Text;
        const char* pError; ///< a part of it
    };
    std::string deep = "HIERARCHY\nROOT R\n{\n";
    for (int i = 0; i < 100000; ++i)
        deep += "JOINT J\n{\n";
    // Each short line would become a frame of all channels.
    std::string wide = "HIERARCHY\nROOT R\n{\n";
    for (int i = 0; i < 1000; ++i)
        wide += "CHANNELS 3 Xrotation Yrotation Zrotation\nJOINT J\n{\n";
    for (int i = 0; i < 1001; ++i)
        wide += "}\n";
    wide += "MOTION\n";
    for (int i = 0; i < 3000; ++i)
        wide += "0 ";
    for (int i = 0; i < 30000; ++i)
        wide += "\n1";
    const Row rows[] = {
        {wide, "3000 channels, but most lines of the motion are much shorter"},
        {"", "HIERARCHY"},
        {"HIERARCHY\n", "ends before MOTION"},
        {"HIERARCHY\nMOTION\n", "no ROOT"},
        {"HIERARCHY\nJOINT A\n{\n", "line 2: a JOINT stands outside of a ROOT"},
        {"HIERARCHY\nROOT A\nOFFSET 0 0 0\n", "outside of a joint"},
        {"HIERARCHY\nROOT A\n{\nOFFSET 0 zero 0\n", "line 4: an OFFSET wants three numbers"},
        {"HIERARCHY\nROOT A\n{\nCHANNELS 99999999999 Xrotation\n", "fewer names of CHANNELS"},
        {"HIERARCHY\nROOT A\n{\nWHAT\n", "WHAT has no meaning"},
        {"HIERARCHY\nROOT A\n{\n}\n}\n", "closes nothing"},
        {"HIERARCHY\nROOT A\n{\n}\nMOTION\nFrames: 1\n", "no joint has CHANNELS"},
        {Motion(""), "no frame of motion"},
        {s_Hierarchy + "MOTION\nFrames: 21111111111111111111", "no frame of motion"},
        {deep, "ends before MOTION"},
    };
    for (const Row& rRow : rows)
    {
        const Read read(rRow.Text);
        EXPECT_TRUE(read.Result.IsError()) << rRow.pError;
        EXPECT_NE(read.Error.find(rRow.pError), std::string::npos) << rRow.pError << ": " << read.Error;
        EXPECT_TRUE(read.Recording.Channels.empty());
    }
    const std::string whole = Motion(s_Rest + s_Rest);
    for (std::size_t size = 0; size < whole.size(); ++size)
    {
        const Read read(whole.substr(0, size));
        EXPECT_EQ(read.Result.IsError(), read.Recording.Channels.empty()) << size;
        EXPECT_EQ(read.Result.IsError(), !read.Error.empty()) << size;
    }
}

TEST(Bvh, WorldPositionsOfRealSkeletonsAreKnown)
{
    const char* pFolder = std::getenv("GRAPHPLOTS_TEST_DATA");
    const std::filesystem::path folder = pFolder == nullptr ? "" : pFolder;
    if (!std::filesystem::exists(folder / "known_values.csv"))
        GTEST_SKIP() << "the folder with real recordings is absent (GRAPHPLOTS_TEST_DATA)";
    struct Row
    {
        const char* pFile;
        std::size_t Frame;
        double Position[3];
    };
    for (const Row& rRow : {Row{"cmu_12_01_walk.bvh", 0, {11.092121, 19.665947, -26.071850}},
                            Row{"cmu_12_01_walk.bvh", 523, {4.026975, 12.960092, 43.071504}},
                            Row{"dab.bvh", 0, {-18.518733, 3.519793, 39.067901}}})
    {
        std::ifstream file(folder / rRow.pFile, std::ios::binary);
        const Read read(std::string(std::istreambuf_iterator<char>(file), {}));
        ASSERT_TRUE(read.Result.IsSuccess()) << read.Error;
        const auto hand = std::ranges::find_if(
            read.Recording.Channels, [](const RecordedChannel& i_rChannel)
            { return i_rChannel.Kind == EChannelKind::SegmentPose && i_rChannel.Name == "LeftHand"; });
        ASSERT_NE(hand, read.Recording.Channels.end());
        for (std::size_t axis = 0; axis < 3; ++axis)
            EXPECT_NEAR(hand->Samples[rRow.Frame * 6 + 3 + axis], rRow.Position[axis], 5e-6) << rRow.pFile;
    }
}

} // namespace

} // namespace TestRecordings
