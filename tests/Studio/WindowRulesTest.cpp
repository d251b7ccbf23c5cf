#include "Recordings/Common/VRecording.h"
#include "Studio/Common/TimeText.h"
#include "Studio/Common/WindowLayout.h"
#include "Studio/Transport/EventRows.h"
#include "Studio/Transport/TransportRules.h"
#include "Studio/Tree/ChannelSearch.h"
#include "TQL/ITick.h"
#include "support/LogGuard.h"

#include <gtest/gtest.h>

#include <QtCore/QFile>
#include <QtCore/QTemporaryDir>

#include <limits>
#include <string>
#include <vector>

namespace
{

constexpr std::int64_t P = TQL::DefaultFramePeriod;

TEST(ChannelSearch, EveryWordSaysSomethingOfTheChannel)
{
    const Studio::ChannelSearchText marker{"Walker1:LKNE", "Markers", {"mm"}, {"X", "Y", "Z"}};
    const Studio::ChannelSearchText analog{"Force.Fz1", "Device outputs", {"N"}, {}};
    static const struct
    {
        const char* pSearch;
        bool bMarker;
        bool bAnalog;
    } rows[] = {{"", true, true},
                {"   ", true, true},
                {"kne", true, false},
                {"WALKER1 lkne", true, false},
                {"lkne walker2", false, false},
                {"walker1:lk", true, false},
                {"mark", true, false},
                {"outp", false, true},
                {"arkers", false, false}, // the inside of a kind is no word of it
                {"mm", true, false},
                {"m", true, false}, // begins "Markers"
                {"n", true, true},  // in the name; a unit
                {"z knee", false, false},
                {"z  kne", true, false},
                {"fz1 n device", false, true}};
    for (const auto& rRow : rows)
    {
        const QStringList words = Studio::SearchWords(QString::fromUtf8(rRow.pSearch));
        EXPECT_EQ(Studio::MatchesSearch(marker, words), rRow.bMarker) << rRow.pSearch;
        EXPECT_EQ(Studio::MatchesSearch(analog, words), rRow.bAnalog) << rRow.pSearch;
    }
}

TEST(Timecode, CountsTheFramesOfASecond)
{
    static const struct
    {
        std::int64_t Frame;
        std::int64_t Period;
        const char* pText;
    } rows[] = {{0, P, "00:00:00:000"},
                {119, P, "00:00:00:119"},
                {120, P, "00:00:01:000"},
                {-1, P, "-00:00:00:001"},
                {25 * 3723 + 4, TQL::DefaultTickRate / 25, "01:02:03:04"},
                {60, 2'252'250, "00:00:01:00"}, // 59.94 Hz
                {3 * 86400 + 1, 2 * TQL::DefaultTickRate, "72:00:01:00"},
                {101 * 3600, TQL::DefaultTickRate, "101:00:00:00"},
                {1234, TQL::DefaultTickRate / 2000, "00:00:00:1234"}};
    for (const auto& rRow : rows)
    {
        EXPECT_EQ(Studio::FormatTimecode(rRow.Frame * rRow.Period, rRow.Period), rRow.pText);
        EXPECT_EQ(Studio::FormatTimecode((rRow.Frame + 1) * rRow.Period - 1, rRow.Period), rRow.pText)
            << "to the end of the frame";
    }
}

TEST(TransportRules, StepsStayInTheRange)
{
    constexpr auto largest = std::numeric_limits<std::int64_t>::max();
    static const struct
    {
        std::int64_t Frame, Step, First, Last, Expected;
    } rows[] = {{5, 1, 0, 9, 6},       {5, 10, 0, 9, 9},       {5, -10, 0, 9, 0},   {5, -1, 0, 9, 4},
                {9, 1, 0, 9, 9},       {0, -1, 0, 9, 0},       {-7, -1, -9, 9, -8}, {50, 1, 0, 9, 9},
                {5, largest, 0, 9, 9}, {5, -largest, 0, 9, 0}, {3, 1, 3, 3, 3}};
    for (const auto& rRow : rows)
        EXPECT_EQ(Studio::StepFrame(rRow.Frame, rRow.Step, rRow.First, rRow.Last), rRow.Expected)
            << rRow.Frame << " " << rRow.Step;
}

TEST(TransportRules, SpeedsAndEventsGoFromOneToTheNext)
{
    static const struct
    {
        double Speed;
        double Faster;
        double Slower;
    } speeds[] = {{1.0, 2.0, 0.5}, {0.1, 0.25, 0.1}, {10.0, 10.0, 5.0}, {3.0, 5.0, 2.0}, {100.0, 10.0, 10.0}};
    for (const auto& rRow : speeds)
    {
        EXPECT_EQ(Studio::NextSpeed(rRow.Speed, 1), rRow.Faster) << rRow.Speed;
        EXPECT_EQ(Studio::NextSpeed(rRow.Speed, -1), rRow.Slower) << rRow.Speed;
    }
    const std::vector<std::int64_t> frames{10, 20, 20, 35};
    static const struct
    {
        std::int64_t Frame, Next, Previous; // -1: none
    } events[] = {{0, 10, -1}, {10, 20, -1}, {15, 20, 10}, {20, 35, 10}, {34, 35, 20}, {35, -1, 20}, {99, -1, 35}};
    for (const auto& rRow : events)
    {
        EXPECT_EQ(Studio::NextEventFrame(frames, rRow.Frame).value_or(-1), rRow.Next) << rRow.Frame;
        EXPECT_EQ(Studio::PreviousEventFrame(frames, rRow.Frame).value_or(-1), rRow.Previous) << rRow.Frame;
    }
    EXPECT_FALSE(Studio::NextEventFrame({}, 0));
}

TEST(EventRows, EventsLieOnTheNearestFrameOfTheRecording)
{
    Recordings::VRecording recording;
    recording.Range = {10 * P, 100 * P};
    const double frame = 1.0 / 120.0;
    recording.Events = {{"Ann", "Foot Off", 50.4 * frame, "Left"},
                        {"", "Start", 9.6 * frame, "General"},
                        {"", "Too early", 9.4 * frame},
                        {"", "Too late", 100.0 * frame},
                        {"", "Off", 20.0 * frame, "", false},
                        {"", "Never", std::numeric_limits<double>::quiet_NaN()},
                        {"", "For ever", 1e300}};
    const auto rows = Studio::ListEvents(recording);
    ASSERT_EQ(rows.size(), 2u);
    EXPECT_EQ(rows[0], (Studio::EventRow{11, 10 * P, "Start", ""}));
    EXPECT_EQ(rows[1], (Studio::EventRow{51, 50 * P, "Foot Off, Left", "Ann"}));
}

TEST(WindowLayout, ComesBackFromItsFile)
{
    const QTemporaryDir temporary;
    const auto file = std::filesystem::path(temporary.path().toStdString()) / "new folder" / "layout.json";
    const Studio::WindowLayout layout{QByteArray("\0\1geometry", 10), "panels", false, Studio::TilePlots(3), 2};
    EXPECT_FALSE(Studio::ReadLayout(file));
    Studio::WriteLayout(file, layout);
    EXPECT_EQ(Studio::ReadLayout(file), layout);
}

TEST(WindowLayout, ABrokenFileIsNoneAndNonsenseIsPutRight)
{
    TestSupport::LogGuard log;
    const QTemporaryDir temporary;
    const auto path = temporary.filePath("layout.json");
    const QByteArray whole = Studio::FormatLayout({"geometry", "panels", true, Studio::TilePlots(2), 1});
    for (const QByteArray& rText : {QByteArray(), whole.left(whole.size() / 2), QByteArray("{}"), QByteArray("[1, 2]"),
                                    QByteArray("{\"windowLayout\": 7}"), QByteArray("\xff\xfe\0\0", 4)})
    {
        QFile file(path);
        ASSERT_TRUE(file.open(QIODevice::WriteOnly));
        file.write(rText);
        file.close();
        EXPECT_FALSE(Studio::ReadLayout(path.toStdString())) << rText.toStdString();
    }
    const auto odd =
        Studio::ParseLayout("{\"windowLayout\": {\"geometry\": 5, \"view\": [], \"current\": 99, \"plots\": "
                            "[[-3, 0.9, 0.5, 7], 4, [\"a\"], [1e300, 0, 0, -1]]}}");
    ASSERT_TRUE(odd);
    EXPECT_EQ(odd->Geometry, QByteArray());
    EXPECT_TRUE(odd->bTabbed);
    EXPECT_EQ(odd->Current, 3);
    ASSERT_EQ(odd->Plots.size(), 4u);
    const QRectF area(0.0, 0.0, 1.0, 1.0);
    for (const QRectF& rPlace : odd->Plots)
    {
        EXPECT_TRUE(area.contains(rPlace));
        EXPECT_GE(rPlace.width(), 0.05);
        EXPECT_GE(rPlace.height(), 0.05);
    }
    QByteArray many = "{\"windowLayout\": {\"plots\": [[]";
    for (int i = 0; i < 500; ++i)
        many += ",[]";
    EXPECT_EQ(Studio::ParseLayout(many + "]}}")->Plots.size(), Studio::WindowLayout::MostPlots);
}

TEST(WindowLayout, TilesFillTheAreaOnAnyScreen)
{
    for (std::size_t count = 0; count < 12; ++count)
    {
        const auto tiles = Studio::TilePlots(count);
        ASSERT_EQ(tiles.size(), count);
        for (const QSize& rArea : {QSize(1601, 997), QSize(800, 600)})
        {
            int covered = 0;
            for (const QRectF& rTile : tiles)
            {
                const QRect rect = Studio::PlaceInArea(rTile, rArea, QSize(1, 1));
                EXPECT_TRUE(QRect(QPoint(), rArea).contains(rect));
                covered += rect.width() * rect.height();
                EXPECT_EQ(Studio::PlaceInArea(Studio::ShareOfArea(rect, rArea), rArea, QSize(1, 1)), rect);
            }
            EXPECT_EQ(covered, count == 0 ? 0 : rArea.width() * rArea.height()) << count;
        }
    }
    // On a smaller screen a window keeps a usable size inside it.
    EXPECT_EQ(Studio::PlaceInArea({0.9, 0.9, 0.1, 0.1}, {640, 480}, {200, 100}), QRect(440, 380, 200, 100));
    EXPECT_EQ(Studio::PlaceInArea({0.5, 0.5, 0.5, 0.5}, {50, 40}, {200, 100}), QRect(0, 0, 50, 40));
}

} // namespace
