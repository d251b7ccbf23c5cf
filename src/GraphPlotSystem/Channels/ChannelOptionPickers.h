#pragma once

#include "IOInterfaceQt/VEnumListModel.h"

#include <vector>

namespace GraphPlotUI
{

/// The rows of the format and unit pickers: a label and the number that it stands for. Some rotation formats are listed
/// for developers only.
std::vector<TQL::IO::VEnumListModel::Row> RotationFormatPicker(bool i_bDeveloperMode);
std::vector<TQL::IO::VEnumListModel::Row> RotationUnitsPicker();
std::vector<TQL::IO::VEnumListModel::Row> LengthUnitsPicker();

} // namespace GraphPlotUI
