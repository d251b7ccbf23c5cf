#include "RecordingText.h"

#include "Recordings/C3d/C3dReader.h"
#include "Recordings/C3d/C3dWriter.h"
#include "Recordings/OpenRecording.h"
#include "Recordings/Tables/CsvExport.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <limits>
#include <map>
#include <span>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

namespace TestRecordings
{

using Recordings::RecordedChannel;
using Recordings::VRecording;

namespace
{

const char* const Files[] = {"sprintbasket.c3d", "Gait.c3d", "Dec_real.c3d", "sgi_real.c3d"};
const char* const Tables[] = {"marker_trajectories.trc", "dataWithNaNsWithSpaces.trc",
                              "gait10dof18musc_subject01_walk_grf.mot", "std_subject01_InverseDynamics.sto",
                              "imuData01.csv"};

/// Real recordings that others made; skipped where the folder with them is absent.
class RealFiles : public ::testing::TestWithParam<const char*>
{
protected:
    void SetUp() override
    {
        const char* pFolder = std::getenv("GRAPHPLOTS_TEST_DATA");
        m_Folder = pFolder == nullptr ? "" : pFolder;
        if (!std::filesystem::exists(m_Folder / "known_values.csv"))
            GTEST_SKIP() << "the folder with real recordings is absent (GRAPHPLOTS_TEST_DATA)";
    }

    VRecording Open(const std::string& i_rFile) const
    {
        VRecording recording;
        std::string error;
        EXPECT_TRUE(Recordings::OpenRecording(m_Folder / i_rFile, recording, error).IsSuccess()) << error;
        return recording;
    }

    void ExpectKnownValues(const std::string& i_rFile, double i_RateTolerance = 1e-9) const;

