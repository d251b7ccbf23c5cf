#include "Simulation/GaitCurves.h"

#include <cmath>
#include <numbers>

namespace Simulation
{

namespace
{

constexpr double pi = std::numbers::pi;

double Radians(double i_Degrees)
{
    return i_Degrees * pi / 180.0;
}

/// A harmonic of the gait cycle with its peak at i_Peak.
double Harmonic(double i_Phase, int i_Order, double i_Peak)
{
    return std::cos(2.0 * pi * i_Order * (i_Phase - i_Peak));
}

} // namespace

double CyclePosition(double i_Phase)
{
    return i_Phase - std::floor(i_Phase);
}

LegAngles LegAnglesAt(double i_Phase)
{
    LegAngles angles;
    angles.HipFlexion = Radians(11.0 + 21.0 * Harmonic(i_Phase, 1, 0.95) + 3.0 * Harmonic(i_Phase, 2, 0.85));
    angles.HipAbduction = Radians(1.0 + 4.0 * Harmonic(i_Phase, 1, 0.72));
    angles.KneeFlexion = Radians(25.0 + 22.0 * Harmonic(i_Phase, 1, 0.75) + 14.0 * Harmonic(i_Phase, 2, 0.20));
    angles.AnkleDorsiflexion = Radians(7.0 * Harmonic(i_Phase, 1, 0.33) + 8.0 * Harmonic(i_Phase, 2, 0.41));
    angles.ToeExtension = Radians(12.0 * std::pow(0.5 + 0.5 * Harmonic(i_Phase, 1, 0.58), 3.0));
    return angles;
}

FootLoad FootLoadAt(double i_Phase)
{
    const double stance = CyclePosition(i_Phase) / ToeOffPhase;
    if (stance >= 1.0)
        return {};
    FootLoad load;
    load.Vertical = 1.15 * std::sin(pi * stance) + 0.32 * std::sin(3.0 * pi * stance);
    load.ForeAft = -0.18 * std::sin(2.0 * pi * stance);
    load.Sideways = 0.05 * std::sin(pi * stance);
    load.Progress = stance;
    return load;
}

double MuscleBurst(double i_Phase, double i_Centre, double i_Width)
{
    const double distance = CyclePosition(i_Phase - i_Centre + 0.5) - 0.5;
    return std::exp(-0.5 * (distance / i_Width) * (distance / i_Width));
}

} // namespace Simulation
