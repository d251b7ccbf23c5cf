#include "Channels/Blocks/VRotationUnwrapper.h"

#include "Channels/Common/VSubTypeTable.h"

#include <algorithm>
#include <cmath>
#include <functional>
#include <numbers>

namespace Channels
{

namespace
{

/// Of the unit of a component; nothing when it is no angle.
std::optional<double> TurnOf(const TQL::ComponentGroup& i_rGroup)
{
    if (i_rGroup.Factors.size() != 1 || i_rGroup.Factors.front().Exponent != boost::rational<std::int8_t>(1))
        return std::nullopt;
    const std::optional<double> radians = VSubTypeTable::RadiansIn(i_rGroup.Factors.front().SubTypeId);
    return radians ? std::optional(2.0 * std::numbers::pi / *radians) : std::nullopt;
}

/// A pose has its rotation first, whose form shows in how many components there are and which of them are angles.
std::optional<ERotationForm> FormOfPose(const std::vector<TQL::ComponentGroup>& i_rGroups)
{
    if (i_rGroups.size() == 6)
        return ERotationForm::AngleAxis;
    if (i_rGroups.size() == 7)
        return TurnOf(i_rGroups[3]) ? ERotationForm::AxisAndAngle : ERotationForm::Quaternion;
    return std::nullopt;
}

std::optional<ERotationForm> FormOf(const TQL::ComponentDescription& i_rDescription)
{
    const std::string& rName = i_rDescription.FormatName;
    if (rName == "Pose")
        return FormOfPose(i_rDescription.Groups);
    if (rName == "AngleAxis")
        return ERotationForm::AngleAxis;
    if (rName == "AxisAndAngle")
        return ERotationForm::AxisAndAngle;
    if (rName == "Quaternion")
        return ERotationForm::Quaternion;
    if (rName == "Angle")
        return ERotationForm::Angle;
    if (rName.starts_with("Euler")) // with or without the order of its axes behind it
        return ERotationForm::Euler;
    return std::nullopt;
}

} // namespace

std::size_t RotationPart::ComponentCount() const
{
    switch (Form)
    {
    case ERotationForm::Angle:
        return 1;
    case ERotationForm::AxisAndAngle:
    case ERotationForm::Quaternion:
        return 4;
    default:
        return 3;
    }
}

std::optional<RotationPart> FindRotation(const TQL::ComponentDescription& i_rDescription)
{
    const std::optional<ERotationForm> form = FormOf(i_rDescription);
    if (!form)
        return std::nullopt;
    RotationPart part{*form, 0.0};
    if (i_rDescription.Groups.size() < part.ComponentCount())
        return std::nullopt;
    if (*form == ERotationForm::Quaternion)
        return part;
    const std::optional<double> turn = TurnOf(i_rDescription.Groups[*form == ERotationForm::AxisAndAngle ? 3 : 0]);
    if (!turn)
        return std::nullopt;
    part.Turn = *turn;
    return part;
}

VRotationUnwrapper::VRotationUnwrapper(const RotationPart& i_rPart) : m_Part(i_rPart), m_Count(i_rPart.ComponentCount())
{
}

void VRotationUnwrapper::Forwards(std::span<float> io_Rows, std::size_t i_Components)
{
    for (std::size_t i = 0; i + i_Components <= io_Rows.size(); i += i_Components)
        UnwrapRow(io_Rows.data() + i);
}

void VRotationUnwrapper::Backwards(std::span<float> io_Rows, std::size_t i_Components)
{
    for (std::size_t rows = io_Rows.size() / i_Components; rows > 0; --rows)
        UnwrapRow(io_Rows.data() + (rows - 1) * i_Components);
}

/// False when one is missing.
bool VRotationUnwrapper::Read(const float* i_pRow, Values& o_rValues) const
{
    for (std::size_t i = 0; i < m_Count; ++i)
    {
        if (!std::isfinite(i_pRow[i]))
            return false;
        o_rValues[i] = i_pRow[i];
    }
    return true;
}

bool VRotationUnwrapper::Follow(std::span<const float> i_Row)
{
    Values values{};
    if (!Read(i_Row.data(), values))
        return false;
    m_Previous = values;
    m_bHasPrevious = true;
    return true;
}

void VRotationUnwrapper::UnwrapRow(float* io_pRow)
{
    Values values{};
    if (!Read(io_pRow, values))
        return;
    if (m_bHasPrevious)
    {
        Unwrap(values);
        for (std::size_t i = 0; i < m_Count; ++i)
            io_pRow[i] = static_cast<float>(values[i]);
    }
    m_Previous = values;
    m_bHasPrevious = true;
}

void VRotationUnwrapper::Unwrap(Values& io_rValues) const
{
    switch (m_Part.Form)
    {
    case ERotationForm::AngleAxis:
        return UnwrapAngleAxis(io_rValues);
    case ERotationForm::Euler:
    case ERotationForm::Angle:
        return UnwrapAngles(io_rValues);
    case ERotationForm::AxisAndAngle:
        return UnwrapAxisAndAngle(io_rValues);
    case ERotationForm::Quaternion:
        return UnwrapQuaternion(io_rValues);
    }
}

/// The angle, whole turns added, that is nearest to another.
double VRotationUnwrapper::NearestTurn(double i_Angle, double i_Previous) const
{
    return i_Angle + m_Part.Turn * std::round((i_Previous - i_Angle) / m_Part.Turn);
}

/// The same rotation is every vector along the same line whose length differs by whole turns. The one nearest to the
/// previous vector is the one nearest to its projection on that line.
void VRotationUnwrapper::UnwrapAngleAxis(Values& io_rValues) const
{
    constexpr double noAxis = 1e-9;
    const double angle = std::hypot(io_rValues[0], io_rValues[1], io_rValues[2]);
    const double previous = std::hypot(m_Previous[0], m_Previous[1], m_Previous[2]);
    // No rotation at all, or whole turns, has no axis of its own and takes the previous one.
    const bool bNone = angle < noAxis * m_Part.Turn;
    const Values& rAlong = bNone ? m_Previous : io_rValues;
    const double length = bNone ? previous : angle;
    if (length < noAxis * m_Part.Turn)
        return;
    const double projection =
        (rAlong[0] * m_Previous[0] + rAlong[1] * m_Previous[1] + rAlong[2] * m_Previous[2]) / length;
    const double present = bNone ? 0.0 : angle;
    const double wanted = NearestTurn(present, projection);
    if (wanted == present)
        return;
    for (std::size_t i = 0; i < 3; ++i)
        io_rValues[i] = rAlong[i] * (wanted / length);
}

void VRotationUnwrapper::UnwrapAngles(Values& io_rValues) const
{
    for (std::size_t i = 0; i < m_Count; ++i)
        io_rValues[i] = NearestTurn(io_rValues[i], m_Previous[i]);
}

/// An axis and an angle mean the same as the opposite axis and the opposite angle.
void VRotationUnwrapper::UnwrapAxisAndAngle(Values& io_rValues) const
{
    constexpr double noAngle = 1e-6;
    const double angle = NearestTurn(io_rValues[3], 0.0);
    if (std::abs(angle) < noAngle * m_Part.Turn) // whole turns are about any axis
        io_rValues = {m_Previous[0], m_Previous[1], m_Previous[2], angle};
    const double along = io_rValues[0] * m_Previous[0] + io_rValues[1] * m_Previous[1] + io_rValues[2] * m_Previous[2];
    if (along < 0.0)
        std::ranges::transform(io_rValues, io_rValues.begin(), std::negate<>());
    io_rValues[3] = NearestTurn(io_rValues[3], m_Previous[3]);
}

void VRotationUnwrapper::UnwrapQuaternion(Values& io_rValues) const
{
    double product = 0.0;
    for (std::size_t i = 0; i < io_rValues.size(); ++i)
        product += io_rValues[i] * m_Previous[i];
    if (product < 0.0)
        std::ranges::transform(io_rValues, io_rValues.begin(), std::negate<>());
}

} // namespace Channels
