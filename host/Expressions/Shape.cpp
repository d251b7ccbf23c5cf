#include "Expressions/Shape.h"

#include "Expressions/Units.h"

#include <algorithm>

namespace Expressions
{

namespace
{

bool HasAngle(const TQL::ComponentGroup& i_rGroup, const IUnitTable& i_rUnits)
{
    return !i_rGroup.Factors.empty() && FindRadians(i_rGroup.Factors, i_rUnits);
}

/// A pose has no name for its rotation; it is told by the number of components, and by the fourth where that leaves
/// two.
std::optional<RotationForm> FormInPose(const TQL::ComponentDescription& i_rPose, const IUnitTable& i_rUnits)
{
    switch (i_rPose.Groups.size())
    {
    case 6:
        return RotationForm{ERotation::AngleAxis};
    case 7:
        return RotationForm{HasAngle(i_rPose.Groups[3], i_rUnits) ? ERotation::AxisAndAngle : ERotation::Quaternion};
    case 12:
        return RotationForm{ERotation::SOMatrix};
    default:
        return std::nullopt;
    }
}

} // namespace

Shape FindShape(const TQL::ComponentDescription& i_rDescription, const IUnitTable& i_rUnits)
{
    const bool bPose = i_rDescription.FormatName == s_pPose;
    const std::optional<RotationForm> form =
        bPose ? FormInPose(i_rDescription, i_rUnits) : FindRotationForm(i_rDescription.FormatName);
    if (!form)
        return {};
    const std::size_t width = ComponentNamesOf(form->Form).size();
    if (i_rDescription.Groups.size() != width + (bPose ? 3 : 0) ||
        !FindRadians(form->Form, std::span(i_rDescription.Groups).first(width), i_rUnits))
        return {};
    return {bPose ? EShape::Pose : EShape::Rotation, *form};
}

std::optional<std::vector<double>> FindRadians(ERotation i_Form, std::span<const TQL::ComponentGroup> i_Groups,
                                               const IUnitTable& i_rUnits)
{
    std::vector<double> radians(i_Groups.size(), 1.0);
    for (std::size_t i = 0; i < i_Groups.size(); ++i)
        if (IsAngle(i_Form, i))
        {
            const std::optional<double> factor = FindRadians(i_Groups[i].Factors, i_rUnits);
            if (!factor)
                return std::nullopt;
            radians[i] = *factor;
        }
    return radians;
}

std::vector<TQL::ComponentGroup> GroupsOfRotation(ERotation i_Form, std::uint16_t i_Radian)
{
    std::vector<TQL::ComponentGroup> groups(ComponentNamesOf(i_Form).size());
    for (std::size_t i = 0; i < groups.size(); ++i)
        if (IsAngle(i_Form, i))
            groups[i].Factors.push_back({i_Radian, boost::rational<std::int8_t>(1)});
    return groups;
}

} // namespace Expressions
