#pragma once

#include <QtCore/QObject>

#include <cstdint>

// The enumerations behind the format and unit pickers. Their names and numbers are written to files.

namespace TQL
{
struct ISchema;
}

namespace TQL::RotationFormats
{

Q_NAMESPACE

enum ERotationFormat : std::int32_t
{
    RotationFormatAngleAxis = 0,
    RotationFormatNormalizedAxisAndAngle = 1,
    RotationFormatQuaternion = 2,
    RotationFormatSOMatrix = 3,
    RotationFormatEulerXYZ = 4,
    RotationFormatEulerXZY = 5,
    RotationFormatEulerYXZ = 6,
    RotationFormatEulerYZX = 7,
    RotationFormatEulerZXY = 8,
    RotationFormatEulerZYX = 9
};
Q_ENUM_NS(ERotationFormat)

} // namespace TQL::RotationFormats

namespace TQL::RotationUnits
{

Q_NAMESPACE

enum ERotationUnits : std::int32_t
{
    Degrees = 0,
    Radians = 1
};
Q_ENUM_NS(ERotationUnits)

} // namespace TQL::RotationUnits

namespace TQL::LengthUnits
{

Q_NAMESPACE

enum ELengthUnits : std::int32_t
{
    Millimeters = 0,
    Centimeters = 1,
    Meters = 2
};
Q_ENUM_NS(ELengthUnits)

} // namespace TQL::LengthUnits

namespace GraphPlotUI
{

/// Their schemas, interned, as they stand in files.
const TQL::ISchema& RotationFormatSchema();
const TQL::ISchema& RotationUnitsSchema();
const TQL::ISchema& LengthUnitsSchema();

} // namespace GraphPlotUI
