#pragma once

#include "Expressions/RotationForms.h"
#include "Expressions/Rows.h"

#include <Eigen/Geometry>

#include <span>

namespace Expressions
{

/// Reads rotations of a form as unit quaternions. i_Radians: of one unit of each component, those that are no angles
/// aside. A row that is no rotation (a component missing, a matrix of noughts) gives a quaternion of NaN.
void LoadRotations(const RotationForm& i_rForm, ConstRows i_Rows, std::span<const double> i_Radians,
                   std::span<Eigen::Quaterniond> o_Rotations);

/// Writes unit quaternions in a form, angles in radian.
void StoreRotations(const RotationForm& i_rForm, std::span<const Eigen::Quaterniond> i_Rotations, Rows o_Rows);

void StoreAngles(std::span<const Eigen::Quaterniond> i_Rotations, Rows o_Rows);

/// b^-1 a.
void LeftQuotientRotations(std::span<const Eigen::Quaterniond> i_A, std::span<const Eigen::Quaterniond> i_B,
                           std::span<Eigen::Quaterniond> o_Rotations);

/// Where i_A stands as seen from the pose with the position i_B and the rotation i_Rotation.
void LeftQuotientPositions(ConstRows i_A, ConstRows i_B, std::span<const Eigen::Quaterniond> i_Rotation, Rows o_Rows);

} // namespace Expressions
