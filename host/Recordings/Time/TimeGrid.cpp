#include "Recordings/Time/TimeGrid.h"

#include "Recordings/Common/VRecording.h"
#include "Recordings/Text/TextScan.h"
#include "TQL/ITick.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <numeric>
#include <optional>
#include <utility>

namespace Recordings
{

namespace
{

constexpr double LatestTime = 1e10;          // seconds; ticks of grids with later times might not fit
constexpr std::size_t EnoughRoughRows = 100; // to tell rounded times from lost rows
constexpr auto TicksPerSecond = static_cast<double>(TQL::DefaultTickRate);

/// The rows that can be used: times that rise.
struct UsableRows
{
    std::vector<double> Times;
    std::vector<std::size_t> RowOf; // the row of each time

    std::size_t Size() const { return Times.size(); }
    double Span() const { return Times.back() - Times.front(); }
    double Largest() const { return std::max(std::abs(Times.front()), std::abs(Times.back())); }
};

/// Rows on an even rate: row i at Origin + place i / Rate, in seconds, at most Displaced away from its own time.
struct EvenFit
{
    double Rate = 0.0;
    double Origin = 0.0;
    double Displaced = 0.0;
};

std::string Counted(std::size_t i_Count, const char* i_pOne, const char* i_pMany)
{
    return std::to_string(i_Count) + (i_Count == 1 ? i_pOne : i_pMany);
}

UsableRows FindUsableRows(const TableTimes& i_rTimes, std::vector<std::string>& io_rWarnings)
{
    UsableRows rows;
    std::size_t timeless = 0;
    std::size_t early = 0;
    rows.Times.reserve(i_rTimes.Seconds.size());
    rows.RowOf.reserve(i_rTimes.Seconds.size());
    for (std::size_t i = 0; i < i_rTimes.Seconds.size(); ++i)
    {
        const double time = i_rTimes.Seconds[i];
        const bool bTime = std::abs(time) <= LatestTime;
        const bool bLater = bTime && (rows.Times.empty() || time > rows.Times.back());
        timeless += bTime ? 0 : 1;
        early += bTime && !bLater ? 1 : 0;
        if (!bLater)
            continue;
        rows.Times.push_back(time);
        rows.RowOf.push_back(i);
    }
    if (timeless != 0 && !rows.Times.empty())
        io_rWarnings.push_back(Counted(timeless, " row has", " rows have") + " no time and " +
                               (timeless == 1 ? "is" : "are") + " left out.");
    if (early != 0)
        io_rWarnings.push_back(Counted(early, " row is", " rows are") +
                               " not later than the row before and left out; times that are doubled or run backwards "
                               "keep the first.");
    return rows;
}

// How far apart two times may be that were written for the same moment, in seconds.
double RoundingOf(const TableTimes& i_rTimes, int i_Decimals, const UsableRows& i_rRows)
{
    const double largest = i_rRows.Largest();
    double rounding = i_rTimes.Unit > 0.0 ? i_rTimes.Unit * std::pow(10.0, -i_Decimals) : 0.0;
    rounding = std::max(rounding, std::ldexp(largest, -49));
    const double unit = i_rTimes.Unit > 0.0 ? i_rTimes.Unit : 1.0;
    const auto isFloat = [&](double i_Time)
    {
        return std::abs(static_cast<double>(static_cast<float>(i_Time / unit)) * unit - i_Time) <= rounding / 2.0;
    };
    if (std::all_of(i_rRows.Times.begin(), i_rRows.Times.end(), isFloat))
        rounding = std::max(rounding, std::ldexp(largest, -23));
    return rounding;
}

// Rows at such places fit a rate when the same line goes through all of them within the rounding.
std::optional<EvenFit> TryRate(const UsableRows& i_rRows, const std::vector<std::size_t>& i_rPlaces, double i_Rate,
                               double i_Rounding, double i_Allowed)
{
    double lowest = 0.0;
    double highest = 0.0;
    for (std::size_t i = 0; i < i_rRows.Size(); ++i)
    {
        const std::size_t place = i_rPlaces.empty() ? i : i_rPlaces[i];
        const double away = i_rRows.Times[i] - i_rRows.Times.front() - static_cast<double>(place) / i_Rate;
        lowest = std::min(lowest, away);
        highest = std::max(highest, away);
        if (!(highest - lowest <= i_Allowed * 1.001))
            return std::nullopt;
    }
    // A first time of 0.017 at 60 Hz stands for 1/60 when that suits all rows.
    const double whole = std::round(i_rRows.Times.front() * i_Rate) / i_Rate;
    const double shift = whole - i_rRows.Times.front();
    const double displaced = std::max(std::abs(lowest - shift), std::abs(highest - shift));
    if (displaced <= i_Rounding)
        return EvenFit{i_Rate, whole, displaced};
    return EvenFit{i_Rate, i_rRows.Times.front(), std::max(-lowest, highest)};
}

double MedianStep(const std::vector<double>& i_rTimes)
{
    std::vector<double> steps(i_rTimes.size() - 1);
    for (std::size_t i = 0; i < steps.size(); ++i)
        steps[i] = i_rTimes[i + 1] - i_rTimes[i];
    const auto middle = steps.begin() + static_cast<std::ptrdiff_t>((steps.size() - 1) / 2);
    std::nth_element(steps.begin(), middle, steps.end());
    return *middle;
}

// Whether most rows follow each other by one and the same step: rows that have been lost, not times that were rounded.
bool HasCommonStep(const UsableRows& i_rRows)
{
    const double step = MedianStep(i_rRows.Times);
    std::size_t same = 0;
    for (std::size_t i = 1; i < i_rRows.Size(); ++i)
        same += std::abs(i_rRows.Times[i] - i_rRows.Times[i - 1] - step) <= 1e-6 * step ? 1u : 0u;
    return same * 2 > i_rRows.Size() - 1;
}

// i_rPlaces as in TimeGrid, for usable rows.
std::optional<EvenFit> FitEven(const UsableRows& i_rRows, const std::vector<std::size_t>& i_rPlaces, double i_Rounding,
                               double i_HintRate)
{
    const auto steps = static_cast<double>(i_rPlaces.empty() ? i_rRows.Size() - 1 : i_rPlaces.back());
    const double span = i_rRows.Span();
    const double mean = steps / span;
    // Where the rounding hides much of a step, a lost row looks like a slower rate: take only rates that are in use.
    const bool bRough = i_Rounding > 0.25 / mean;
    if (bRough && i_rRows.Size() < EnoughRoughRows && i_rRows.Size() > 2 && HasCommonStep(i_rRows))
        return TryRate(i_rRows, i_rPlaces, RoundRate(mean * (1.0 - 1e-9), mean * (1.0 + 1e-9), mean), 0.0, 1e-9 / mean);
    const double allowed = bRough ? 0.99 * i_Rounding : i_Rounding;
    const double lowest = steps / (span + i_Rounding) * (1.0 - 1e-12);
    const double highest = span > i_Rounding ? steps / (span - i_Rounding) * (1.0 + 1e-12) : mean * 2.0;
    if (i_HintRate >= lowest && i_HintRate <= highest)
        if (const std::optional<EvenFit> fit = TryRate(i_rRows, i_rPlaces, i_HintRate, i_Rounding, allowed))
            return fit;
    const double round = RoundRate(lowest, highest, mean);
    if (!bRough || IsUsualRate(round))
        if (const std::optional<EvenFit> fit = TryRate(i_rRows, i_rPlaces, round, i_Rounding, allowed))
            return fit;
    // The line through both ends may be off by a rounding at each.
    return bRough ? std::nullopt : TryRate(i_rRows, i_rPlaces, mean, i_Rounding, 2.0 * i_Rounding);
}

// Places of rows that follow the median step with whole steps left out; empty when there are too many places, or steps
// that are no multiples.
std::vector<std::size_t> PlacesWithGaps(const UsableRows& i_rRows, double i_Rounding, std::size_t i_MostPlaces)
{
    const double step = MedianStep(i_rRows.Times);
    if (i_Rounding > step / 4.0)
        return {};
    std::vector<std::size_t> places{0};
    places.reserve(i_rRows.Size());
    for (std::size_t i = 1; i < i_rRows.Size(); ++i)
    {
        const double steps = (i_rRows.Times[i] - i_rRows.Times[i - 1]) / step;
        const double whole = std::round(steps);
        if (whole < 1.0 || whole > static_cast<double>(i_MostPlaces))
            return {};
        places.push_back(places.back() + static_cast<std::size_t>(whole));
        if (places.back() >= i_MostPlaces)
            return {};
    }
    return places;
}

std::int64_t TickOf(double i_Seconds)
{
    return std::llround(i_Seconds * TicksPerSecond);
}

// A round rate that has the same period in ticks.
double NameRate(double i_Rate)
{
    const double round = RoundRate(i_Rate * (1.0 - 1e-6), i_Rate * (1.0 + 1e-6), i_Rate);
    return PeriodOfRate(round) == PeriodOfRate(i_Rate) ? round : i_Rate;
}

// The widest grid of whole ticks that holds all rows.
bool FindTickGrid(const UsableRows& i_rRows, std::size_t i_MostPlaces, TimeGrid& o_rGrid,
                  std::vector<std::size_t>& o_rPlaces)
{
    const std::int64_t first = TickOf(i_rRows.Times.front());
    std::int64_t period = 0;
    std::int64_t before = first;
    for (std::size_t i = 1; i < i_rRows.Size(); ++i)
    {
        const std::int64_t tick = TickOf(i_rRows.Times[i]);
        if (tick == before)
            return false;
        period = std::gcd(period, tick - before);
        before = tick;
    }
    const std::int64_t last = TickOf(i_rRows.Times.back());
    if (static_cast<std::uint64_t>((last - first) / period) >= i_MostPlaces)
        return false;
    o_rGrid.Period = period;
    o_rGrid.Rate = NameRate(TicksPerSecond / static_cast<double>(period));
    o_rGrid.FirstTick = first;
    for (const double time : i_rRows.Times)
        o_rPlaces.push_back(static_cast<std::size_t>((TickOf(time) - first) / period));
    return true;
}

// A grid of i_MostPlaces places at most; rows take the nearest, and NoPlace where another was first. Returns how many.
std::size_t FindCoarseGrid(const UsableRows& i_rRows, std::size_t i_MostPlaces, TimeGrid& o_rGrid,
                           std::vector<std::size_t>& o_rPlaces)
{
    double rate = (static_cast<double>(i_MostPlaces) - 1.5) / i_rRows.Span();
    rate = rate > 2.0 ? std::floor(rate) : rate;
    o_rGrid.Period = std::max<std::int64_t>(1, PeriodOfRate(rate)); // times may be nearer than a tick
    const std::int64_t span = TickOf(i_rRows.Times.back()) - TickOf(i_rRows.Times.front());
    if (static_cast<std::uint64_t>(span / o_rGrid.Period) + 2 > i_MostPlaces)
        ++o_rGrid.Period;
    o_rGrid.Rate = NameRate(TicksPerSecond / static_cast<double>(o_rGrid.Period));
    o_rGrid.FirstTick = TickOf(i_rRows.Times.front());
    std::size_t met = 0;
    std::size_t last = TimeGrid::NoPlace;
    for (const double time : i_rRows.Times)
    {
        const auto place =
            static_cast<std::size_t>((TickOf(time) - o_rGrid.FirstTick + o_rGrid.Period / 2) / o_rGrid.Period);
        met += place == last ? 1 : 0;
        o_rPlaces.push_back(place == last ? TimeGrid::NoPlace : place);
        last = place;
    }
    return met;
}

std::string HertzText(double i_Rate)
{
    return NumberText(i_Rate) + " Hz";
}

void LayEvenly(const EvenFit& i_rFit, TimeGrid& o_rGrid)
{
    o_rGrid.Rate = NameRate(i_rFit.Rate);
    o_rGrid.Period = PeriodOfRate(i_rFit.Rate);
    o_rGrid.FirstTick = TickOf(i_rFit.Origin);
}

// Rows whose times no bounded grid can hold.
void LayCoarsely(const UsableRows& i_rRows, std::size_t i_MostPlaces, TimeGrid& o_rGrid,
                 std::vector<std::size_t>& o_rPlaces, std::vector<std::string>& io_rWarnings)
{
    const std::size_t met = FindCoarseGrid(i_rRows, i_MostPlaces, o_rGrid, o_rPlaces);
    if (met <= i_rRows.Size() / 2)
    {
        io_rWarnings.push_back(
            "The times are so uneven that the rows stand only near them, on a grid of " + HertzText(o_rGrid.Rate) +
            " with gaps" +
            (met == 0 ? "."
                      : "; " + Counted(met, " row that met another there is", " rows that met others there are") +
                            " left out."));
        return;
    }
    // A few times that are far from all others would take most rows away.
    o_rPlaces.clear();
    const double step = std::max(MedianStep(i_rRows.Times), 1.0 / TicksPerSecond);
    o_rGrid.Rate = RoundRate(0.99 / step, 1.01 / step, 1.0 / step);
    o_rGrid.Period = PeriodOfRate(o_rGrid.Rate);
    io_rWarnings.push_back("The times jump too far to be kept; the rows follow one another at " +
                           HertzText(o_rGrid.Rate) + ".");
}

void TellGaps(std::size_t i_Rows, std::size_t i_Places, const TimeGrid& i_rGrid, std::vector<std::string>& io_rWarnings)
{
    if (i_Places != i_Rows)
        io_rWarnings.push_back("The times leave out " + std::to_string(i_Places - i_Rows) + " of " +
                               std::to_string(i_Places) + " rows at " + HertzText(i_rGrid.Rate) +
                               "; there the samples are missing.");
}

void TellEven(const TableTimes& i_rTimes, const EvenFit& i_rFit, TimeGrid& io_rGrid, std::size_t i_Rows,
              std::size_t i_Places, std::vector<std::string>& io_rWarnings)
{
    const bool bAsHinted = i_rFit.Rate == i_rTimes.HintRate;
    if (!bAsHinted && i_rTimes.HintRate > 0.0 && std::abs(i_rFit.Rate / i_rTimes.HintRate - 1.0) > 0.001)
        io_rWarnings.push_back("The head of the file says " + HertzText(i_rTimes.HintRate) + ", its times say " +
                               HertzText(io_rGrid.Rate) + "; the times are used.");
    if (!bAsHinted && i_rFit.Displaced * i_rFit.Rate > 0.01)
        io_rGrid.Remark = "The times are rounded to " +
                          Counted(static_cast<std::size_t>(i_rTimes.Digits.Significant), " decimal", " decimals") +
                          "; the rows stand evenly at " + HertzText(io_rGrid.Rate) + ".";
    TellGaps(i_Rows, i_Places, io_rGrid, io_rWarnings);
}

void PlaceRows(std::size_t i_AllRows, const UsableRows& i_rRows, const std::vector<std::size_t>& i_rPlaces,
               TimeGrid& io_rGrid)
{
    const std::size_t last = i_rPlaces.empty() ? i_rRows.Size() - 1 : 0;
    io_rGrid.Places = last + 1;
    for (const std::size_t place : i_rPlaces)
        if (place != TimeGrid::NoPlace)
            io_rGrid.Places = std::max(io_rGrid.Places, place + 1);
    for (std::size_t i = 0; i < i_rRows.Size() && io_rGrid.bExact; ++i)
    {
        const std::size_t place = i_rPlaces.empty() ? i : i_rPlaces[i];
        const auto tick = static_cast<double>(io_rGrid.FirstTick + static_cast<std::int64_t>(place) * io_rGrid.Period);
        io_rGrid.bExact = place != TimeGrid::NoPlace && std::abs(tick / TicksPerSecond - i_rRows.Times[i]) <=
                                                            1e-12 + std::ldexp(i_rRows.Largest(), -50);
    }
    const bool bAllPlaced = std::find(i_rPlaces.begin(), i_rPlaces.end(), TimeGrid::NoPlace) == i_rPlaces.end();
    if (i_rRows.Size() == i_AllRows && io_rGrid.Places == i_AllRows && bAllPlaced)
        return;
    io_rGrid.PlaceOfRow.assign(i_AllRows, TimeGrid::NoPlace);
    for (std::size_t i = 0; i < i_rRows.Size(); ++i)
        io_rGrid.PlaceOfRow[i_rRows.RowOf[i]] = i_rPlaces.empty() ? i : i_rPlaces[i];
}

// A rate that the rows follow, with or without gaps; io_rPlaces are those of the rows then.
std::optional<EvenFit> FitRows(const TableTimes& i_rTimes, int i_Decimals, const UsableRows& i_rRows,
                               std::size_t i_MostPlaces, std::vector<std::size_t>& o_rPlaces)
{
    const double rounding = RoundingOf(i_rTimes, i_Decimals, i_rRows);
    o_rPlaces.clear();
    if (const std::optional<EvenFit> fit = FitEven(i_rRows, o_rPlaces, rounding, i_rTimes.HintRate))
        return fit;
    o_rPlaces = PlacesWithGaps(i_rRows, rounding, i_MostPlaces);
    return o_rPlaces.empty() ? std::nullopt : FitEven(i_rRows, o_rPlaces, rounding, i_rTimes.HintRate);
}

// i_rRows has at least two.
std::vector<std::size_t> LayRows(const TableTimes& i_rTimes, const UsableRows& i_rRows, std::size_t i_MostPlaces,
                                 TimeGrid& o_rGrid, std::vector<std::string>& io_rWarnings)
{
    std::vector<std::size_t> places;
    std::optional<EvenFit> fit = FitRows(i_rTimes, i_rTimes.Digits.Written, i_rRows, i_MostPlaces, places);
    if (!fit && i_rTimes.Digits.Significant < i_rTimes.Digits.Written)
        fit = FitRows(i_rTimes, i_rTimes.Digits.Significant, i_rRows, i_MostPlaces, places);
    if (fit && fit->Rate <= TicksPerSecond)
    {
        LayEvenly(*fit, o_rGrid);
        TellEven(i_rTimes, *fit, o_rGrid, i_rRows.Size(), places.empty() ? i_rRows.Size() : places.back() + 1,
                 io_rWarnings);
        return places;
    }
    places.clear();
    o_rGrid.bUneven = true;
    if (!FindTickGrid(i_rRows, i_MostPlaces, o_rGrid, places))
        LayCoarsely(i_rRows, i_MostPlaces, o_rGrid, places, io_rWarnings);
    else if (HasCommonStep(i_rRows) && places.back() < 2 * i_rRows.Size())
    {
        o_rGrid.bUneven = false;
        TellGaps(i_rRows.Size(), places.back() + 1, o_rGrid, io_rWarnings);
    }
    else
        io_rWarnings.push_back("The times are uneven; the rows stand on a grid of " + HertzText(o_rGrid.Rate) +
                               " that holds them all, with gaps.");
    return places;
}

} // namespace

bool IsUsableRate(double i_Rate)
{
    return i_Rate >= 0.1 && i_Rate <= TicksPerSecond;
}

TimeGrid EvenGrid(std::size_t i_Rows, double i_Rate)
{
    TimeGrid grid;
    grid.Rate = i_Rate;
    grid.Period = PeriodOfRate(i_Rate);
    grid.Places = i_Rows;
    return grid;
}

TimeGrid FindTimeGrid(const TableTimes& i_rTimes, std::size_t i_FreePlaces, std::vector<std::string>& io_rWarnings)
{
    const UsableRows rows = FindUsableRows(i_rTimes, io_rWarnings);
    const bool bHint = IsUsableRate(i_rTimes.HintRate);
    const double rate = bHint ? i_rTimes.HintRate : AssumedRate;
    if (rows.Times.empty())
    {
        if (!bHint)
            io_rWarnings.push_back("The file has no times and says no rate; the rows follow one another at " +
                                   HertzText(rate) + ".");
        return EvenGrid(i_rTimes.Seconds.size(), rate);
    }
    TimeGrid grid = EvenGrid(1, rate);
    grid.FirstTick = TickOf(rows.Times.front());
    std::vector<std::size_t> places;
    if (rows.Size() > 1)
        places = LayRows(i_rTimes, rows, std::max(MostPlacesARow * rows.Size(), i_FreePlaces), grid, io_rWarnings);
    PlaceRows(i_rTimes.Seconds.size(), rows, places, grid);
    return grid;
}

TimeGrid ResampleGrid(const TableTimes& i_rTimes, const TimeGrid& i_rUneven, std::vector<ResampleStep>& o_rSteps,
                      std::vector<std::string>& io_rWarnings)
{
    UsableRows rows;
    for (std::size_t i = 0; i < i_rTimes.Seconds.size(); ++i)
        if (i_rUneven.PlaceOf(i) != TimeGrid::NoPlace)
        {
            rows.Times.push_back(i_rTimes.Seconds[i]);
            rows.RowOf.push_back(i);
        }
    o_rSteps.clear();
    if (rows.Size() < 2)
        return i_rUneven;
    const double median = MedianStep(rows.Times);
    const double rate = RoundRate(0.99 / median, 1.01 / median, 1.0 / median);
    const double places = std::floor(rows.Span() * rate + 1e-6) + 1.0;
    if (!(places <= static_cast<double>(MostPlacesARow * rows.Size())) || rate > TicksPerSecond)
    {
        io_rWarnings.push_back("The times are too uneven to be resampled.");
        return i_rUneven;
    }
    TimeGrid grid = EvenGrid(static_cast<std::size_t>(places), rate);
    grid.FirstTick = TickOf(rows.Times.front());
    grid.bExact = false;
    o_rSteps.reserve(grid.Places);
    std::size_t row = 0;
    for (std::size_t i = 0; i < grid.Places; ++i)
    {
        const double time =
            rows.Times.front() + static_cast<double>(static_cast<std::int64_t>(i) * grid.Period) / TicksPerSecond;
        while (row + 1 < rows.Size() && rows.Times[row + 1] <= time + 1e-9)
            ++row;
        const bool bMeets = row + 1 == rows.Size() || time - rows.Times[row] <= 1e-9;
        const double step = bMeets ? 1.0 : rows.Times[row + 1] - rows.Times[row];
        o_rSteps.push_back({rows.RowOf[row], rows.RowOf[bMeets ? row : row + 1],
                            bMeets ? 0.0 : (time - rows.Times[row]) / step, !bMeets && step > 2.5 * median});
    }
    io_rWarnings.push_back("The times are uneven; the samples are resampled to " + HertzText(rate) + ".");
    return grid;
}

} // namespace Recordings
