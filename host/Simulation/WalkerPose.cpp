#include "Simulation/WalkerPose.h"

#include "Simulation/GaitCurves.h"

#include <cmath>
#include <numbers>

namespace Simulation
{

namespace
{

using Rotations = std::array<Eigen::Quaterniond, SegmentCount>;

constexpr double pi = std::numbers::pi;

Eigen::Quaterniond AboutX(double i_Radians)
{
    return {std::cos(i_Radians / 2), std::sin(i_Radians / 2), 0.0, 0.0};
}

Eigen::Quaterniond AboutY(double i_Radians)
{
    return {std::cos(i_Radians / 2), 0.0, std::sin(i_Radians / 2), 0.0};
}

Eigen::Quaterniond AboutZ(double i_Radians)
{
    return {std::cos(i_Radians / 2), 0.0, 0.0, std::sin(i_Radians / 2)};
}

Eigen::Quaterniond& At(Rotations& i_rRotations, ESegment i_Segment)
{
    return i_rRotations[static_cast<std::size_t>(i_Segment)];
}

/// i_Side is 1 on the left and -1 on the right. Bending forwards turns about -y, so hip flexion is negative there.
void BendLeg(Rotations& o_rRotations, ESegment i_Thigh, double i_Phase, double i_Side)
{
    const LegAngles angles = LegAnglesAt(i_Phase);
    const std::size_t thigh = static_cast<std::size_t>(i_Thigh);
    o_rRotations[thigh] = AboutX(i_Side * angles.HipAbduction) * AboutY(-angles.HipFlexion);
    o_rRotations[thigh + 1] = AboutY(angles.KneeFlexion);
    o_rRotations[thigh + 2] = AboutZ(i_Side * 0.1) * AboutY(-angles.AnkleDorsiflexion);
    o_rRotations[thigh + 3] = AboutY(-angles.ToeExtension);
}

/// An arm swings with the leg of the other side.
void SwingArm(Rotations& o_rRotations, ESegment i_Clavicle, double i_OtherLegPhase, double i_Side, double i_Swing)
{
    const std::size_t clavicle = static_cast<std::size_t>(i_Clavicle);
    const double forward = i_Swing * std::cos(2.0 * pi * (i_OtherLegPhase - 0.02));
    o_rRotations[clavicle] = AboutZ(-i_Side * 0.06 * forward);
    o_rRotations[clavicle + 1] = AboutX(i_Side * 0.12) * AboutY(0.10 - 0.38 * forward);
    o_rRotations[clavicle + 2] = AboutY(-0.42 - 0.24 * forward) * AboutZ(i_Side * 0.15);
    o_rRotations[clavicle + 3] = AboutY(-0.08 - 0.05 * forward);
}

Rotations LocalRotations(const WalkerStyle& i_rStyle, double i_Seconds, double i_Heading)
{
    const double phase = i_rStyle.LeftPhase(i_Seconds);
    const double cycle = 2.0 * pi * phase;
    const double twist = 0.09 * std::cos(cycle);
    const double list = 0.07 * std::sin(cycle + 0.4);
    Rotations rotations;
    At(rotations, ESegment::Pelvis) =
        AboutZ(i_Heading - twist) * AboutX(list) * AboutY(0.12 + 0.02 * std::cos(2.0 * cycle));
    At(rotations, ESegment::Lumbar) = AboutZ(0.7 * twist) * AboutX(-0.6 * list) * AboutY(-0.07);
    At(rotations, ESegment::Thorax) = AboutZ(1.0 * twist) * AboutX(-0.4 * list) * AboutY(0.02 * std::cos(2.0 * cycle));
    At(rotations, ESegment::Head) =
        AboutZ(-0.7 * twist + 0.15 * std::sin(0.37 * i_Seconds)) * AboutY(-0.05 + 0.02 * std::sin(0.9 * i_Seconds));
    SwingArm(rotations, ESegment::LeftClavicle, phase + 0.5, 1.0, i_rStyle.ArmSwing);
    SwingArm(rotations, ESegment::RightClavicle, phase, -1.0, i_rStyle.ArmSwing);
    BendLeg(rotations, ESegment::LeftThigh, phase, 1.0);
    BendLeg(rotations, ESegment::RightThigh, phase + 0.5, -1.0);
    return rotations;
}

void PlaceChildren(BodyPose& o_rPose, const Rotations& i_rLocal, double i_Scale)
{
    const auto table = GetSegmentTable();
    for (std::size_t i = 1; i < SegmentCount; ++i)
    {
        const SegmentPose& rParent = o_rPose[static_cast<std::size_t>(table[i].Parent)];
        const Eigen::Vector3d offset = Eigen::Vector3d(table[i].Offset) * i_Scale;
        o_rPose[i].Position = rParent.Position + rParent.Rotation * offset;
        o_rPose[i].Rotation = rParent.Rotation * i_rLocal[i];
    }
}

/// How far the lowest point of the soles lies above the pelvis' zero height (a negative number), rounded off where the
/// weight goes from one sole point to the next, so that the body moves without a kink.
double SoleHeight(const BodyPose& i_rPose, double i_Scale)
{
    constexpr double rounding = 8.0; // millimetres
    double sum = 0.0;
    double lowest = 0.0;
    std::array<double, 4> heights{};
    std::size_t count = 0;
    for (const ESegment foot : {ESegment::LeftFoot, ESegment::RightFoot})
    {
        const SegmentPose& rFoot = i_rPose[static_cast<std::size_t>(foot)];
        for (const double x : {-50.0, 140.0})
        {
            const Eigen::Vector3d point = rFoot.Position + rFoot.Rotation * (Eigen::Vector3d(x, 0.0, -90.0) * i_Scale);
            heights[count++] = point.z();
            lowest = std::min(lowest, point.z());
        }
    }
    for (const double height : heights)
        sum += std::exp((lowest - height) / rounding);
    return lowest - rounding * std::log(sum);
}

} // namespace

BodyPose PoseAt(const WalkerStyle& i_rStyle, double i_Seconds)
{
    const double onPath = i_rStyle.PathStart + i_rStyle.AngularSpeed() * i_Seconds;
    const double heading = onPath + i_rStyle.Turn * pi / 2.0;
    const double sway = 22.0 * i_rStyle.Scale * std::sin(2.0 * pi * i_rStyle.LeftPhase(i_Seconds) - 0.3);
    const double radius = i_rStyle.PathRadius - i_rStyle.Turn * sway;

    const Rotations local = LocalRotations(i_rStyle, i_Seconds, heading);
    BodyPose pose;
    pose[0].Rotation = local[0];
    pose[0].Position = Eigen::Vector3d(i_rStyle.PathCentre.x() + radius * std::cos(onPath),
                                       i_rStyle.PathCentre.y() + radius * std::sin(onPath), 0.0);
    PlaceChildren(pose, local, i_rStyle.Scale);
    const double lift = -SoleHeight(pose, i_rStyle.Scale);
    for (SegmentPose& rSegment : pose)
        rSegment.Position.z() += lift;
    return pose;
}

Eigen::Vector3d AngleAxisOf(const Eigen::Quaterniond& i_rRotation)
{
    const double sign = i_rRotation.w() < 0.0 ? -1.0 : 1.0;
    const Eigen::Vector3d vector = sign * i_rRotation.vec();
    const double sine = vector.norm();
    if (sine < 1e-12)
        return Eigen::Vector3d::Zero();
    return vector * (2.0 * std::atan2(sine, sign * i_rRotation.w()) / sine);
}

} // namespace Simulation
