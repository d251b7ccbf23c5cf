#pragma once

#include "Expressions/SyntaxTree.h"
#include "Expressions/VCompilation.h"
#include "Expressions/Value.h"

#include <optional>
#include <span>
#include <string>

namespace Expressions
{

/// Goes through the parts of an expression in the order in which they are computed, checks their formats and units, and
/// writes the program. Every operation that can fail gives nothing and leaves the sentence in the error. Belongs to one
/// compilation.
class VCompiler
{
public:
    VCompiler(std::span<const TQL::ComponentDescription> i_Inputs, const IUnitTable& i_rUnits);

    std::optional<Program> Compile(const SyntaxTree& i_rTree);
    const std::string& GetError() const { return m_Compilation.GetError(); }

private:
    using Arguments = std::span<Value>;
    using Result = std::optional<Value>;

    Result CompileNode(const Node& i_rNode, Arguments io_Arguments);
    Result CompileInput(const Node& i_rNode);
    Result CompileCall(const Node& i_rNode, Arguments io_Arguments);
    Result CompileSubtract(const Node& i_rNode, Arguments io_Arguments);
    Result CompileComponent(const Node& i_rNode, Arguments io_Arguments);

    VCompilation m_Compilation;
};

} // namespace Expressions
