#include "Recordings/Time/TimeGrid.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <optional>

namespace Recordings
{

namespace
{

// Samples a second that cameras, force plates and amplifiers are set to.
constexpr std::array UsualRates{
    1.0,    2.0,    5.0,    10.0,   12.5,   15.0,   16.0,   20.0,   24.0,   25.0,   30.0,   32.0,    40.0,    48.0,
    50.0,   60.0,   64.0,   72.0,   75.0,   80.0,   90.0,   96.0,   100.0,  120.0,  125.0,  128.0,   144.0,   148.0,
    150.0,  160.0,  180.0,  192.0,  200.0,  240.0,  250.0,  256.0,  300.0,  320.0,  333.0,  360.0,   400.0,   480.0,
    500.0,  512.0,  600.0,  625.0,  640.0,  720.0,  750.0,  800.0,  900.0,  960.0,  1000.0, 1024.0,  1200.0,  1250.0,
    1280.0, 1440.0, 1500.0, 1600.0, 1800.0, 1920.0, 2000.0, 2048.0, 2400.0, 2500.0, 3000.0, 3200.0,  4000.0,  4096.0,
    4800.0, 5000.0, 6000.0, 8000.0, 8192.0, 9600.0, 10e3,   12e3,   16e3,   20e3,   24e3,   44100.0, 48000.0, 96000.0};

std::optional<double> MultipleBetween(double i_Unit, double i_Lowest, double i_Highest, double i_Middle)
{
    const double rate = std::round(i_Middle / i_Unit) * i_Unit;
    if (rate > 0.0 && rate >= i_Lowest && rate <= i_Highest)
        return rate;
    return std::nullopt;
}

} // namespace

double RoundRate(double i_Lowest, double i_Highest, double i_Middle)
{
    const auto first = std::lower_bound(UsualRates.begin(), UsualRates.end(), i_Lowest);
    const auto last = std::upper_bound(first, UsualRates.end(), i_Highest);
    if (first != last)
        return *std::min_element(
            first, last, [&](double i_A, double i_B) { return std::abs(i_A - i_Middle) < std::abs(i_B - i_Middle); });
    // Whole rates, those of television, tenths, hundredths.
    for (const double unit : {1.0, 30.0 / 1.001, 24.0 / 1.001, 0.1, 0.01})
        if (const std::optional<double> rate = MultipleBetween(unit, i_Lowest, i_Highest, i_Middle))
            return *rate;
    return i_Middle;
}

bool IsUsualRate(double i_Rate)
{
    return std::binary_search(UsualRates.begin(), UsualRates.end(), i_Rate);
}

} // namespace Recordings
