#include "GraphPlotSystem/Channels/ChannelOptionPickers.h"

#include "GraphPlotSystem/Channels/ChannelOptionEnums.h"

namespace GraphPlotUI
{

using Rows = std::vector<TQL::IO::VEnumListModel::Row>;

Rows RotationFormatPicker(bool i_bDeveloperMode)
{
    using namespace TQL::RotationFormats;
    Rows rows{{"Helical", RotationFormatAngleAxis, {}}};
    if (i_bDeveloperMode)
        rows.insert(rows.end(), {{"Axis and Angle", RotationFormatNormalizedAxisAndAngle, {}},
                                 {"Quaternion", RotationFormatQuaternion, {}},
                                 {"SO(3) Matrix", RotationFormatSOMatrix, {}}});
    rows.insert(rows.end(), {{"Euler XYZ", RotationFormatEulerXYZ, {}},
                             {"Euler XZY", RotationFormatEulerXZY, {}},
                             {"Euler YXZ", RotationFormatEulerYXZ, {}},
                             {"Euler YZX", RotationFormatEulerYZX, {}},
                             {"Euler ZXY", RotationFormatEulerZXY, {}},
                             {"Euler ZYX", RotationFormatEulerZYX, {}}});
    return rows;
}

Rows RotationUnitsPicker()
{
    return {{QStringLiteral("Degrees (\u00b0)"), TQL::RotationUnits::Degrees, {}},
            {"Radians (rad)", TQL::RotationUnits::Radians, {}}};
}

Rows LengthUnitsPicker()
{
    return {{"Millimeters (mm)", TQL::LengthUnits::Millimeters, {}},
            {"Centimeters (cm)", TQL::LengthUnits::Centimeters, {}},
            {"Meters (m)", TQL::LengthUnits::Meters, {}}};
}

} // namespace GraphPlotUI
