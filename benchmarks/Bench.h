#pragma once

#include <algorithm>
#include <chrono>
#include <functional>
#include <string>
#include <utility>
#include <vector>

namespace Bench
{

/// Whether a ratio has to be at least or at most its target, or is only reported.
enum class EGoal
{
    AtLeast,
    AtMost,
    Report
};

/// One measured figure beside the yardstick that was measured in the same run, both in the same unit.
struct Figure
{
    std::string Name;
    double Value = 0.0;
    std::string Unit;
    std::string Yardstick;
    double YardstickValue = 0.0;
    double Ratio = 0.0; ///< what the goal is about; each bench says in its name which way round it is
    EGoal Goal = EGoal::Report;
    double Target = 0.0;

    bool IsMet() const { return Goal == EGoal::Report || (Goal == EGoal::AtLeast ? Ratio >= Target : Ratio <= Target); }
};

using Table = std::vector<Figure>;

/// Seconds of the fastest of i_Repeats runs: the one least disturbed by the rest of the machine.
template <typename TFunction>
double BestSeconds(int i_Repeats, const TFunction& i_rFunction)
{
    double best = 1e300;
    for (int i = 0; i < i_Repeats; ++i)
    {
        const auto start = std::chrono::steady_clock::now();
        i_rFunction();
        best = std::min(best, std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count());
    }
    return best;
}

/// Seconds of the fastest run of each of two functions, run in turn so that both see the same machine.
template <typename TFirst, typename TSecond>
std::pair<double, double> BestSecondsPaired(int i_Repeats, const TFirst& i_rFirst, const TSecond& i_rSecond)
{
    std::pair<double, double> best{1e300, 1e300};
    for (int i = 0; i < i_Repeats; ++i)
    {
        best.first = std::min(best.first, BestSeconds(1, i_rFirst));
        best.second = std::min(best.second, BestSeconds(1, i_rSecond));
    }
    return best;
}

/// Keeps a computed value from being optimised away.
template <typename T>
void Keep(const T& i_rValue)
{
    asm volatile("" : : "g"(&i_rValue) : "memory");
}

} // namespace Bench
