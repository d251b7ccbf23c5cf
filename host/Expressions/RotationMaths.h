#pragma once

#include <Eigen/Geometry>

#include <array>
#include <cmath>
#include <cstdint>
#include <limits>
#include <numbers>

namespace Expressions
{

/// Of the two quaternions of a rotation the one of the smaller angle; of a half turn, the one whose last component that
/// is not 0 is positive.
inline Eigen::Quaterniond ShortWay(const Eigen::Quaterniond& i_rRotation)
{
    const Eigen::Vector4d& rParts = i_rRotation.coeffs();
    for (const Eigen::Index i : {3, 2, 1, 0})
        if (rParts[i] != 0.0)
            return rParts[i] < 0.0 ? Eigen::Quaterniond(-rParts) : i_rRotation;
    return i_rRotation;
}

inline Eigen::Quaterniond MissingRotation()
{
    return Eigen::Quaterniond(Eigen::Vector4d::Constant(std::numeric_limits<double>::quiet_NaN()));
}

inline Eigen::Quaterniond RotationOfVector(const Eigen::Vector3d& i_rVector)
{
    const double angle = i_rVector.norm();
    // So short that the sine is the angle, to the last bit.
    constexpr double tiny = 1e-9;
    Eigen::Quaterniond rotation;
    rotation.vec() = i_rVector * (angle < tiny ? 0.5 : std::sin(0.5 * angle) / angle);
    rotation.w() = std::cos(0.5 * angle);
    return rotation;
}

/// At most pi long.
inline Eigen::Vector3d VectorOfRotation(const Eigen::Quaterniond& i_rRotation)
{
    const Eigen::Quaterniond rotation = ShortWay(i_rRotation);
    const double sine = rotation.vec().norm();
    constexpr double tiny = 1e-9;
    return rotation.vec() * (sine < tiny ? 2.0 : 2.0 * std::atan2(sine, rotation.w()) / sine);
}

/// 0 to pi.
inline double AngleOfRotation(const Eigen::Quaterniond& i_rRotation)
{
    return 2.0 * std::atan2(i_rRotation.vec().norm(), std::abs(i_rRotation.w()));
}

inline Eigen::Quaterniond RotationOfAxis(const Eigen::Vector3d& i_rAxis, double i_Angle)
{
    const double length = i_rAxis.norm();
    if (length == 0.0)
        return i_Angle == 0.0 ? Eigen::Quaterniond::Identity() : MissingRotation();
    Eigen::Quaterniond rotation;
    rotation.vec() = i_rAxis * (std::sin(0.5 * i_Angle) / length);
    rotation.w() = std::cos(0.5 * i_Angle);
    return rotation;
}

/// A matrix that turns nothing, all 0 or a mirror, is a missing rotation. One that is not quite orthogonal is taken for
/// the rotation that its differences across the diagonal name.
inline Eigen::Quaterniond RotationOfMatrix(const Eigen::Matrix3d& i_rMatrix)
{
    if (!(i_rMatrix.determinant() > 0.0))
        return MissingRotation();
    return Eigen::Quaterniond(i_rMatrix).normalized();
}

using EulerAxes = std::array<std::uint8_t, 3>;

inline Eigen::Quaterniond RotationOfEuler(const EulerAxes& i_rAxes, const Eigen::Vector3d& i_rAngles)
{
    const auto turn = [&](Eigen::Index i_Turn)
    {
        Eigen::Quaterniond rotation(std::cos(0.5 * i_rAngles[i_Turn]), 0.0, 0.0, 0.0);
        rotation.coeffs()[i_rAxes[static_cast<std::size_t>(i_Turn)]] = std::sin(0.5 * i_rAngles[i_Turn]);
        return rotation;
    };
    return turn(0) * turn(1) * turn(2);
}

/// A turn between -pi and pi.
inline double WrapAngle(double i_Angle)
{
    constexpr double pi = std::numbers::pi;
    return i_Angle > pi ? i_Angle - 2.0 * pi : i_Angle < -pi ? i_Angle + 2.0 * pi : i_Angle;
}

/// An order i, j, i with angles a, b, c has the quaternion
///     w = cos b/2 cos (a+c)/2, qi = cos b/2 sin (a+c)/2, qj = sin b/2 cos (a-c)/2, qk = s sin b/2 sin (a-c)/2
/// where s is 1 if i, j, k go round as X, Y, Z do, else -1. So sum and difference of a and c come out by themselves,
/// each exact as long as it means something. An order i, j, k becomes i, j, i with angles a, b + pi/2, -s c when a
/// quarter turn about j follows it.
inline Eigen::Vector3d EulerOfRotation(const EulerAxes& i_rAxes, const Eigen::Quaterniond& i_rRotation)
{
    constexpr double halfPi = 0.5 * std::numbers::pi;
    constexpr double lost = 2.5e-7 * 2.5e-7; // what the samples' own rounding leaves of a sine of 0
    const int i = i_rAxes[0];
    const int j = i_rAxes[1];
    const int k = 3 - i - j;
    const bool bOneAxisTwice = i_rAxes[2] == i;
    const double s = (j - i + 3) % 3 == 1 ? 1.0 : -1.0;
    const Eigen::Vector4d& rQ = i_rRotation.coeffs();
    double w = rQ[3];
    double qi = rQ[i];
    double qj = rQ[j];
    double qk = rQ[k];
    if (!bOneAxisTwice)
    {
        w = (rQ[3] - rQ[j]) * std::numbers::sqrt2 * 0.5;
        qi = (rQ[i] - s * rQ[k]) * std::numbers::sqrt2 * 0.5;
        qj = (rQ[j] + rQ[3]) * std::numbers::sqrt2 * 0.5;
        qk = (rQ[k] + s * rQ[i]) * std::numbers::sqrt2 * 0.5;
    }
    const double cosine = w * w + qi * qi;
    const double sine = qj * qj + qk * qk;
    double halfSum = std::atan2(qi, w);
    double halfDifference = std::atan2(s * qk, qj);
    if (sine < lost)
        halfDifference = halfSum;
    else if (cosine < lost)
        halfSum = halfDifference;
    const double middle = 2.0 * std::atan2(std::sqrt(sine), std::sqrt(cosine));
    const double last = halfSum - halfDifference;
    return {WrapAngle(halfSum + halfDifference), bOneAxisTwice ? middle : middle - halfPi,
            WrapAngle(bOneAxisTwice ? last : -s * last)};
}

} // namespace Expressions
