#pragma once

#include "ChannelSystem/ComponentDescription.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>

namespace Channels
{

enum class ERotationForm
{
    AngleAxis,    ///< a vector along the axis, as long as the angle
    Euler,        ///< three angles about axes, in whatever order
    AxisAndAngle, ///< a vector along the axis, then the angle
    Quaternion,   ///< four components that mean the same with all signs changed
    Angle         ///< one angle
};

/// Where the rotation of a channel stands: in its first components.
struct RotationPart
{
    ERotationForm Form = ERotationForm::AngleAxis;
    double Turn = 0.0; ///< a full turn in the unit of the angles; of no use for a quaternion

    std::size_t ComponentCount() const;
};

/// The rotation of a channel that can be kept continuous; nothing when it has none, or one whose form never jumps (a
/// matrix).
std::optional<RotationPart> FindRotation(const TQL::ComponentDescription& i_rDescription);

/// Keeps a series of rotations continuous: of the values that are the same rotation it takes the one nearest to the one
/// before. A row with a missing component stays as it is, and the row after it follows the last one that had all.
/// One series in one direction, one thread.
class VRotationUnwrapper
{
public:
    explicit VRotationUnwrapper(const RotationPart& i_rPart);

    /// Rows of i_Components values, changed in place. Backwards starts at the last row.
    void Forwards(std::span<float> io_Rows, std::size_t i_Components);
    void Backwards(std::span<float> io_Rows, std::size_t i_Components);

    /// Follows this row next, if nothing of its rotation is missing; whether it does.
    bool Follow(std::span<const float> i_Row);
    bool HasPrevious() const { return m_bHasPrevious; }

private:
    using Values = std::array<double, 4>; ///< as many as the form has, then zeros

    bool Read(const float* i_pRow, Values& o_rValues) const;
    void UnwrapRow(float* io_pRow);
    void Unwrap(Values& io_rValues) const;
    void UnwrapAngleAxis(Values& io_rValues) const;
    void UnwrapAngles(Values& io_rValues) const;
    void UnwrapAxisAndAngle(Values& io_rValues) const;
    void UnwrapQuaternion(Values& io_rValues) const;
    double NearestTurn(double i_Angle, double i_Previous) const;

    RotationPart m_Part;
    std::size_t m_Count;
    Values m_Previous{};
    bool m_bHasPrevious = false;
};

} // namespace Channels
