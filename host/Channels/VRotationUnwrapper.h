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
    AngleAxis, ///< a vector along the axis, as long as the angle
    Euler      ///< three angles about axes
};

/// Where the rotation of a channel stands: components 0 to 2.
struct RotationPart
{
    ERotationForm Form = ERotationForm::AngleAxis;
    double Turn = 0.0; ///< a full turn in the unit of the components
};

/// The rotation of a channel that can be kept continuous; nothing when it has none.
std::optional<RotationPart> FindRotation(const TQL::ComponentDescription& i_rDescription);

/// Keeps a series of rotations continuous: of the vectors that are the same rotation it takes the one nearest to the
/// one before. A row with a missing angle stays as it is, and the row after it follows the last one that had all.
/// One series in one direction, one thread.
class VRotationUnwrapper
{
public:
    explicit VRotationUnwrapper(const RotationPart& i_rPart);

    /// Rows of i_Components values, changed in place. Backwards starts at the last row.
    void Forwards(std::span<float> io_Rows, std::size_t i_Components);
    void Backwards(std::span<float> io_Rows, std::size_t i_Components);

    /// Follows this row next, if no angle of it is missing; whether it does.
    bool Follow(std::span<const float> i_Row);
    bool HasPrevious() const { return m_bHasPrevious; }

private:
    using Angles = std::array<double, 3>;

    void UnwrapRow(float* io_pRow);
    void UnwrapAngleAxis(Angles& io_rAngles) const;
    void UnwrapEuler(Angles& io_rAngles) const;

    RotationPart m_Part;
    Angles m_Previous{};
    bool m_bHasPrevious = false;
};

} // namespace Channels
