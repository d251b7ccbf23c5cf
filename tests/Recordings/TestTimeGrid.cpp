#include "Recordings/Time/TimeGrid.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <sstream>
#include <string>
#include <vector>

namespace TestRecordings
{

using Recordings::TableTimes;
using Recordings::TimeGrid;

namespace
{

// Times as a program writes them: i_rTime(row) with that many decimals.
template <typename TFunction>
TableTimes Written(std::size_t i_Rows, int i_Decimals, const TFunction& i_rTime, double i_Hint = 0.0)
{
    TableTimes times;
    times.HintRate = i_Hint;
    for (std::size_t i = 0; i < i_Rows; ++i)
    {
        std::ostringstream text;
        text.precision(i_Decimals);
        text << std::fixed << i_rTime(static_cast<double>(i));
        times.Seconds.push_back(std::strtod(text.str().c_str(), nullptr));
        const Recordings::Decimals digits = Recordings::CountDecimals(text.str());
        times.Digits.Written = std::max(times.Digits.Written, digits.Written);
        times.Digits.Significant = std::max(times.Digits.Significant, digits.Significant);
    }
    return times;
}

TableTimes Exactly(std::vector<double> i_Times)
{
    TableTimes times;
    times.Seconds = std::move(i_Times);
    times.Digits = {6, 6};
    return times;
}

// "60 Hz, 0 by 2250000, 5 places[: place of each row][, exact][, uneven]", then the warnings.
std::string TextOf(const TimeGrid& i_rGrid, const std::vector<std::string>& i_rWarnings)
{
    std::ostringstream text;
    text.precision(9);
    text << i_rGrid.Rate << " Hz, " << i_rGrid.FirstTick << " by " << i_rGrid.Period << ", " << i_rGrid.Places
         << " places";
    for (std::size_t i = 0; i < std::min<std::size_t>(i_rGrid.PlaceOfRow.size(), 8); ++i)
        text << (i == 0 ? ": " : " ")
             << (i_rGrid.PlaceOfRow[i] == TimeGrid::NoPlace ? "-" : std::to_string(i_rGrid.PlaceOfRow[i]));
    text << (i_rGrid.bExact ? ", exact" : "") << (i_rGrid.bUneven ? ", uneven" : "");
    for (const std::string& rWarning : i_rWarnings)
        text << "\n" << rWarning;
    text << (i_rGrid.Remark.empty() ? "" : "\nremark: ") << i_rGrid.Remark;
    return text.str();
}

std::string Find(const TableTimes& i_rTimes, std::size_t i_FreePlaces = 0)
{
    std::vector<std::string> warnings;
    const TimeGrid grid = Recordings::FindTimeGrid(i_rTimes, i_FreePlaces, warnings);
    return TextOf(grid, warnings);
}

auto At(double i_Rate, double i_First = 0.0)
{
    return [=](double i_Row)
    {
        return i_First + i_Row / i_Rate;
    };
}

} // namespace

TEST(TimeGrid, EvenTimesHoweverTheyAreRounded)
{
    const std::string rounded = "remark: The times are rounded to ";
    struct Case
    {
        TableTimes Times;
        std::string Expected;
    };
    const Case cases[] = {
        {Written(300, 6, At(100)), "100 Hz, 0 by 1350000, 300 places, exact"},
        {Written(300, 2, At(100, 2.5)), "100 Hz, 337500000 by 1350000, 300 places, exact"},
        {Written(300, 3, At(120)),
         "120 Hz, 0 by 1125000, 300 places\n" + rounded + "3 decimals; the rows stand evenly at 120 Hz."},
        {Written(300, 3, At(120), 120.0), "120 Hz, 0 by 1125000, 300 places"},
        {Written(300, 3, At(60, 1.0 / 60), 60.0), "60 Hz, 2250000 by 2250000, 300 places"},
        {Written(1500, 4, At(600)),
         "600 Hz, 0 by 225000, 1500 places\n" + rounded + "4 decimals; the rows stand evenly at 600 Hz."},
        {Written(1500, 3, At(600)),
         "600 Hz, 0 by 225000, 1500 places\n" + rounded + "3 decimals; the rows stand evenly at 600 Hz."},
        {Written(500, 5, At(30 / 1.001)), "29.97003 Hz, 0 by 4504500, 500 places"},
        {Written(73, 8, [](double i_Row) { return 0.39999934 + i_Row * 0.01666666; }),
         "60.000024 Hz, 53999911 by 2249999, 73 places"},
        {Written(200, 12, [](double i_Row) { return static_cast<double>(static_cast<float>(5.0 + i_Row / 90.0)); }),
         "90 Hz, 675000000 by 1500000, 200 places"},
        {Written(100, 6, At(50), 200.0), "50 Hz, 0 by 2700000, 100 places, exact\nThe head of the file says 200 Hz, "
                                         "its times say 50 Hz; the times are used."},
        {Written(4, 2, At(100, -0.02)), "100 Hz, -2700000 by 1350000, 4 places, exact"},
        {Written(2000, 3, At(100, 1.7e9)), "100 Hz, 229500000000000000 by 1350000, 2000 places, exact"},
        {Exactly({7.0}), "120 Hz, 945000000 by 1125000, 1 places, exact"},
    };
    for (const Case& rCase : cases)
        EXPECT_EQ(Find(rCase.Times), rCase.Expected);
}

TEST(TimeGrid, GapsAndUnevenTimes)
{
    const double none = std::numeric_limits<double>::quiet_NaN();
    EXPECT_EQ(Find(Exactly({0, 0.01, 0.02, 0.05, 0.06})),
              "100 Hz, 0 by 1350000, 7 places: 0 1 2 5 6, exact\nThe times leave out 2 of 7 rows at 100 Hz; there the "
              "samples are missing.");
    // Two decimals are as coarse as the step: a lost row is no slower rate.
    EXPECT_EQ(Find(Written(4, 2, [](double i_Row) { return i_Row / 100 + (i_Row > 2 ? 0.01 : 0.0); })),
              "100 Hz, 0 by 1350000, 5 places: 0 1 2 4, exact\nThe times leave out 1 of 5 rows at 100 Hz; "
              "there the samples are missing.");
    EXPECT_EQ(
        Find(Written(100, 3, [](double i_Row) { return (i_Row < 50 ? i_Row : i_Row + 3) / 120.0; })),
        "120 Hz, 0 by 1125000, 103 places: 0 1 2 3 4 5 6 7\nThe times leave out 3 of 103 rows at 120 Hz; there the "
        "samples are missing.\nremark: The times are rounded to 3 decimals; the rows stand evenly at 120 Hz.");
    EXPECT_EQ(Find(Exactly({0, 0.01, 0.014, 0.02, 0.024})),
              "500 Hz, 0 by 270000, 13 places: 0 5 7 10 12, exact, uneven\nThe times are uneven; the rows stand on a "
              "grid of 500 Hz that holds them all, with gaps.");
    EXPECT_EQ(Find(Exactly({0, none, 0.01, 0.01, 0.005, 0.02, 1e300})),
              "100 Hz, 0 by 1350000, 3 places: 0 - 1 - - 2 -, exact\n2 rows have no time and are left out.\n2 rows are "
              "not later than the row before and left out; times that are doubled or run backwards keep the first.");
    EXPECT_EQ(Find(Exactly({none, none})),
              "120 Hz, 0 by 1125000, 2 places, exact\nThe file has no times and says no rate; the rows follow one "
              "another at 120 Hz.");
    TableTimes hinted = Exactly({none, none});
    hinted.HintRate = 50.0;
    EXPECT_EQ(Find(hinted), "50 Hz, 0 by 2700000, 2 places, exact");
}

// Times that no grid of a bounded size holds: nothing but the size may give way.
TEST(TimeGrid, BoundedWhateverTheTimes)
{
    std::vector<double> times;
    for (int i = 0; i < 1000; ++i)
        times.push_back(i * 0.01 + 0.001 * std::sin(i * 1.7));
    std::vector<std::string> warnings;
    TimeGrid grid = Recordings::FindTimeGrid(Exactly(times), 0, warnings);
    EXPECT_LE(grid.Places, Recordings::MostPlacesARow * times.size());
    ASSERT_EQ(warnings.size(), 1u);
    EXPECT_EQ(warnings[0].substr(0, 57), "The times are so uneven that the rows stand only near the");
    std::size_t last = TimeGrid::NoPlace;
    for (std::size_t i = 0; i < times.size(); ++i)
    {
        ASSERT_NE(grid.PlaceOf(i), TimeGrid::NoPlace);
        ASSERT_NE(grid.PlaceOf(i), last);
        last = grid.PlaceOf(i);
        const auto tick = static_cast<double>(grid.FirstTick + static_cast<std::int64_t>(last) * grid.Period);
        ASSERT_NEAR(tick / 135e6, times[i], 0.51 * static_cast<double>(grid.Period) / 135e6);
    }
    times.resize(100);
    times.push_back(9e9);
    EXPECT_EQ(Find(Exactly(times)).substr(0, 32), "100 Hz, 0 by 1350000, 101 places");
    EXPECT_NE(Find(Exactly({-1e10, 0, 1e-9, 1e10}), 4096), "");
    EXPECT_NE(Find(Exactly({0, 1e-12, 2e-12})), "");
    EXPECT_NE(Find(Exactly({0, 1.7e-318})), "");
}

TEST(TimeGrid, ResamplingOnRequest)
{
    TableTimes times = Exactly({1.0, 1.011, 1.02, 1.0301, 1.04, 1.09, 1.1, 1.1104});
    std::vector<std::string> warnings;
    const TimeGrid uneven = Recordings::FindTimeGrid(times, 0, warnings);
    ASSERT_TRUE(uneven.bUneven);
    warnings.clear();
    std::vector<Recordings::ResampleStep> steps;
    const TimeGrid grid = Recordings::ResampleGrid(times, uneven, steps, warnings);
    EXPECT_EQ(TextOf(grid, warnings), "100 Hz, 135000000 by 1350000, 12 places\nThe times are uneven; the samples are "
                                      "resampled to 100 Hz.");
    std::ostringstream text;
    text.precision(3);
    for (const Recordings::ResampleStep& rStep : steps)
        text << (rStep.bGap ? "gap " : "") << rStep.Before << "-" << rStep.After << ":" << rStep.Share << " ";
    EXPECT_EQ(text.str(), "0-0:0 0-1:0.909 2-2:0 2-3:0.99 4-4:0 gap 4-5:0.2 gap 4-5:0.4 gap 4-5:0.6 gap 4-5:0.8 5-5:0 "
                          "6-6:0 6-7:0.962 ");
}

} // namespace TestRecordings
