#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace Expressions
{

enum class ENode
{
    Input,     ///< #0
    Call,      ///< dot(a, b)
    Subtract,  ///< a - b
    Component, ///< a[TX]
};

/// A part of an expression. Its arguments are the last i_Arguments parts before it that no other part has taken.
struct Node
{
    ENode Kind = ENode::Input;
    std::string_view Name;     ///< of the function or the component, a part of the text
    std::size_t Input = 0;     ///< number of the input
    std::size_t Arguments = 0; ///< how many
    std::string_view Text;     ///< all of it, as written
};

/// An expression as it is written: its parts in the order in which they are computed, arguments before what uses them,
/// the whole last. The parts point into the text. A plain value.
struct SyntaxTree
{
    std::vector<Node> Nodes;
};

/// Longer and deeper texts than this are refused; what programs compose stays far below.
constexpr std::size_t LongestText = 10000;
constexpr std::size_t DeepestNesting = 100;

/// Reads
///     expression = term { "-" term }
///     term       = primary { "[" (name | number) "]" }
///     primary    = "#" number | name "(" expression { "," expression } ")" | "(" expression ")"
/// with blanks anywhere between the words. On failure o_rError is one sentence with the place, counted from 1.
bool ReadSyntaxTree(std::string_view i_Text, SyntaxTree& o_rTree, std::string& o_rError);

} // namespace Expressions
