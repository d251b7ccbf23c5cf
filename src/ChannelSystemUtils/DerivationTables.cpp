#include "ChannelSystemUtils/DerivedRecords.h"
#include "ChannelSystemUtils/RelativeMeasurements.h"

#include <array>
#include <iterator>

namespace ChannelSystemUtils
{
namespace
{

using ChannelSystem::VDerivedChannelParameters;

constexpr std::string_view s_RelativeCategory = "Relative Measurements";
constexpr std::string_view s_MatrixNames = "xx,xy,xz,yx,yy,yz,zx,zy,zz";
constexpr std::string_view s_MatrixPoseNames = "xx,xy,xz,yx,yy,yz,zx,zy,zz,TX,TY,TZ";

/// A single number keeps neither the component names nor the category of what it was made from.
constexpr AlgebraicDerivation MakeScalar(std::string_view i_Expression, std::string_view i_TypeDisplayName)
{
    return {i_Expression, 1, i_TypeDisplayName, "", ""};
}

constexpr std::size_t s_AlgebraicFormats = 4; ///< formats of the picker that are no Euler forms

// Where in the table below what begins.
constexpr std::size_t s_PositionRow = 0;
constexpr std::size_t s_RotationRows = 1;
constexpr std::size_t s_PoseRows = s_RotationRows + s_AlgebraicFormats;

constexpr AlgebraicDerivation s_BuiltIns[] = {
    {"Position(#0)", 1, "Position", "TX,TY,TZ", std::nullopt},
    {"AngleAxis(#0)", 1, "%1% (Helical)", "RX,RY,RZ", std::nullopt},
    {"AxisAndAngle(#0)", 1, "%1% (Axis and Angle)", "X,Y,Z,A", std::nullopt},
    {"Quaternion(#0)", 1, "%1% (Quaternion)", "X,Y,Z,W", std::nullopt},
    {"SOMatrix(#0)", 1, "%1% (SO(3) Matrix)", s_MatrixNames, std::nullopt},
    {"join( AngleAxis(#0), Position(#0) )", 1, "%1% (Helical)", "RX,RY,RZ,TX,TY,TZ", std::nullopt},
    {"join( AxisAndAngle(#0), Position(#0) )", 1, "%1% (Axis and Angle)", "X,Y,Z,A,TX,TY,TZ", std::nullopt},
    {"join( Quaternion(#0), Position(#0) )", 1, "%1% (Quaternion)", "X,Y,Z,W,TX,TY,TZ", std::nullopt},
    {"join( SOMatrix(#0), Position(#0) )", 1, "%1% (SO(3) Matrix)", s_MatrixPoseNames, std::nullopt},
    MakeScalar("Angle(#0)", "%1% (Angle)"),
    MakeScalar("mag( #0 )", "%1% (Magnitude)"),
    MakeScalar("dot( #0, #0 )", "Vector Squared Magnitude (%1)"),
};

constexpr RelativeMeasurement s_RelativeMeasurements[] = {
    {"_DistanceBetween", "mag( Position(#0)- Position(#1) )", 2, "", s_RelativeCategory, "Distance Between"},
    {"_DifferenceBetween", "Position(#1)-Position(#0)", 2, "TX,TY,TZ", s_RelativeCategory, "Difference Between"},
    {"_AngleBetween", "angleBetween(Position(#1)-Position(#0),Position(#2)-Position(#1))[Angle]", 3, "",
     s_RelativeCategory, "Angle Between"},
    {"_RelativePosition", "Position(leftQuotient( #1, #0 ))", 2, "TX,TY,TZ", s_RelativeCategory, "Relative Position"},
    {"_RelativeRotation", "AngleAxis(leftQuotient( #1, #0 ))", 2, "RX,RY,RZ", s_RelativeCategory, "Relative Rotation"},
    {"_RelativePose", "leftQuotient( #1, #0 )", 2, "RX,RY,RZ,TX,TY,TZ", s_RelativeCategory, "Relative Pose"},
};

/// From format 4 on. These are the orders that are wanted, although the picker names some of them otherwise.
constexpr std::string_view s_EulerOrders[] = {"XYZ", "XZY", "YZX", "YXZ", "ZXY", "XYX"};

constexpr std::size_t s_Formats = s_AlgebraicFormats + std::size(s_EulerOrders);

using FormatRecords = std::array<VDerivedChannelParameters, s_Formats>;

VDerivedChannelParameters MakeEulerRecord(std::string_view i_Order)
{
    const std::string order(i_Order);
    const std::string expression = "Euler" + order + "(#0)";
    const std::string name = "%1% (Euler " + order + ")";
    return MakeDerivedRecord(AlgebraicDerivation{expression, 1, name, "RX,RY,RZ", std::nullopt});
}

FormatRecords MakeFormatRecords(std::size_t i_FirstBuiltIn)
{
    FormatRecords records;
    for (std::size_t format = 0; format < s_AlgebraicFormats; ++format)
        records[format] = MakeDerivedRecord(s_BuiltIns[i_FirstBuiltIn + format]);
    for (std::size_t order = 0; order < std::size(s_EulerOrders); ++order)
        records[s_AlgebraicFormats + order] = MakeEulerRecord(s_EulerOrders[order]);
    return records;
}

const VDerivedChannelParameters& RecordOfFormat(const FormatRecords& i_rRecords, std::int32_t i_Format)
{
    const bool bKnown = i_Format >= 0 && static_cast<std::size_t>(i_Format) < i_rRecords.size();
    return bKnown ? i_rRecords[static_cast<std::size_t>(i_Format)] : GetDefaultRecord();
}

} // namespace

std::span<const RelativeMeasurement> GetRelativeMeasurements()
{
    return s_RelativeMeasurements;
}

std::span<const AlgebraicDerivation> GetBuiltInDerivations()
{
    return s_BuiltIns;
}

const VDerivedChannelParameters& GetPositionRecord()
{
    static const VDerivedChannelParameters s_Record = MakeDerivedRecord(s_BuiltIns[s_PositionRow]);
    return s_Record;
}

const VDerivedChannelParameters& GetRotationRecord(std::int32_t i_RotationFormat)
{
    static const FormatRecords s_Records = MakeFormatRecords(s_RotationRows);
    return RecordOfFormat(s_Records, i_RotationFormat);
}

const VDerivedChannelParameters& GetPoseRecord(std::int32_t i_RotationFormat)
{
    static const FormatRecords s_Records = MakeFormatRecords(s_PoseRows);
    return RecordOfFormat(s_Records, i_RotationFormat);
}

} // namespace ChannelSystemUtils
