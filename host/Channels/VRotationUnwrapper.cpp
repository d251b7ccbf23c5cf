#include "Channels/VRotationUnwrapper.h"

#include "Channels/VSubTypeTable.h"

#include <algorithm>
#include <cmath>
#include <numbers>

namespace Channels
{

std::optional<RotationPart> FindRotation(const TQL::ComponentDescription& i_rDescription)
{
    if (i_rDescription.Groups.size() < 3)
        return std::nullopt;
    const auto inDegrees = [](const TQL::UnitFactor& i_rFactor)
    {
        return i_rFactor.SubTypeId == VSubTypeTable::Degree;
    };
    RotationPart part;
    part.Turn = std::ranges::any_of(i_rDescription.Groups.front().Factors, inDegrees) ? 360.0 : 2.0 * std::numbers::pi;
    if (i_rDescription.FormatName == "Pose" || i_rDescription.FormatName == "AngleAxis")
        return part;
    part.Form = ERotationForm::Euler; // with or without the order of its axes in the name
    if (i_rDescription.FormatName.starts_with("Euler"))
        return part;
    return std::nullopt;
}

VRotationUnwrapper::VRotationUnwrapper(const RotationPart& i_rPart) : m_Part(i_rPart) {}

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

bool VRotationUnwrapper::Follow(std::span<const float> i_Row)
{
    if (!std::isfinite(i_Row[0]) || !std::isfinite(i_Row[1]) || !std::isfinite(i_Row[2]))
        return false;
    m_Previous = {i_Row[0], i_Row[1], i_Row[2]};
    m_bHasPrevious = true;
    return true;
}

void VRotationUnwrapper::UnwrapRow(float* io_pRow)
{
    if (!std::isfinite(io_pRow[0]) || !std::isfinite(io_pRow[1]) || !std::isfinite(io_pRow[2]))
        return;
    Angles angles{io_pRow[0], io_pRow[1], io_pRow[2]};
    if (m_bHasPrevious)
    {
        if (m_Part.Form == ERotationForm::AngleAxis)
            UnwrapAngleAxis(angles);
        else
            UnwrapEuler(angles);
        std::ranges::transform(angles, io_pRow, [](double i_Angle) { return static_cast<float>(i_Angle); });
    }
    m_Previous = angles;
    m_bHasPrevious = true;
}

/// The same rotation is every vector along the same line whose length differs by whole turns. The one nearest to the
/// previous vector is the one nearest to its projection on that line.
void VRotationUnwrapper::UnwrapAngleAxis(Angles& io_rAngles) const
{
    constexpr double noAxis = 1e-9;
    const double angle = std::hypot(io_rAngles[0], io_rAngles[1], io_rAngles[2]);
    const double previous = std::hypot(m_Previous[0], m_Previous[1], m_Previous[2]);
    // No rotation at all, or whole turns, has no axis of its own and takes the previous one.
    const bool bNone = angle < noAxis * m_Part.Turn;
    const Angles& rAlong = bNone ? m_Previous : io_rAngles;
    const double length = bNone ? previous : angle;
    if (length < noAxis * m_Part.Turn)
        return;
    const double projection =
        (rAlong[0] * m_Previous[0] + rAlong[1] * m_Previous[1] + rAlong[2] * m_Previous[2]) / length;
    const double present = bNone ? 0.0 : angle;
    const double wanted = present + m_Part.Turn * std::round((projection - present) / m_Part.Turn);
    if (wanted == present)
        return;
    for (std::size_t i = 0; i < io_rAngles.size(); ++i)
        io_rAngles[i] = rAlong[i] * (wanted / length);
}

void VRotationUnwrapper::UnwrapEuler(Angles& io_rAngles) const
{
    for (std::size_t i = 0; i < io_rAngles.size(); ++i)
        io_rAngles[i] += m_Part.Turn * std::round((m_Previous[i] - io_rAngles[i]) / m_Part.Turn);
}

} // namespace Channels
