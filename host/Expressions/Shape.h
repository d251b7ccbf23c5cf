#pragma once

#include "ChannelSystem/ComponentDescription.h"
#include "Expressions/IUnitTable.h"
#include "Expressions/RotationForms.h"

#include <cstddef>
#include <optional>
#include <span>
#include <string>
#include <vector>

namespace Expressions
{

/// The format names that rules hang on, beside those of rotations.
inline constexpr const char* s_pPosition = "Position";
inline constexpr const char* s_pPose = "Pose";
inline constexpr const char* s_pAngle = "Angle";
inline constexpr const char* s_pEulerOfNoOrder = "Euler";

enum class EShape
{
    Numbers, ///< a vector or a single number, positions among them
    Rotation,
    Pose, ///< a rotation and a position behind it
};

/// What the components of a channel are to be taken for. A description that does not hold what its format says (four
/// components of a position, a rotation vector by time) is plain numbers.
struct Shape
{
    EShape Kind = EShape::Numbers;
    RotationForm Form; ///< of a rotation or a pose

    /// Components that are the rotation; they come first.
    std::size_t RotationWidth() const { return Kind == EShape::Numbers ? 0 : ComponentNamesOf(Form.Form).size(); }
};

Shape FindShape(const TQL::ComponentDescription& i_rDescription, const IUnitTable& i_rUnits);

/// What each component of a rotation is multiplied with to be in radian, 1 for those that are no angles; nothing when
/// one is in a unit that no angle has.
std::optional<std::vector<double>> FindRadians(ERotation i_Form, std::span<const TQL::ComponentGroup> i_Groups,
                                               const IUnitTable& i_rUnits);

/// Groups of a rotation in that form, its angles in radian.
std::vector<TQL::ComponentGroup> GroupsOfRotation(ERotation i_Form, std::uint16_t i_Radian);

} // namespace Expressions
