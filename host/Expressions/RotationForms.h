#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace Expressions
{

enum class ERotation
{
    AngleAxis,    ///< axis times angle
    AxisAndAngle, ///< X, Y, Z of the axis, then the angle
    Quaternion,   ///< X, Y, Z, W
    SOMatrix,     ///< row by row
    Euler,        ///< in the order of the axes' names, each turning about the axis as the ones before have turned it
};

/// How the components of a rotation are to be read.
struct RotationForm
{
    ERotation Form = ERotation::AngleAxis;
    std::array<std::uint8_t, 3> Axes{}; ///< of Euler angles: 0 X, 1 Y, 2 Z, no two neighbours equal

    friend bool operator==(const RotationForm&, const RotationForm&) = default;
};

/// By the name of its format, which is that of the function as well: "Quaternion", "EulerZXY". "Euler" alone, and an
/// order that turns twice about one axis at once, are none.
std::optional<RotationForm> FindRotationForm(std::string_view i_Name);
std::string NameOfForm(const RotationForm& i_rForm);

/// The names of its components; as many as it has components.
std::span<const std::string_view> ComponentNamesOf(ERotation i_Form);

/// Whether that component is an angle.
bool IsAngle(ERotation i_Form, std::size_t i_Component);

} // namespace Expressions
