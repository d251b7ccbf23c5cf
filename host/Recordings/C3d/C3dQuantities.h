#pragma once

#include <array>
#include <string_view>

namespace Recordings
{

/// What points of a C3D file can be other than markers. The file lists the labels of such points in a parameter of its
/// group POINT and may tell their unit in another one.
struct C3dQuantity
{
    std::string_view Name;     ///< of one, as shown: "Angle"
    std::string_view List;     ///< parameter of the labels: "ANGLES"
    std::string_view UnitName; ///< parameter of the unit: "ANGLE_UNITS"
    std::string_view Unit;     ///< where the file tells none
};

/// A point that several lists name is of the first.
inline constexpr std::array<C3dQuantity, 6> C3dQuantities{{{"Angle", "ANGLES", "ANGLE_UNITS", "deg"},
                                                           {"Force", "FORCES", "FORCE_UNITS", "N"},
                                                           {"Moment", "MOMENTS", "MOMENT_UNITS", "Nmm"},
                                                           {"Power", "POWERS", "POWER_UNITS", "W"},
                                                           {"Scalar", "SCALARS", "SCALAR_UNITS", ""},
                                                           {"Reaction", "REACTIONS", "REACTION_UNITS", ""}}};

} // namespace Recordings
