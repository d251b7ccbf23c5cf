#pragma once

#include "Recordings/Common/VRecording.h"
#include "Recordings/Tables/TableRows.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace Recordings
{

// What the names of a table's columns tell. Pure rules.

/// A column's name as it stands, and its unit, from a row of units or from brackets in the name.
struct ColumnHead
{
    std::string Name;
    std::string Units;
};

/// Whether a text is a unit that measured things are given in: "mm", "N.m", "deg/s", "uT".
bool IsUnit(std::string_view i_Text);

/// A unit without the brackets around it.
std::string BareUnit(std::string_view i_Text);

/// The unit at the end of a name: "Force [N]" gives "N", "time (ms)" "ms"; round brackets only around a known unit, one
/// of time too where the name is that of a time: "Time (h)".
std::string UnitInName(std::string_view i_Name);

/// Which column holds the times, and what they are.
struct TimeColumn
{
    std::size_t Column = 0;
    ETimeKind Kind = ETimeKind::None;
    double Unit = 1.0;      ///< seconds
    bool bUnitSaid = false; ///< whether the head tells the unit
};

/// The column of times by its name, or that of frame numbers where there is no such one. Only a first column may have a
/// short name such as "t" or "#".
TimeColumn FindTimeColumn(const std::vector<ColumnHead>& i_rHeads);

/// Whether a column of such a name says when or which row: a time, a number of a frame or of a part of one.
bool CountsRows(const ColumnHead& i_rHead);

/// Groups columns to channels: three neighbours NAME.X, NAME.Y, NAME.Z (or with '_', in small letters) are a marker if
/// their unit is a length, or if they have none and the name is not that of another quantity or of a quaternion;
/// NAME.RX to NAME.TZ are a pose; all others are columns. i_TimeColumn feeds nothing, nor does a
/// first column of frame numbers beside it. The channels get names that differ, components, units and subjects.
void GroupColumns(const std::vector<ColumnHead>& i_rHeads, std::size_t i_TimeColumn,
                  std::vector<TableColumn>& o_rColumns, std::vector<RecordedChannel>& o_rChannels);

} // namespace Recordings