    std::filesystem::path m_Folder;
};

class RealSkeletons : public RealFiles
{
};

class RealTables : public RealFiles
{
};

struct Summary
{
    std::size_t Samples = 0;
    std::size_t Missing = 0;
    double First = 0.0;
    double Last = 0.0;
    double Minimum = std::numeric_limits<double>::infinity();
    double Maximum = -std::numeric_limits<double>::infinity();
    double Mean = 0.0;
};

Summary Summarise(const RecordedChannel& i_rChannel, std::size_t i_Component)
{
    Summary summary;
    for (std::size_t row = 0; row < i_rChannel.RowCount(); ++row)
    {
        const auto value = static_cast<double>(i_rChannel.Samples[row * i_rChannel.ComponentCount() + i_Component]);
        summary.First = row == 0 ? value : summary.First;
        summary.Last = value;
        ++summary.Samples;
        if (std::isnan(value))
        {
            ++summary.Missing;
            continue;
        }
        summary.Minimum = std::min(summary.Minimum, value);
        summary.Maximum = std::max(summary.Maximum, value);
        summary.Mean += value;
    }
    summary.Mean /= static_cast<double>(summary.Samples - summary.Missing);
    return summary;
}

std::vector<std::string> SplitLine(const std::string& i_rLine)
{
    std::vector<std::string> cells;
    std::istringstream stream(i_rLine);
    for (std::string cell; std::getline(stream, cell, ',');)
        cells.push_back(cell);
    return cells;
}

// The known values are written with nine digits; ours are floats.
void ExpectValue(double i_Value, const std::string& i_rKnown, double i_Size, const char* i_pWhat)
{
    const double known = std::strtod(i_rKnown.c_str(), nullptr);
    if (std::isnan(known))
        EXPECT_TRUE(std::isnan(i_Value)) << i_pWhat;
    else
        EXPECT_NEAR(i_Value, known, i_Size * 1.2e-7 + 1e-30) << i_pWhat;
}

void CompareWithKnown(const RecordedChannel& i_rChannel, std::size_t i_Component,
                      const std::vector<std::string>& i_rKnown, double i_RateTolerance)
{
    const Summary summary = Summarise(i_rChannel, i_Component);
    EXPECT_EQ(i_rChannel.Units, i_rKnown[3]);
    const double rate = std::strtod(i_rKnown[4].c_str(), nullptr);
    if (!std::isnan(rate)) // the known values tell no rate of some tables
    {
        EXPECT_NEAR(i_rChannel.Rate, rate, rate * i_RateTolerance);
    }
    EXPECT_EQ(std::to_string(summary.Samples), i_rKnown[5]);
    EXPECT_EQ(std::to_string(summary.Missing), i_rKnown[6]);
    ExpectValue(summary.First, i_rKnown[7], std::abs(summary.First), "first");
    ExpectValue(summary.Last, i_rKnown[8], std::abs(summary.Last), "last");
    ExpectValue(summary.Minimum, i_rKnown[9], std::abs(summary.Minimum), "minimum");
    ExpectValue(summary.Maximum, i_rKnown[10], std::abs(summary.Maximum), "maximum");
    ExpectValue(summary.Mean, i_rKnown[11], std::max(std::abs(summary.Minimum), std::abs(summary.Maximum)), "mean");
}

/// The name of a component in the known values: of a joint, positions and angles have the same first part.
std::string KnownName(const RecordedChannel& i_rChannel, std::size_t i_Component)
{
    if (i_rChannel.ComponentCount() == 1)
        return i_rChannel.Name;
    const std::string suffix = " position";
    const bool bOfJoint = i_rChannel.Kind == Recordings::EChannelKind::Column && i_rChannel.Name.ends_with(suffix);
    return i_rChannel.Name.substr(0, i_rChannel.Name.size() - (bOfJoint ? suffix.size() : 0)) + "." +
           i_rChannel.ComponentNames[i_Component];
}

void RealFiles::ExpectKnownValues(const std::string& i_rFile, double i_RateTolerance) const
{
    const VRecording recording = Open(i_rFile);
    std::map<std::string, std::pair<const RecordedChannel*, std::size_t>> columns;
    for (const RecordedChannel& rChannel : recording.Channels)
        for (std::size_t i = 0; i < rChannel.ComponentCount(); ++i)
            if (rChannel.Kind != Recordings::EChannelKind::SegmentPose) // those were computed
                columns[KnownName(rChannel, i)] = {&rChannel, i};

    std::ifstream known(m_Folder / "known_values.csv");
    std::size_t compared = 0;
    for (std::string line; std::getline(known, line);)
    {
        const std::vector<std::string> cells = SplitLine(line);
        if (cells[0] != i_rFile)
            continue;
        SCOPED_TRACE(cells[1]);
        ++compared;
        const auto found = columns.find(cells[1]);
        ASSERT_NE(found, columns.end());
        CompareWithKnown(*found->second.first, found->second.second, cells, i_RateTolerance);
    }
    EXPECT_EQ(compared, columns.size());
    EXPECT_GT(compared, 0u);
}

} // namespace

TEST_P(RealFiles, AgreeWithKnownValues)
{
    ExpectKnownValues(GetParam());
    EXPECT_EQ(WarningsOf(Open(GetParam())), "");
}

TEST_P(RealTables, AgreeWithKnownValues)
{
    ExpectKnownValues(GetParam());
    const bool bRounded = GetParam() == std::string("gait10dof18musc_subject01_walk_grf.mot");
    EXPECT_EQ(WarningsOf(Open(GetParam())),
              bRounded ? "remark: The times are rounded to 4 decimals; the rows stand evenly at 600 Hz.\n" : "");
}

// The frame time of the one file was cut to .0083333 s, which stands for 120 Hz.
TEST_P(RealSkeletons, AgreeWithKnownValues)
{
    ExpectKnownValues(GetParam(), 1e-5);
}

// Every recording that was exported as a table gives the same samples at the same ticks when it is opened again.
TEST_P(RealFiles, ReadBackFromCsv)
{
    const VRecording recording = Open(GetParam());
    const TemporaryFolder folder;
    std::string error;
    ASSERT_TRUE(Recordings::ExportCsv(recording, folder / "a.csv", {}, error).IsSuccess()) << error;
    VRecording again;
    ASSERT_TRUE(Recordings::OpenRecording(folder / "a.csv", again, error).IsSuccess()) << error;
    ASSERT_EQ(again.Channels.size(), recording.Channels.size());
    for (std::size_t i = 0; i < again.Channels.size(); ++i)
    {
        const RecordedChannel& rChannel = again.Channels[i];
        const RecordedChannel& rFirst = recording.Channels[i];
        EXPECT_EQ(rChannel.Name, rFirst.Name);
        EXPECT_EQ(rChannel.Kind == Recordings::EChannelKind::Marker, rFirst.Kind == Recordings::EChannelKind::Marker);
        EXPECT_EQ(rChannel.Rate, rFirst.Rate) << rChannel.Name;
        EXPECT_EQ(rChannel.SamplePeriod, rFirst.SamplePeriod);
        EXPECT_EQ(rChannel.FirstTick, rFirst.FirstTick);
        ASSERT_EQ(rChannel.Samples.size(), rFirst.Samples.size()) << rChannel.Name;
        for (std::size_t j = 0; j < rChannel.Samples.size(); ++j)
            ASSERT_TRUE(rChannel.Samples[j] == rFirst.Samples[j] || std::isnan(rFirst.Samples[j])) << rChannel.Name;
        EXPECT_EQ(rChannel.MissingCount(), rFirst.MissingCount());
    }
}

// A file that ends early gives whole frames from its start, or says in one line what is wrong.
TEST_P(RealFiles, CutAtEveryBlock)
{
    const std::string text = ReadText(m_Folder / GetParam());
    const VRecording whole = Open(GetParam());
    const auto bytes = std::as_bytes(std::span(text));
    std::size_t readable = 0;
    for (std::size_t length = 0; length < bytes.size(); length += 512)
    {
        // A copy of its own, so that a sanitizer sees a read behind the end.
        const std::vector<std::byte> cut(bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(length));
        VRecording recording;
        std::string error;
        if (Recordings::ReadC3d(cut, {}, recording, error).IsError())
        {
            ASSERT_FALSE(error.empty());
            ASSERT_EQ(error.find('\n'), std::string::npos);
            continue;
        }
        ++readable;
        const RecordedChannel& rPart = recording.Channels.front();
        const RecordedChannel& rWhole = whole.Channels.front();
        ASSERT_EQ(recording.Channels.size(), whole.Channels.size());
        ASSERT_LE(rPart.RowCount(), rWhole.RowCount());
        ASSERT_EQ(0, std::memcmp(rPart.Samples.data(), rWhole.Samples.data(), rPart.Samples.size() * sizeof(float)));
        if (rPart.RowCount() == rWhole.RowCount())
            continue; // only padding was cut off
        const std::string expected = "The file ends after frame " + std::to_string(rPart.RowCount()) + " of " +
                                     std::to_string(rWhole.RowCount()) + ";";
        ASSERT_EQ(recording.Warnings.size(), 1u);
        ASSERT_EQ(recording.Warnings[0].substr(0, expected.size()), expected);
        ASSERT_LT(recording.Range.Last, whole.Range.Last);
    }
    EXPECT_GT(readable, 100u);
}

TEST_P(RealFiles, SurviveARoundTrip)
{
    const VRecording recording = Open(GetParam());
    const TemporaryFolder folder;
    std::string error;
    ASSERT_EQ(Recordings::WriteC3d(recording, folder / "again.c3d", error), TQL::Result::Ok) << error;
    VRecording again;
    ASSERT_TRUE(Recordings::OpenRecording(folder / "again.c3d", again, error).IsSuccess()) << error;
    for (Recordings::RecordedEvent& rEvent : again.Events)
        rEvent.bOn = true;
    EXPECT_EQ(TextOf(again), TextOf(recording));
}

INSTANTIATE_TEST_SUITE_P(C3d, RealFiles, ::testing::ValuesIn(Files),
                         [](const auto& i_rInfo)
                         {
                             std::string name = i_rInfo.param;
                             name.resize(name.find('.'));
                             return name;
                         });

INSTANTIATE_TEST_SUITE_P(Skeletons, RealSkeletons, ::testing::Values("cmu_12_01_walk.bvh", "dab.bvh"));
INSTANTIATE_TEST_SUITE_P(Tables, RealTables, ::testing::ValuesIn(Tables));

TEST_F(RealFiles, SingleValuesAsTheirMakersPublishedThem)
{
    struct Case
    {
        const char* File;
        const char* Channel;
        std::size_t Row;
        std::vector<double> Values;
        double Tolerance;
    };
    const Case cases[] = {
        {"sprintbasket.c3d", "WheelchairL:Marker1", 0, {-3.5246613, 0.2151997, 0.1101913}, 1e-7},
        {"sprintbasket.c3d", "ForearmL:Marker2", 3000, {-4.8895831, 0.3348260, 0.6235191}, 1e-7},
        {"Gait.c3d", "RSHO", 147, {2037.7227, 136.3889, 1371.1062}, 1e-4},
        {"Gait.c3d", "C7", 200, {1360.6148, -36.1620, 1392.5356}, 1e-4},
        {"Gait.c3d", "F1X", 0, {-3.663004}, 1e-6},
        {"Gait.c3d", "F1X", 1, {-3.540904}, 1e-6},
        {"Dec_real.c3d", "RSK1", 16, {384.0944, 523.8417, 311.2683}, 1e-4},
        {"Dec_real.c3d", "FZ1", 15, {8.9280}, 1e-4},
        {"sgi_real.c3d", "FZ1", 39, {5.9520}, 1e-4},
    };
    for (const Case& rCase : cases)
    {
        const VRecording recording = Open(rCase.File);
        const RecordedChannel channel = ChannelNamed(recording, rCase.Channel);
        for (std::size_t i = 0; i < rCase.Values.size(); ++i)
            EXPECT_NEAR(static_cast<double>(channel.Samples.at(rCase.Row * rCase.Values.size() + i)), rCase.Values[i],
                        rCase.Tolerance)
                << rCase.File << " " << rCase.Channel;
    }
    EXPECT_EQ(ChannelNamed(Open("sprintbasket.c3d"), "WheelchairL:Marker1").Subject, "WheelchairL");
    EXPECT_EQ(ChannelNamed(Open("Gait.c3d"), "F1X").SamplePeriod, 135000);
}

TEST_F(RealFiles, HeaderEventsAndTheSameRecordingOfTwoProcessors)
{
    const VRecording dec = Open("Dec_real.c3d");
    std::ostringstream events;
    for (const Recordings::RecordedEvent& rEvent : dec.Events)
        events << rEvent.Label << " " << static_cast<float>(rEvent.Seconds) << (rEvent.bOn ? "; " : " off; ");
    EXPECT_EQ(events.str(),
              "RHS 0.38; STRT 0.68; RMS 0.72; LHS 0.84; RTO 0.92; LMS 1.16; STOP 1.2; LTO 1.4; EOF 1.76; ");
    EXPECT_EQ(TextOf(dec), TextOf(Open("sgi_real.c3d")));
}

} // namespace TestRecordings
