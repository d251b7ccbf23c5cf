#include "C3dBuilder.h"
#include "RecordingText.h"

#include "Recordings/C3d/C3dReader.h"
#include "Recordings/FileFormats.h"
#include "Recordings/OpenRecording.h"

#include <gtest/gtest.h>

#include <unistd.h>

#include <filesystem>
#include <span>
#include <string>
#include <vector>

namespace TestRecordings
{

using Recordings::EProcessor;
using Recordings::VRecording;

namespace
{

std::vector<std::byte> BytesOfText(const std::string& i_rText)
{
    const auto bytes = std::as_bytes(std::span(i_rText));
    return {bytes.begin(), bytes.end()};
}

std::string ErrorOf(const std::filesystem::path& i_rPath, TQL::IResult i_Expected)
{
    VRecording recording;
    recording.Name = "before";
    std::string error;
    EXPECT_EQ(Recordings::OpenRecording(i_rPath, recording, error), i_Expected) << i_rPath;
    EXPECT_EQ(recording.Name, "before");
    EXPECT_EQ(error.find('\n'), std::string::npos);
    return error;
}

} // namespace

TEST(OpenRecording, ContentComesBeforeTheEnding)
{
    const TemporaryFolder folder;
    for (const std::string name : {"walk.c3d", "walk.C3D", "walk.txt", "walk"})
    {
        WriteBytes(folder / name, BuildC3d(SmallSpec(EProcessor::Dec, true)).Bytes);
        VRecording recording;
        std::string error;
        ASSERT_TRUE(Recordings::OpenRecording(folder / name, recording, error).IsSuccess()) << name << error;
        EXPECT_EQ(recording.Name, "walk");
        EXPECT_EQ(recording.Format, "C3D");
        EXPECT_EQ(recording.Channels.size(), 4u);
    }
}

TEST(OpenRecording, KindsOfText)
{
    EXPECT_EQ(Recordings::ListFilePatterns(), "*.c3d *.C3D *.bvh *.BVH *.trc *.TRC *.sto *.STO *.mot *.MOT *.csv *.CSV "
                                              "*.tsv *.TSV *.txt *.TXT *.dat *.DAT");
    const char* const pTrc = "PathFileType\t4\nFrame#\tTime\tA\n1\t0\t1\t2\t3\n";
    const char* const pStorage = "x\nendheader\ntime\tb\n0\t1\n";
    const char* const pTable = "time,x\n0,1\n";
    struct Case
    {
        const char* Name;
        const char* Text;
        const char* Format;
    };
    const Case cases[] = {{"a.trc", pTrc, "TRC"},     {"a.csv", pTrc, "TRC"}, {"a.mot", pStorage, "MOT"},
                          {"a.STO", pStorage, "STO"}, {"a", pStorage, "STO"}, {"a.csv", pTable, "CSV"},
                          {"a.TXT", pTable, "CSV"},   {"a", pTable, "CSV"},   {"a.log", pTable, "CSV"}};
    const TemporaryFolder folder;
    for (const Case& rCase : cases)
    {
        WriteBytes(folder / rCase.Name, BytesOfText(rCase.Text));
        VRecording recording;
        std::string error;
        EXPECT_TRUE(Recordings::OpenRecording(folder / rCase.Name, recording, error).IsSuccess()) << error;
        EXPECT_EQ(recording.Format, rCase.Format) << rCase.Name;
    }
}

TEST(OpenRecording, BadInputIsOneClearLine)
{
    const TemporaryFolder folder;
    std::filesystem::create_directory(folder / "folder.c3d");
    WriteBytes(folder / "empty.c3d", {});
    WriteBytes(folder / "text.c3d", BytesOfText("time,x\n0,1\n"));
    WriteBytes(folder / "words.csv", BytesOfText("a walk\nand a run\n"));
    WriteBytes(folder / "wide.csv", BytesOfText(std::string("\xFF\xFEt\0,\0x\0\n\0", 10)));
    WriteBytes(folder / "likely.gps", BytesOfText("GPS" + std::string(2000, '.')));
    WriteBytes(folder / "new\nline.c3d", BytesOfText("x"));
    EXPECT_EQ(ErrorOf(folder / "folder.c3d", TQL::Result::InvalidArgument),
              "folder.c3d: this is a folder. Choose a file in it.");
    EXPECT_EQ(ErrorOf(folder / "empty.c3d", TQL::Result::InvalidFormat),
              "empty.c3d: the file is empty. Copy it again from where it came.");
    EXPECT_EQ(ErrorOf(folder / "text.c3d", TQL::Result::InvalidFormat),
              "text.c3d: this is not a C3D file: its mark is missing. "
              "Choose a file that a motion capture program exported.");
    EXPECT_EQ(
        ErrorOf(folder / "words.csv", TQL::Result::InvalidFormat),
        "words.csv: no row of numbers was found in its first lines. Choose a table with a row for each sample and "
        "a column for each value.");
    EXPECT_EQ(ErrorOf(folder / "wide.csv", TQL::Result::InvalidFormat),
              "wide.csv: the file is written in 16-bit characters. Save it as UTF-8 text and open that.");
    EXPECT_EQ(ErrorOf(folder / "likely.gps", TQL::Result::NotSupported),
              "likely.gps: this kind of file is not known. Files that can be opened: C3D (.c3d), BVH (.bvh), "
              "TRC (.trc), STO (.sto), MOT (.mot), CSV (.csv, .tsv, .txt, .dat).");
    EXPECT_EQ(ErrorOf(folder / "none.c3d", TQL::Result::FileNotFound),
              "none.c3d: there is no such file. Check the name and the folder.");
    EXPECT_TRUE(ErrorOf(folder / "new\nline.c3d", TQL::Result::InvalidFormat).starts_with("new line.c3d: "));
    EXPECT_EQ(ErrorOf("/dev/null", TQL::Result::InvalidArgument),
              "null: this is not an ordinary file. Choose a recording.");
}

TEST(OpenRecording, FileThatMayNotBeRead)
{
    const TemporaryFolder folder;
    WriteBytes(folder / "secret.c3d", BuildC3d(SmallSpec(EProcessor::Intel, true)).Bytes);
    std::filesystem::permissions(folder / "secret.c3d", std::filesystem::perms::none);
    std::filesystem::permissions(folder.Path(), std::filesystem::perms::all);
    // The superuser may read everything; act as somebody else for the moment.
    const bool bRoot = geteuid() == 0;
    if (bRoot && seteuid(65534) != 0)
        GTEST_SKIP() << "the superuser cannot act as somebody else here";
    const std::string error = ErrorOf(folder / "secret.c3d", TQL::Result::FileNotOpen);
    ASSERT_TRUE(!bRoot || seteuid(0) == 0);
    EXPECT_EQ(error, "secret.c3d: the file cannot be opened. Check that you may read it.");
}

} // namespace TestRecordings
