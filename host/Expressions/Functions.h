#pragma once

#include "Expressions/RotationForms.h"
#include "Expressions/VCompilation.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string_view>

namespace Expressions
{

/// One function of the language: its name, how many arguments it takes, and what writes its steps into the program and
/// gives its value. What does not fit gives nothing, with the sentence in the compilation.
struct Function
{
    std::string_view Name;
    std::size_t Arguments;
    std::optional<Value> (*pCompile)(VCompilation& io_rCompilation, const Node& i_rNode, std::span<Value> io_Arguments);
};

/// Null when there is none of that name.
const Function* FindFunction(std::string_view i_Name);

/// The names of rotation forms and of units are functions too, all of one argument.
std::optional<Value> CompileRotation(VCompilation& io_rCompilation, const Node& i_rNode, const RotationForm& i_rForm,
                                     Value& io_rValue);
std::optional<Value> CompileUnit(VCompilation& io_rCompilation, const Node& i_rNode, std::uint16_t i_Unit,
                                 Value& io_rValue);

} // namespace Expressions
