#pragma once

#include "Recordings/Text/TextScan.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <vector>

namespace Recordings
{

// Rules that lay the rows of a table, whose times stand as decimals, on an even grid of ticks. No state, no file.

/// The rate of rows that come without any time.
inline constexpr double AssumedRate = 120.0;

/// The grid of uneven rows has at most this many places a row; beyond that it is made coarser.
inline constexpr std::size_t MostPlacesARow = 8;

/// The times of the rows as they were read.
struct TableTimes
{
    std::vector<double> Seconds; ///< a time for each row; NaN for a row without one
    Decimals Digits;             ///< most digits behind the point that any of them was written with
    double Unit = 1.0;           ///< seconds of the unit that they were written in; 0: whole numbers that are exact
    double HintRate = 0.0;       ///< samples a second as the file says it elsewhere; 0 when it does not
};

/// An even grid and the place of each row on it.
struct TimeGrid
{
    static constexpr std::size_t NoPlace = static_cast<std::size_t>(-1); ///< of a row that is left out

    double Rate = AssumedRate;
    std::int64_t Period = 0;    ///< ticks, nearest to the rate
    std::int64_t FirstTick = 0; ///< of place 0
    std::size_t Places = 0;
    std::vector<std::size_t> PlaceOfRow; ///< rising; empty when row i stands at place i and no row is left out
    bool bExact = true;                  ///< whether every time is that of its place, to what a double can tell
    bool bUneven = false;                ///< whether the rows do not follow one even rate, gaps aside
    std::string Remark;                  ///< of what is usual: times that were rounded; empty or one sentence

    std::size_t PlaceOf(std::size_t i_Row) const { return PlaceOfRow.empty() ? i_Row : PlaceOfRow[i_Row]; }
};

/// Whether rows can be laid at such a rate: 0.1 samples a second up to one a tick.
bool IsUsableRate(double i_Rate);

/// Rows one after the other at a rate from tick 0.
TimeGrid EvenGrid(std::size_t i_Rows, double i_Rate);

/// The grid on which rows with such times stand:
/// - times that are even to within their last written digit (or the last that is no zero, or those of a 32-bit number)
///   give the roundest rate that fits, the hint first; the same where whole steps are left out, whose places stay
///   empty;
/// - other times give the widest grid of whole ticks that holds them all, empty places between them, if it has no more
///   than MostPlacesARow places a row (i_FreePlaces are granted besides); else a coarser one on which each row takes
///   the nearest place, and a row that finds it taken is left out;
/// - a row without a time, or with one that is not later than that before it, is left out.
/// Without any time the rows follow one another at the hint or at AssumedRate. All of this but the even case is
/// told in io_rWarnings.
TimeGrid FindTimeGrid(const TableTimes& i_rTimes, std::size_t i_FreePlaces, std::vector<std::string>& io_rWarnings);

/// Where the places of an even grid lie between rows at uneven times.
struct ResampleStep
{
    std::size_t Before = 0; ///< row at or before the place
    std::size_t After = 0;  ///< row at or behind it; the same as Before where it meets a row
    double Share = 0.0;     ///< of the row behind
    bool bGap = false;      ///< the rows are so far apart that nothing is known between them
};

/// The even grid nearest to uneven times: the round rate next to the median step. o_rSteps gets a step for each place.
/// Rows more than two and a half steps apart leave a gap. Rows that i_rUneven leaves out are not used.
/// i_rUneven as it is, and no steps, when such a grid would have more than MostPlacesARow places a row.
TimeGrid ResampleGrid(const TableTimes& i_rTimes, const TimeGrid& i_rUneven, std::vector<ResampleStep>& o_rSteps,
                      std::vector<std::string>& io_rWarnings);

/// A rate between the two that people use, nearest to i_Middle; else a whole or nearly whole one; else i_Middle.
double RoundRate(double i_Lowest, double i_Highest, double i_Middle);

/// Whether cameras, force plates or amplifiers are commonly set to exactly this rate.
bool IsUsualRate(double i_Rate);

} // namespace Recordings
