#pragma once

namespace Simulation
{

/// Joint angles of one leg and its opposite arm at one moment of the gait cycle, in radians.
struct LegAngles
{
    double HipFlexion = 0.0;
    double HipAbduction = 0.0;
    double KneeFlexion = 0.0;
    double AnkleDorsiflexion = 0.0;
    double ToeExtension = 0.0;
};

/// i_Phase counts gait cycles of this leg: whole numbers are its heel strikes, the foot leaves the floor at 0.62.
LegAngles LegAnglesAt(double i_Phase);

inline constexpr double ToeOffPhase = 0.62;

/// The fractional part of a phase, in [0, 1).
double CyclePosition(double i_Phase);

/// Ground reaction of one foot as a share of the body weight; all 0 while the foot is in the air.
struct FootLoad
{
    double Vertical = 0.0;
    double ForeAft = 0.0;  ///< braking negative, pushing off positive
    double Sideways = 0.0; ///< towards the middle of the body
    double Progress = 0.0; ///< of the centre of pressure from heel (0) to toe (1)
};
FootLoad FootLoadAt(double i_Phase);

/// Activity of a muscle around i_Centre, 0 to 1, with i_Width in gait cycles.
double MuscleBurst(double i_Phase, double i_Centre, double i_Width);

} // namespace Simulation
