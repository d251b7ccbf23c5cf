#include "Expressions/CompileExpression.h"

#include "Expressions/SyntaxTree.h"
#include "Expressions/VCompiler.h"
#include "Expressions/VProgram.h"

#include <optional>
#include <utility>

namespace Expressions
{

OperationOrError CompileExpression(std::string_view i_Text, std::span<const TQL::ComponentDescription> i_Inputs,
                                   const IUnitTable& i_rUnits)
{
    SyntaxTree tree;
    OperationOrError made;
    if (!ReadSyntaxTree(i_Text, tree, made.Error))
        return made;
    VCompiler compiler(i_Inputs, i_rUnits);
    std::optional<Program> program = compiler.Compile(tree);
    if (program)
        made.pOperation = std::make_shared<const VProgram>(std::move(*program));
    else
        made.Error = compiler.GetError();
    return made;
}

} // namespace Expressions
