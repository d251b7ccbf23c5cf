#pragma once

#include "ChannelSystem/ComponentDescription.h"
#include "Expressions/IRowOperation.h"
#include "Expressions/IUnitTable.h"

#include <span>
#include <string_view>

namespace Expressions
{

/// Makes the operation that an expression over channels stands for, or the sentence that says why there is none. Reads
/// the text, checks formats and units, and makes a flat program; cheap, without logging, any thread.
///
///     #0, #1, ...                       the inputs
///     Position(x)                       translation of a pose; a position as it is
///     AngleAxis(x), AxisAndAngle(x), Quaternion(x), SOMatrix(x), EulerXYZ(x) and the other eleven orders
///                                       rotation of a rotation or a pose, in that form
///     Angle(x)                          angle of the rotation, radian, 0 to pi
///     mag(x), dot(a, b), a - b          of vectors; b is converted to a's units
///     angleBetween(a, b)                radian, 0 to pi; missing where a vector has no length
///     leftQuotient(a, b)                pose (or rotation) of a as seen from b: b^-1 a
///     join(a, b)                        components of a, then those of b; a rotation and a position are a pose
///     x[1], x[TX], x[Angle]             one component, by index from 0 or by name
///     millimeter(x), degree(x), ...     every factor of that dimension in that unit, exponents left alone
///
/// Rotations turn vectors by R v. AngleAxis is the axis times the angle, quaternions are X, Y, Z, W, matrices stand row
/// by row. Euler angles stand in the order of their name and each turns about the axis as the ones before have turned
/// it: EulerXYZ (a, b, c) is R = Rx(a) Ry(b) Rz(c). A form that the value already has is kept as it is; a form that is
/// computed is the one of least angle (quaternions have W >= 0, the middle angle of an Euler order lies within -pi/2 to
/// pi/2, or 0 to pi where its first axis comes back), a half turn has the axis whose last component that is not 0 is
/// positive, a rotation by nothing has the axis X in AxisAndAngle, and where only the sum of two Euler angles is
/// certain, the last is 0.
///
/// Formats: "Position" of Position(), of the difference of two positions and of either in another unit; "Pose" of a
/// position behind a rotation (not behind Euler angles, which would read as an angle-axis vector); those of rotations
/// by their name; "Angle" of Angle(); "" otherwise. A pose has 6 components, 12 with a matrix, or 7: with axis and
/// angle if the fourth is an angle, otherwise with a quaternion. Angles may come in any unit.
///
/// A row is missing throughout when a component that it needs is.
OperationOrError CompileExpression(std::string_view i_Text, std::span<const TQL::ComponentDescription> i_Inputs,
                                   const IUnitTable& i_rUnits);

} // namespace Expressions
