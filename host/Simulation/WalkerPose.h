#pragma once

#include "Simulation/BodyTables.h"

#include <Eigen/Geometry>

#include <array>

namespace Simulation
{

/// How one person walks: a size, a rhythm, and a circle on the floor.
struct WalkerStyle
{
    double Scale = 1.0;            ///< of the body tables
    double StrideFrequency = 0.95; ///< gait cycles a second
    double StartPhase = 0.0;       ///< of the left leg at time 0, in gait cycles
    double PathRadius = 1800.0;    ///< millimetres
    double PathStart = 0.0;        ///< radians on the circle at time 0
    double Turn = 1.0;             ///< 1 counter-clockwise, -1 clockwise
    Eigen::Vector2d PathCentre = Eigen::Vector2d::Zero();
    double ArmSwing = 1.0;
    double MassKilograms = 75.0;

    double LeftPhase(double i_Seconds) const { return StartPhase + StrideFrequency * i_Seconds; }
    double StrideLength() const { return 1230.0 * Scale; }                                       ///< millimetres
    double AngularSpeed() const { return Turn * StrideLength() * StrideFrequency / PathRadius; } ///< radians a second
};

struct SegmentPose
{
    Eigen::Quaterniond Rotation = Eigen::Quaterniond::Identity();
    Eigen::Vector3d Position = Eigen::Vector3d::Zero(); ///< millimetres
};

using BodyPose = std::array<SegmentPose, SegmentCount>;

/// Where every segment is at a time, in the world: z up, the floor at 0. A smooth function of the time.
BodyPose PoseAt(const WalkerStyle& i_rStyle, double i_Seconds);

/// The rotation vector of a pose (axis times angle, radians), its length at most pi.
Eigen::Vector3d AngleAxisOf(const Eigen::Quaterniond& i_rRotation);

} // namespace Simulation
