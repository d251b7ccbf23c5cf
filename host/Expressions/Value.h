#pragma once

#include "Expressions/Program.h"
#include "Expressions/Shape.h"

#include <string>
#include <string_view>
#include <vector>

namespace Expressions
{

/// A part of an expression as the compiler knows it: what it is, and where it will stand when the program runs. A
/// rotation may stand in rows, as unit quaternions, or both; what is missing is made when somebody asks for it.
struct Value
{
    Shape Is;
    std::string Format;                      ///< as in a description
    std::vector<TQL::ComponentGroup> Groups; ///< of all components
    bool bUnitScalingOff = false;
    Operand RotationRows;  ///< of a rotation or a pose; nowhere while it stands as quaternions only
    Operand Rotations;     ///< the same as unit quaternions; nowhere while nobody needed them
    Operand Rows;          ///< of numbers; of a pose the position
    std::string_view Text; ///< as written

    std::size_t Width() const { return Groups.size(); }
    bool IsPosition() const { return Is.Kind == EShape::Numbers && Format == s_pPosition && Groups.size() == 3; }
};

/// For messages: "a position", "a rotation", "3 numbers".
std::string Describe(const Value& i_rValue);

/// The text of a part for messages, not too long.
std::string Quote(std::string_view i_Text);

/// Which component has that name, or that index from 0 on; the width where there is none.
std::size_t FindComponent(const Value& i_rValue, std::string_view i_Name);

} // namespace Expressions
