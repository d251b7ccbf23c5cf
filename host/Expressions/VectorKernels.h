#pragma once

#include "Expressions/Rows.h"

#include <cstddef>
#include <span>

namespace Expressions
{

/// Operations on i_Count rows of vectors of i_Width components. What comes in and what goes out lie apart.
void CopyRows(ConstRows i_Rows, std::size_t i_Count, std::size_t i_Width, Rows o_Rows);

/// A factor a component.
void ScaleRows(ConstRows i_Rows, std::size_t i_Count, std::span<const double> i_Factors, Rows o_Rows);

void SubtractRows(ConstRows i_A, ConstRows i_B, std::size_t i_Count, std::size_t i_Width, Rows o_Rows);
void MagnitudeOfRows(ConstRows i_Rows, std::size_t i_Count, std::size_t i_Width, Rows o_Rows);
void DotRows(ConstRows i_A, ConstRows i_B, std::size_t i_Count, std::size_t i_Width, Rows o_Rows);

/// 0 to pi; NaN where one has no length.
void AngleBetweenRows(ConstRows i_A, ConstRows i_B, std::size_t i_Count, std::size_t i_Width, Rows o_Rows);

/// A row with any component NaN becomes NaN throughout.
void SpreadMissing(Rows io_Rows, std::size_t i_Count, std::size_t i_Width);

} // namespace Expressions
