#include "Expressions/RotationKernels.h"

#include "Expressions/RotationMaths.h"

#include <cstddef>

namespace Expressions
{

namespace
{

using Eigen::Quaterniond;
using Eigen::Vector3d;

Vector3d ReadVector(const float* i_pRow)
{
    return {i_pRow[0], i_pRow[1], i_pRow[2]};
}

template <typename TVector>
void Write(const TVector& i_rValues, float* o_pRow)
{
    for (Eigen::Index i = 0; i < i_rValues.size(); ++i)
        o_pRow[i] = static_cast<float>(i_rValues[i]);
}

/// The rotation of every row.
template <typename TFunction>
void LoadEach(ConstRows i_Rows, std::span<Quaterniond> o_Rotations, const TFunction& i_rFunction)
{
    for (std::size_t row = 0; row < o_Rotations.size(); ++row)
        o_Rotations[row] = i_rFunction(i_Rows[row]);
}

template <typename TFunction>
void StoreEach(std::span<const Quaterniond> i_Rotations, Rows o_Rows, const TFunction& i_rFunction)
{
    for (std::size_t row = 0; row < i_Rotations.size(); ++row)
        i_rFunction(i_Rotations[row], o_Rows[row]);
}

Quaterniond ReadMatrix(const float* i_pRow)
{
    using Matrix = Eigen::Matrix<float, 3, 3, Eigen::RowMajor>;
    return RotationOfMatrix(Eigen::Map<const Matrix>(i_pRow).cast<double>());
}

void WriteMatrix(const Quaterniond& i_rRotation, float* o_pRow)
{
    using Matrix = Eigen::Matrix<float, 3, 3, Eigen::RowMajor>;
    const Eigen::Matrix3d matrix = i_rRotation.toRotationMatrix();
    Eigen::Map<Matrix>{o_pRow} = matrix.cast<float>();
}

/// The axis of no rotation is X.
void WriteAxisAndAngle(const Quaterniond& i_rRotation, float* o_pRow)
{
    const Quaterniond rotation = ShortWay(i_rRotation);
    const double length = rotation.vec().norm();
    const Vector3d axis = length == 0.0 ? Vector3d(Vector3d::UnitX()) : Vector3d(rotation.vec() / length);
    Write(axis, o_pRow);
    o_pRow[3] = static_cast<float>(AngleOfRotation(rotation));
}

} // namespace

void LoadRotations(const RotationForm& i_rForm, ConstRows i_Rows, std::span<const double> i_Radians,
                   std::span<Quaterniond> o_Rotations)
{
    const auto angles = [&](const float* i_pRow)
    {
        return Vector3d(double{i_pRow[0]} * i_Radians[0], double{i_pRow[1]} * i_Radians[1],
                        double{i_pRow[2]} * i_Radians[2]);
    };
    switch (i_rForm.Form)
    {
    case ERotation::AngleAxis:
        return LoadEach(i_Rows, o_Rotations, [&](const float* i_pRow) { return RotationOfVector(angles(i_pRow)); });
    case ERotation::AxisAndAngle:
        return LoadEach(i_Rows, o_Rotations,
                        [&](const float* i_pRow)
                        { return RotationOfAxis(ReadVector(i_pRow), double{i_pRow[3]} * i_Radians[3]); });
    case ERotation::Quaternion:
        return LoadEach(i_Rows, o_Rotations,
                        [](const float* i_pRow)
                        {
                            const Eigen::Vector4d parts(i_pRow[0], i_pRow[1], i_pRow[2], i_pRow[3]);
                            return Quaterniond(Eigen::Vector4d(parts / parts.norm()));
                        });
    case ERotation::SOMatrix:
        return LoadEach(i_Rows, o_Rotations, ReadMatrix);
    case ERotation::Euler:
        return LoadEach(i_Rows, o_Rotations,
                        [&](const float* i_pRow) { return RotationOfEuler(i_rForm.Axes, angles(i_pRow)); });
    }
}

void StoreRotations(const RotationForm& i_rForm, std::span<const Quaterniond> i_Rotations, Rows o_Rows)
{
    switch (i_rForm.Form)
    {
    case ERotation::AngleAxis:
        return StoreEach(i_Rotations, o_Rows,
                         [](const Quaterniond& i_rRotation, float* o_pRow)
                         { Write(VectorOfRotation(i_rRotation), o_pRow); });
    case ERotation::AxisAndAngle:
        return StoreEach(i_Rotations, o_Rows, WriteAxisAndAngle);
    case ERotation::Quaternion:
        return StoreEach(i_Rotations, o_Rows,
                         [](const Quaterniond& i_rRotation, float* o_pRow)
                         { Write(ShortWay(i_rRotation).coeffs(), o_pRow); });
    case ERotation::SOMatrix:
        return StoreEach(i_Rotations, o_Rows, WriteMatrix);
    case ERotation::Euler:
        return StoreEach(i_Rotations, o_Rows,
                         [&](const Quaterniond& i_rRotation, float* o_pRow)
                         { Write(EulerOfRotation(i_rForm.Axes, i_rRotation), o_pRow); });
    }
}

void StoreAngles(std::span<const Quaterniond> i_Rotations, Rows o_Rows)
{
    StoreEach(i_Rotations, o_Rows,
              [](const Quaterniond& i_rRotation, float* o_pRow)
              { *o_pRow = static_cast<float>(AngleOfRotation(i_rRotation)); });
}

void LeftQuotientRotations(std::span<const Quaterniond> i_A, std::span<const Quaterniond> i_B,
                           std::span<Quaterniond> o_Rotations)
{
    for (std::size_t row = 0; row < o_Rotations.size(); ++row)
        o_Rotations[row] = i_B[row].conjugate() * i_A[row];
}

void LeftQuotientPositions(ConstRows i_A, ConstRows i_B, std::span<const Quaterniond> i_Rotation, Rows o_Rows)
{
    for (std::size_t row = 0; row < i_Rotation.size(); ++row)
    {
        const Vector3d apart = ReadVector(i_A[row]) - ReadVector(i_B[row]);
        Write(Vector3d(i_Rotation[row].conjugate() * apart), o_Rows[row]);
    }
}

} // namespace Expressions
