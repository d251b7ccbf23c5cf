#include "RecordingText.h"

#include "Recordings/Common/VReadProgress.h"
#include "Recordings/Tables/ColumnNames.h"
#include "Recordings/Tables/CsvReader.h"
#include "Recordings/Tables/StorageTableReader.h"
#include "Recordings/Tables/TrcReader.h"
#include "Recordings/Text/TextScan.h"

#include <gtest/gtest.h>

#include <cmath>
#include <span>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace TestRecordings
{

using Recordings::ReadOptions;
using Recordings::VRecording;

namespace
{

using Read = TQL::IResult (*)(std::span<const std::byte>, const ReadOptions&, VRecording&, std::string&);

TQL::IResult ReadString(Read i_pRead, const std::string& i_rText, VRecording& o_rRecording, std::string& o_rError,
                        const ReadOptions& i_rOptions = {})
{
    // A copy of its own size, so that a sanitizer sees a read behind the end.
    const auto bytes = std::as_bytes(std::span(i_rText));
    const std::vector<std::byte> file(bytes.begin(), bytes.end());
    return i_pRead(file, i_rOptions, o_rRecording, o_rError);
}

std::string TextOrError(Read i_pRead, const std::string& i_rText, const ReadOptions& i_rOptions = {})
{
    VRecording recording;
    std::string error;
    const TQL::IResult result = ReadString(i_pRead, i_rText, recording, error, i_rOptions);
    return result.IsError() ? "error: " + error : TextOf(recording);
}

// The channels and warnings, without the line of the whole recording and where a channel stands in time.
std::string Brief(Read i_pRead, const std::string& i_rText)
{
    VRecording recording;
    std::string error;
    if (ReadString(i_pRead, i_rText, recording, error).IsError())
        return "error: " + error;
    for (Recordings::RecordedChannel& rChannel : recording.Channels)
        rChannel.FirstTick = rChannel.SamplePeriod = 0;
    std::string text = TextOf(recording);
    text.erase(0, text.find('\n') + 1);
    for (std::size_t at = 0; (at = text.find(", 0 by 0:")) != std::string::npos;)
        text.erase(at, 8);
    return text;
}

struct Case
{
    std::string Text;
    std::string Expected;
};

std::string Replaced(std::string i_Text, char i_From, const std::string& i_rTo)
{
    for (std::size_t at = 0; (at = i_Text.find(i_From, at)) != std::string::npos; at += i_rTo.size())
        i_Text.replace(at, 1, i_rTo);
    return i_Text;
}

} // namespace

TEST(TextScan, LinesHoweverTheyEnd)
{
    Recordings::VLineScanner lines("a\r\nb\n\rc\r\r\nd\n\ne");
    std::string text;
    for (std::string_view line; lines.Next(line);)
        text.append(line).append("|");
    EXPECT_EQ(text, "a|b||c||d||e|");
    EXPECT_EQ(lines.GetLineCount(), 8u);
}

TEST(TextScan, Numbers)
{
    const std::pair<const char*, double> numbers[] = {
        {"1", 1},      {" +.5 ", 0.5}, {"-.5", -0.5},     {"5.", 5},     {"1e-3", 1e-3}, {"\"2.5\"", 2.5},
        {"1e-400", 0}, {"0,5", 0.5},   {"-1,25e2", -125}, {"1E+2", 100}, {"0.0", 0},     {"1e-50", 1e-50}};
    for (const auto& [pText, value] : numbers)
    {
        float number = -1.0f;
        EXPECT_EQ(Recordings::ReadNumber(pText, true, number), Recordings::ECell::Number) << pText;
        EXPECT_FLOAT_EQ(number, static_cast<float>(value)) << pText;
    }
    for (const char* pMissing :
         {"", "NaN", "nan", "-nan(ind)", "-1.#IND", "1.#QNAN", "N/A", "#N/A", "null", "-", "\"\""})
    {
        float number = 0.0f;
        EXPECT_EQ(Recordings::ReadNumber(pMissing, true, number), Recordings::ECell::Missing) << pMissing;
        EXPECT_TRUE(std::isnan(number));
    }
    for (const char* pLarge : {"1e400", "-1e39", "inf", "-Infinity", "1.#INF"})
    {
        float number = 0.0f;
        EXPECT_EQ(Recordings::ReadNumber(pLarge, true, number), Recordings::ECell::TooLarge) << pLarge;
    }
    for (const char* pText : {"1.2.3", "1,2,3", "1,", "+-1", "0x10", "12:30", "e5", "+", "1 2"})
    {
        double number = 0.0;
        EXPECT_EQ(Recordings::ReadNumber(pText, true, number), Recordings::ECell::Text) << pText;
    }
}

TEST(TrcReader, TablesOfManyMakers)
{
    const std::string head = "PathFileType\t4\t(X/Y/Z)\ta.trc\nDataRate\tCameraRate\tNumFrames\tNumMarkers\tUnits\n";
    const std::string clean = head +
                              "100.00\t100\t   2\t2\tmm\nFrame#\tTime\tS:A\t\t\tB\t\t\n"
                              "\t\tX1\tY1\tZ1\tX2\tY2\tZ2\n\n1\t0.00\t1\t2\t3\t4\t5\t6\n2\t0.01\t\t \tNaN\t7\t8\t9\n";
    const std::string expected = "TRC 0..2700000 by 1350000\n"
                                 "marker S:A of S [mm] 100 Hz, 0 by 1350000: 1 2 3 | - - -\n"
                                 "marker B [mm] 100 Hz, 0 by 1350000: 4 5 6 | 7 8 9\n";
    const Case cases[] = {
        {clean, expected},
        {Replaced(clean, '\n', "\r\n"), expected},
        {Replaced(clean, '\n', "\t\t\r"), expected},
        {"\xEF\xBB\xBF" + Replaced(clean, '.', ","), expected},
        {Replaced(Replaced(clean, '\t', "  "), '\n', " \n").replace(clean.size(), 0, ""),
         "TRC 0..2700000 by 1350000\nmarker S:A of S [mm] 100 Hz, 0 by 1350000: 1 2 3 | - 7 8\n"
         "marker B [mm] 100 Hz, 0 by 1350000: 4 5 6 | 9 - -\n"
         "warning: 1 row has fewer cells than there are columns; the rest is missing, in line 8.\n"},
        {head + "50\t50\t2147483648\t7\tm\nFrame#\tTime\tA\t\t\n1\t\t1\t2\t3\n2\t\t4\t5\t6\t7\t8\t9\n",
         "TRC 0..5400000 by 2700000\nmarker A [m] 50 Hz, 0 by 2700000: 1 2 3 | 4 5 6\n"
         "warning: The rows have no times; they are laid by their frame numbers at 50 Hz.\n"
         "warning: The head of the file promises 7 markers; it holds 1.\n"
         "warning: The head of the file promises 2147483648 frames; it holds 2.\n"
         "warning: 1 row has more cells than there are columns; the rest is left out, in line 6.\n"},
        {head + "60\t60\t3\t1\tmm\nFrame#\tTime\tA\n\t\tX1\tY1\tZ1\tX2\tY2\tZ2\n7\t0.100\t1\t2\t3\t4\t5\n"
                "8\t0.117\tx\t1e400\t3\t4\t5\t6\n9\t0.133\t1\t2\t3\t4\t5\t6\n",
         "TRC 13500000..20250000 by 2250000\nmarker A [mm] 60 Hz, 13500000 by 2250000: 1 2 3 | - - 3 | 1 2 3\n"
         "marker Marker 2 [mm] 60 Hz, 13500000 by 2250000: 4 5 - | 4 5 6 | 4 5 6\n"
         "warning: The head of the file promises 1 markers; it holds 2.\n"
         "warning: 1 cell is no number and taken as missing, in line 7.\n"
         "warning: 1 number is too large or infinite and taken as missing, in line 7.\n"
         "warning: 1 row has fewer cells than there are columns; the rest is missing, in line 6.\n"},
        {head + "60\t60\t0\t0\tmm\nFrame#\tTime\n\n",
         "error: the file holds no frame behind its head. Export it again from the program that made it."},
        {head, "error: this is not a TRC file: the line of marker names that begins with \"Frame#\" is missing. "
               "Export the file again from the program that made it."},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(TextOrError(Recordings::ReadTrc, rCase.Text), rCase.Expected) << rCase.Text;
}

TEST(StorageTable, HeadsAndCells)
{
    const Case cases[] = {
        {"Name\nversion=1\nnRows=2\nnColumns=3\ninDegrees=no\nendheader\ntime\tknee_angle_r\tpelvis_tx\n"
         "      0.5\t   1\t 2\n      0.6\t 3\t nan\n",
         "column knee_angle_r [rad] 10 Hz: 1 | 3\ncolumn pelvis_tx [] 10 Hz: 2 | -\n"},
        {"Name\t\t\r\nnRows = 9\t\t\r\nnColumns=2\t\r\ninDegrees=yes\t\r\nENDHEADER\t\r\n\r\ntime  a/value  "
         "/jointset/hip/hip_flexion_r/speed\r\n0 1 2\r\n.1 3 4 \r\n",
         "column a/value [] 10 Hz: 1 | 3\ncolumn /jointset/hip/hip_flexion_r/speed [deg/s] 10 Hz: 2 | 4\n"
         "warning: The head of the file promises 9 rows; it holds 2.\n"
         "warning: The head of the file promises 2 columns; it holds 3.\n"},
        {"DataType=Quaternion\nendheader\ntime\ttorso\tleg\n0\t1,0,0,0\t0.5,.5,-0.5,5e-1\n0.01\t\t0,1,0,0\n",
         "column torso [] 100 Hz: 1 0 0 0 | - - - -\ncolumn leg [] 100 Hz: 0.5 0.5 -0.5 0.5 | 0 1 0 0\n"},
        {"endheader\ntime\ta\n0\t~[1, 2,3]\n0.01\t(4,5,6)\n", "column a [] 100 Hz: 1 2 3 | 4 5 6\n"},
        {"endheader\ntime\ta\n0,00\t1,5\n0,01\t-2,5\n", "column a [] 100 Hz: 1.5 | -2.5\n"},
        // As spreadsheets save them.
        {"Name,,\nnRows=9,,\ninDegrees=yes,,\nendheader,,\ntime,hip_flexion,f\n0,1,2\n0.01,3,\n,,\n",
         "column hip_flexion [deg] 100 Hz: 1 | 3\ncolumn f [] 100 Hz: 2 | -\n"
         "warning: The head of the file promises 9 rows; it holds 2.\n"},
        {"DataType=Quaternion,\nendheader,\ntime,a\n0,\"1,0,0,0\"\n1,\"0,1,0,0\"\n",
         "column a [] 1 Hz: 1 0 0 0 | 0 1 0 0\n"},
        {"inDegrees;no;\nendheader;;\ntime;hip rotation;b\n0;0,5;1\n0,01;1,5;2\n",
         "column hip rotation [rad] 100 Hz: 0.5 | 1.5\ncolumn b [] 100 Hz: 1 | 2\n"},
        {"datacolumns 2\ndatarows 1\ntime a\n0 1\n", "column a [] 120 Hz: 1\n"},
        {"endheader\na\tb\n1\t2\t3\n", "column a [] 120 Hz: 1\ncolumn b [] 120 Hz: 2\ncolumn Column 3 [] 120 Hz: 3\n"
                                       "warning: The file has no times and says no rate; the rows follow one another "
                                       "at 120 Hz.\n"},
        {"nRows=1\nendheader\ntime\ta\n",
         "error: the file holds no row behind its head. Export it again from the program that made it."},
        {"nRows=1\n",
         "error: this is not a MOT or STO file: neither \"endheader\" nor a line of column names that begins "
         "with \"time\" was found. Export the file again from the program that made it."},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(Brief(Recordings::ReadStorageTable, rCase.Text), rCase.Expected) << rCase.Text;
}

TEST(CsvReader, HeadIsFoundByLooking)
{
    const std::string plain = "column a [] 100 Hz: 1 | 2.5 | -\ncolumn b [] 100 Hz: - | 4 | 5\n";
    const std::string table = "time,a,b\n0.00,1,\n0.01,2.5,4\n0.02,NaN,5\n";
    const Case cases[] = {
        {table, plain},
        {Replaced(table, ',', ";"), plain},
        {Replaced(table, ',', "\t"), plain},
        {Replaced(table, ',', " , "), plain},
        {Replaced(Replaced(table, ',', ";"), '.', ","), plain},
        {Replaced(Replaced(table, ',', "\t"), '.', ","), plain},
        {Replaced("# " + table, '\n', "\r"), plain},
        {"Made by: me, and you\nSample Rate:,100,Hz\n\n" + table, plain},
        {"frame;x\n1;0,5\n2;\n4;1,5\n",
         "column x [] 120 Hz: 0.5 | - | - | 1.5\nwarning: The file says no rate; its "
         "frame numbers are laid at 120 Hz.\nwarning: The times leave out 1 of 4 rows at "
         "120 Hz; there the samples are missing.\n"},
        {"Frequency;250\nFrame #;x\n1;5\n2;6\n", "column x [] 250 Hz: 5 | 6\n"},
        {"Time [ms],Fz (N),\"say \"\"a, b\"\"\",M [odd unit]\n0,1,2,3\n5,4,5,6\n",
         "column Fz (N) [N] 200 Hz: 1 | 4\ncolumn say \"a, b\" [] 200 Hz: 2 | 5\ncolumn M [odd unit] [odd unit] 200 "
         "Hz: "
         "3 | 6\n"},
        {"t,a,b\ns,mm,\n0,1,2\n0.5,3,4\n", "column a [mm] 2 Hz: 1 | 3\ncolumn b [] 2 Hz: 2 | 4\n"},
        {"s,m,N\n0,1,2\n1,3,4\n2,5,6\n",
         "column s [] 120 Hz: 0 | 1 | 2\ncolumn m [] 120 Hz: 1 | 3 | 5\ncolumn N [] 120 Hz: 2 | 4 | 6\nwarning: The "
         "file has no times and says no rate; the rows follow one another at 120 Hz.\n"},
        {"0.00 1 2\n0.02 3 4\n0.04 5 6\n",
         "column Column 2 [] 50 Hz: 1 | 3 | 5\ncolumn Column 3 [] 50 Hz: 2 | 4 | 6\nwarning: The table has no row of "
         "names; its columns are numbered.\nwarning: The first column has no name and rises evenly; it is taken as the "
         "time in seconds.\n"},
        {"x,y\n1,2\n,\n,3\n,\n , \n\"\",\n",
         "column x [] 120 Hz: 1 | - | -\ncolumn y [] 120 Hz: 2 | - | 3\nwarning: The file has no times and says no "
         "rate; the rows follow one another at 120 Hz.\n"},
        {"x,y\n1,2\n", "column x [] 120 Hz: 1\ncolumn y [] 120 Hz: 2\nwarning: The file has no times and says no rate; "
                       "the rows follow one another at 120 Hz.\n"},
        {"time,what,x,,\n0,stand,1,,\n1,walk,2,,\n2,,3,,\n",
         "column x [] 1 Hz: 1 | 2 | 3\nwarning: 2 cells are no numbers and taken as missing, the first in line 2.\n"
         "warning: Column \"what\" holds no numbers and is left out.\n"},
        {"timestamp,x\n1700000000000,1\n1700000000010,2\n",
         "column x [] 100 Hz: 1 | 2\nwarning: The times say no unit; numbers that large are taken as milliseconds.\n"},
        {"time,x,none\n0,1,\n\n0.1,2\n% a remark\n0.2,1e39,\n",
         "column x [] 10 Hz: 1 | 2 | -\ncolumn none [] 10 Hz: - | - | -\nwarning: 1 number is too large or infinite "
         "and "
         "taken as missing, in line 6.\nwarning: 1 row has fewer cells than there are columns; the rest is missing, in "
         "line 4.\n"},
        {"\xFC"
         "ber,x\n1,2\n3,4\n",
         "column \xC3\xBC"
         "ber [] 120 Hz: 1 | 3\ncolumn x [] 120 Hz: 2 | 4\nwarning: The "
         "file has no times and says no rate; the rows follow one another at 120 Hz.\n"},
        {"time,what\n0,a\n1,b\n",
         "error: the table has no column of numbers beside its times. Choose a table with one."},
        {"time,x\n#.5,1\n", "error: no row of numbers was found in its first lines. Choose a table with a row for each "
                            "sample and a column for each value."},
        {"Dear reader,\nno table here.\n",
         "error: no row of numbers was found in its first lines. Choose a table with a "
         "row for each sample and a column for each value."},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(Brief(Recordings::ReadCsv, rCase.Text), rCase.Expected) << rCase.Text;
}

TEST(CsvReader, TimesInAllUnits)
{
    const std::pair<const char*, double> heads[] = {
        {"Time (msec)", 1e-3}, {"Time (h)", 3600.0},         {"time (minutes)", 60.0}, {"Elapsed (second)", 1.0},
        {"t (hr)", 3600.0},    {"Time (\xCE\xBCs)", 1e-6},   {"time [usec]", 1e-6},    {"time_msec", 1e-3},
        {"minutes", 60.0},     {"Timestamp (Hours)", 3600.0}};
    for (const auto& [pHead, seconds] : heads)
        EXPECT_EQ(Recordings::FindTimeColumn({{pHead, Recordings::UnitInName(pHead)}}).Unit, seconds) << pHead;
    EXPECT_EQ(Brief(Recordings::ReadCsv, "Time (msec),Height (h)\n0,1\n4,2\n8,3\n"),
              "column Height (h) [] 250 Hz: 1 | 2 | 3\n");
}

TEST(CsvReader, GroupsOnlyWhatIsClearlyOneThing)
{
    const std::string rate = "Rate: 100 Hz\n";
    const std::string hint = "frame,";
    const Case cases[] = {
        {"Ann:A.X,Ann:A.Y,Ann:A.Z", "marker Ann:A of Ann [] 100 Hz: 1 2 3\n"},
        {"A_x,A_y,A_z", "marker A [] 100 Hz: 1 2 3\n"},
        {"A.X [mm],A.Y [mm],A.Z [mm]", "column A.X [mm] [mm] 100 Hz: 1\ncolumn A.Y [mm] [mm] 100 Hz: 2\n"
                                       "column A.Z [mm] [mm] 100 Hz: 3\n"},
        {"acc_X,acc_Y,acc_Z", "column acc_X [] 100 Hz: 1\ncolumn acc_Y [] 100 Hz: 2\ncolumn acc_Z [] 100 Hz: 3\n"},
        {"A.X,A.Z,A.Y", "column A.X [] 100 Hz: 1\ncolumn A.Z [] 100 Hz: 2\ncolumn A.Y [] 100 Hz: 3\n"},
        {"A.X,B.Y,A.Z", "column A.X [] 100 Hz: 1\ncolumn B.Y [] 100 Hz: 2\ncolumn A.Z [] 100 Hz: 3\n"},
        {"A,A,A", "column A [] 100 Hz: 1\ncolumn A#2 [] 100 Hz: 2\ncolumn A#3 [] 100 Hz: 3\n"},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(Brief(Recordings::ReadCsv, rate + hint + rCase.Text + "\n1,1,2,3\n"), rCase.Expected) << rCase.Text;
    EXPECT_EQ(
        Brief(Recordings::ReadCsv, rate + ",,A,,,B,,\nFrame,n,X,Y,Z,X,Y,Z\n,,mm,mm,mm,mm,mm,mm\n1,0,1,2,3,4,5,6\n"),
        "column n [] 100 Hz: 0\nmarker A [mm] 100 Hz: 1 2 3\nmarker B [mm] 100 Hz: 4 5 6\n");
    EXPECT_EQ(Brief(Recordings::ReadCsv,
                    rate + "frame,q.W,q.X,q.Y,q.Z,P.RX,P.RY,P.RZ,P.TX,P.TY,P.TZ\n1,1,0,0,0,1,2,3,4,5,6\n"),
              "column q.W [] 100 Hz: 1\ncolumn q.X [] 100 Hz: 0\ncolumn q.Y [] 100 Hz: 0\ncolumn q.Z [] 100 Hz: 0\n"
              "pose P [] 100 Hz: 1 2 3 4 5 6\n");
}

TEST(CsvReader, ChannelsOfTwoRatesAndTimesThatTicksCannotSay)
{
    std::string text = "time,A.X,A.Y,A.Z,Fz\n";
    for (int i = 0; i < 40; ++i)
        text += std::to_string(i * 5) + "e-3," + (i % 4 == 0 && i != 8 ? "1,2,3," : ",,,") + std::to_string(i) + "\n";
    VRecording recording;
    std::string error;
    ASSERT_TRUE(ReadString(Recordings::ReadCsv, text, recording, error).IsSuccess()) << error;
    ASSERT_EQ(recording.Channels.size(), 2u);
    EXPECT_EQ(recording.Channels[0].Rate, 50.0);
    EXPECT_EQ(recording.Channels[0].RowCount(), 10u);
    EXPECT_EQ(recording.Channels[0].MissingCount(), 1u);
    EXPECT_EQ(recording.FramePeriod, 2700000);
    EXPECT_EQ(recording.Channels[1].RowCount(), 40u);
    EXPECT_EQ(recording.Channels[1].SamplePeriod, 675000);
    EXPECT_EQ(recording.Warnings.size(), 0u);

    EXPECT_EQ(
        TextOrError(Recordings::ReadCsv, "Time (s),x\n0.017,1\n0.033,2\n0.050,3\n0.067,4\n"),
        "CSV 2250000..11250000 by 2250000\n"
        "column Time (s) [s] 60 Hz, 2250000 by 2250000: 0.0170000009 | 0.0329999998 | 0.0500000007 | 0.0670000017\n"
        "column x [] 60 Hz, 2250000 by 2250000: 1 | 2 | 3 | 4\n"
        "remark: The times are rounded to 3 decimals; the rows stand evenly at 60 Hz.\n");
    ReadOptions resample;
    resample.bResample = true;
    EXPECT_EQ(TextOrError(Recordings::ReadCsv, "time,x\n0.0001,1\n0.0096,2\n0.02,\n0.0301,4\n0.0401,5\n", resample),
              "CSV 13500..6763500 by 1350000\n"
              "column x [] 100 Hz, 13500 by 1350000: 1 | - | - | 4 | 5\n"
              "warning: The times are uneven; the samples are resampled to 100 Hz.\n");
}

// What a file promises or how long its lines are must cost no more than the file is large.
TEST(TextTables, AbsurdFiles)
{
    const std::string tooMany(150'000, ',');
    EXPECT_EQ(Brief(Recordings::ReadCsv, tooMany + "x\n1" + tooMany + "2\n"),
              "error: the table has more than 100000 columns, which is more than can be opened. Export fewer columns.");
    EXPECT_EQ(Brief(Recordings::ReadCsv, std::string(5'000'000, ',')).substr(0, 6), "error:");
    std::string wide = "time";
    for (int i = 0; i < 90'000; ++i)
        wide += ",c";
    std::string rows = "\n";
    for (int i = 0; i < 90'000; ++i)
        rows += "1\n";
    EXPECT_EQ(Brief(Recordings::ReadCsv, wide + rows).substr(0, 200),
              "error: the head of the table names 90000 columns, but most of "
              "its rows are much shorter. Repair the head or the rows.");
    EXPECT_EQ(Brief(Recordings::ReadCsv, "time,x\n0,1\n1," + std::string(10'000'000, '7') + "\n"),
              "column x [] 1 Hz: 1 | -\nwarning: 1 cell is no number and taken as missing, in line 3.\n");
    EXPECT_EQ(Brief(Recordings::ReadTrc, "Frame#\tTime\tA\t\t\n1\t0\t1\t2\t" + std::string(10'000'000, ' ') + "3\n"),
              "marker A [] 120 Hz: 1 2 3\n");
    EXPECT_EQ(Brief(Recordings::ReadCsv, std::string(10'000'000, '"')).substr(0, 6), "error:");
}

TEST(TextTables, CancelledOrCutAnywhere)
{
    const std::pair<Read, std::string> files[] = {
        {Recordings::ReadTrc,
         "PathFileType\t4\nDataRate\tUnits\n60\tmm\nFrame#\tTime\tA\t\t\n\t\tX1\tY1\tZ1\n\n1\t0.017\t"
         "1\t2\t3\n2\t0.033\t4\t5\t6\n"},
        {Recordings::ReadStorageTable, "a\nnRows=2\nDataType=Vec3\nendheader\ntime\ta\n0\t1,2,3\n0.1\t4,5,6\n"},
        {Recordings::ReadCsv, "rate,100\n\"ti\"\"me\",\"a\nb\",c\ns,mm,N\n0,1,2\n0.01,3,4\n0.04,5,6\n"}};
    for (const auto& [pRead, text] : files)
    {
        for (std::size_t length = 0; length <= text.size(); ++length)
        {
            VRecording recording;
            recording.Name = "before";
            std::string error;
            const bool bRead = ReadString(pRead, text.substr(0, length), recording, error).IsSuccess();
            EXPECT_EQ(bRead, error.empty());
            EXPECT_EQ(bRead, recording.Name.empty());
            EXPECT_EQ(error.find('\n'), std::string::npos);
        }
        double told = 0.0;
        Recordings::VReadProgress progress(
            [&](double i_Fraction)
            {
                told = i_Fraction;
                return i_Fraction < 0.2;
            });
        ReadOptions options;
        options.pProgress = &progress;
        VRecording recording;
        std::string error;
        EXPECT_EQ(ReadString(pRead, text, recording, error, options), TQL::Result::Canceled);
        EXPECT_GE(told, 0.2);
    }
}

} // namespace TestRecordings
