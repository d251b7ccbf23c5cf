#pragma once

#include "ChannelSystem/VDerivedChannelParameters.h"
#include "ChannelSystemUtils/RelativeMeasurements.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>

/// Records that tell the host how to derive a channel: how they are built, and the tables of those in use. Records of
/// the tables are made on first use and live as long as the process; any thread.
namespace ChannelSystemUtils
{

/// What a record of the operation "AlgebraicExpression" says. A type text that is not given is taken over from the
/// first input; an empty one is empty. "%1%" stands for the same text of the first input.
struct AlgebraicDerivation
{
    std::string_view Expression;
    std::size_t InputCount = 1;
    std::string_view TypeDisplayName;
    std::optional<std::string_view> ComponentNames; ///< separated by commas
    std::optional<std::string_view> Category;
};

/// "%1% ➞ %2%" for two inputs, the empty text for none.
std::string MakeInstanceTemplate(std::size_t i_InputCount);

/// What names the derivation: the instance and the operation parameters, each with group, name and value. The type
/// parameters are left out, for they follow from those. i_OperationGroup: the group of the operation parameters.
std::uint64_t HashDerivation(const ChannelSystem::VDerivedChannelParameters& i_rRecord,
                             std::string_view i_OperationGroup);

ChannelSystem::VDerivedChannelParameters MakeDerivedRecord(const AlgebraicDerivation& i_rDerivation);
ChannelSystem::VDerivedChannelParameters MakeDerivedRecord(const RelativeMeasurement& i_rMeasurement);

/// The record without content, with hash 0.
const ChannelSystem::VDerivedChannelParameters& GetDefaultRecord();

/// The derivations of one input that are known by expression, but for the Euler forms, of which there is one an order.
std::span<const AlgebraicDerivation> GetBuiltInDerivations();

/// The record of "Position(#0)".
const ChannelSystem::VDerivedChannelParameters& GetPositionRecord();

/// How to show a rotation, or a pose, in a format of the picker (0 to 9); the default record for any other value. The
/// numbers 6, 7 and 9 stand for the axis orders YZX, YXZ and XYX, and a pose in an Euler form has no translation.
const ChannelSystem::VDerivedChannelParameters& GetRotationRecord(std::int32_t i_RotationFormat);
const ChannelSystem::VDerivedChannelParameters& GetPoseRecord(std::int32_t i_RotationFormat);

/// Of the operation "Derivative": order 1 or 2, by frame 1 or by time 0; the default record for any other pair.
const ChannelSystem::VDerivedChannelParameters& GetDerivativeRecord(std::int32_t i_Order, std::int32_t i_ByFrame);

/// What the last step, magnitude and units, depends on.
struct Conversion
{
    bool bRotationLike = false; ///< neither a pose nor a position
    bool bAngleSeen = false;    ///< a component is an angle, or may be one
    bool bLengthSeen = false;
    bool bMagnitude = false;
    std::string_view RotationUnitName = "radian";
    std::string_view LengthUnitName = "meter";
    std::string_view LengthPrefix;
};

/// "degree(millimeter(#0))"; "#0" when there is nothing to convert.
std::string ComposeConversionExpression(const Conversion& i_rConversion);

/// The default record when there is nothing to convert.
ChannelSystem::VDerivedChannelParameters ComposeConversionRecord(const Conversion& i_rConversion);

} // namespace ChannelSystemUtils
