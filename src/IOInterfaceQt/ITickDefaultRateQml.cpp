#include "IOInterfaceQt/ITickDefaultRateQml.h"

#include <cmath>

namespace TQL::IO
{

TQL::ITick ITickDefaultRateQml::advance(double i_Distance, TQL::ITick i_PeriodInTicks) const
{
    if (!std::isfinite(i_Distance))
        return {};
    return {TQL::FramesToTicks(i_Distance, i_PeriodInTicks.Count)};
}

double ITickDefaultRateQml::InUnits(double i_UnitsPerSecond) const
{
    return static_cast<double>(m_Tick.Count) * i_UnitsPerSecond / static_cast<double>(TQL::DefaultTickRate);
}

void ITickDefaultRateQml::SetUnits(double i_Units, double i_UnitsPerSecond)
{
    const double ticks = i_Units * static_cast<double>(TQL::DefaultTickRate) / i_UnitsPerSecond;
    constexpr double limit = 9.2e18;
    if (std::abs(ticks) < limit)
        m_Tick.Count = TQL::RoundHalfAway(ticks);
}

} // namespace TQL::IO
