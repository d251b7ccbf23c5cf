#pragma once

#include "ChannelSystem/ComponentDescription.h"
#include "Expressions/IUnitTable.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace Expressions
{

/// The unit of one component: a product of powers.
using Unit = std::vector<TQL::UnitFactor>;

/// What values in i_rFrom are multiplied with to be in i_rTo; nothing when the two measure different things. Units that
/// nobody told the meaning of convert into themselves only.
std::optional<double> FindConversion(const Unit& i_rFrom, const Unit& i_rTo, const IUnitTable& i_rUnits);

/// As above, to radian. A value without a unit is taken as radian.
std::optional<double> FindRadians(const Unit& i_rFrom, const IUnitTable& i_rUnits);

/// Puts i_Id in the place of every factor of its dimension, their exponents left alone, and gives what values are
/// multiplied with; nothing when there is no such factor.
std::optional<double> ReplaceUnit(Unit& io_rUnit, std::uint16_t i_Id, const IUnitTable& i_rUnits);

/// Multiplies by i_Id to the power of i_Exponent, or by a whole unit; false, with the unit spoilt, when an exponent
/// grows out of its range.
bool MultiplyUnit(Unit& io_rUnit, std::uint16_t i_Id, boost::rational<int> i_Exponent);
bool MultiplyUnit(Unit& io_rUnit, const Unit& i_rBy);

/// The id of "millimeter", "degree", "newton": a base unit with or without a prefix in front.
std::optional<std::uint16_t> FindUnit(std::string_view i_Name, const IUnitTable& i_rUnits);

/// For messages: "mm.s^-1", "no unit".
std::string TextOfUnit(const Unit& i_rUnit, const IUnitTable& i_rUnits);

} // namespace Expressions
