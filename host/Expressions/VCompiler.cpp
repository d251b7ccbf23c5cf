#include "Expressions/VCompiler.h"

#include "Expressions/Functions.h"

#include <cassert>
#include <utility>
#include <vector>

namespace Expressions
{

VCompiler::VCompiler(std::span<const TQL::ComponentDescription> i_Inputs, const IUnitTable& i_rUnits)
    : m_Compilation(i_Inputs, i_rUnits)
{
}

std::optional<Program> VCompiler::Compile(const SyntaxTree& i_rTree)
{
    if (!m_Compilation.FindRadian())
        return std::nullopt;
    std::vector<Value> values; // parts that nothing has used yet
    for (const Node& rNode : i_rTree.Nodes)
    {
        assert(rNode.Arguments <= values.size());
        Result value = CompileNode(rNode, std::span(values).last(rNode.Arguments));
        if (!value)
            return std::nullopt;
        value->Text = rNode.Text;
        values.resize(values.size() - rNode.Arguments);
        values.push_back(std::move(*value));
    }
    assert(values.size() == 1);
    Value& rWhole = values.front();
    const Operand rows = m_Compilation.RowsOf(rWhole);
    std::optional<Program> program =
        m_Compilation.Builder().Finish(rows, {rWhole.Groups, rWhole.bUnitScalingOff, rWhole.Format});
    return program ? std::move(program) : m_Compilation.Fail("The expression is too large.");
}

VCompiler::Result VCompiler::CompileNode(const Node& i_rNode, Arguments io_Arguments)
{
    switch (i_rNode.Kind)
    {
    case ENode::Input:
        return CompileInput(i_rNode);
    case ENode::Call:
        return CompileCall(i_rNode, io_Arguments);
    case ENode::Subtract:
        return CompileSubtract(i_rNode, io_Arguments);
    case ENode::Component:
        return CompileComponent(i_rNode, io_Arguments);
    }
    return std::nullopt;
}

VCompiler::Result VCompiler::CompileInput(const Node& i_rNode)
{
    const std::string name = Quote(i_rNode.Text);
    if (i_rNode.Input >= m_Compilation.Inputs().size())
        return m_Compilation.Fail("There is no input " + name + "; the inputs are " +
                                  (m_Compilation.Inputs().empty()
                                       ? "none."
                                       : "#0 to #" + std::to_string(m_Compilation.Inputs().size() - 1) + "."));
    const TQL::ComponentDescription& rInput = m_Compilation.Inputs()[i_rNode.Input];
    if (rInput.Groups.empty() || rInput.Groups.size() > VCompilation::MostComponents)
        return m_Compilation.Fail(name + (rInput.Groups.empty() ? " has no components." : " has too many components."));
    Value value{FindShape(rInput, m_Compilation.Units()),
                rInput.FormatName,
                rInput.Groups,
                rInput.bUnitScalingOff,
                {},
                {},
                {},
                {}};
    const Operand rows = m_Compilation.Builder().Input(i_rNode.Input);
    const std::size_t rotation = value.Is.RotationWidth();
    if (rotation != 0)
        value.RotationRows = VProgramBuilder::Part(rows, 0, rotation);
    value.Rows = VProgramBuilder::Part(rows, rotation, rows.Width - rotation);
    return value;
}

VCompiler::Result VCompiler::CompileCall(const Node& i_rNode, Arguments io_Arguments)
{
    const std::string name(Quote(i_rNode.Name));
    const Function* pFunction = FindFunction(i_rNode.Name);
    const std::optional<RotationForm> form = FindRotationForm(i_rNode.Name);
    const std::optional<std::uint16_t> unit = FindUnit(i_rNode.Name, m_Compilation.Units());
    if (!pFunction && !form && !unit)
        return m_Compilation.Fail("There is no function and no unit \"" + name + "\".");
    const std::size_t wanted = pFunction ? pFunction->Arguments : 1;
    if (io_Arguments.size() != wanted)
        return m_Compilation.Fail(name + " takes " + (wanted == 1 ? "one argument" : "two arguments") + ", not " +
                                  std::to_string(io_Arguments.size()) + ".");
    if (pFunction)
        return pFunction->pCompile(m_Compilation, i_rNode, io_Arguments);
    return form ? CompileRotation(m_Compilation, i_rNode, *form, io_Arguments[0])
                : CompileUnit(m_Compilation, i_rNode, *unit, io_Arguments[0]);
}

VCompiler::Result VCompiler::CompileSubtract(const Node& i_rNode, Arguments io_Arguments)
{
    Value& rA = io_Arguments[0];
    Value& rB = io_Arguments[1];
    for (const Value& rValue : io_Arguments)
        if (rValue.Is.Kind == EShape::Pose)
            return m_Compilation.Fail("A pose has no difference to another, and " + Quote(rValue.Text) + " is a pose.");
    if (rA.Width() != rB.Width())
        return m_Compilation.Fail(Quote(rA.Text) + " and " + Quote(rB.Text) + " have no difference: " + Describe(rA) +
                                  " and " + Describe(rB) + ".");
    const std::optional<Operand> b = m_Compilation.Convert(m_Compilation.RowsOf(rB), rB.Groups, rA.Groups);
    if (!b)
        return m_Compilation.Fail("The units of " + Quote(i_rNode.Text) +
                                  " do not go together: " + m_Compilation.ListUnits(rA.Groups) + " and " +
                                  m_Compilation.ListUnits(rB.Groups) + ".");
    const bool bPositions = rA.IsPosition() && rB.IsPosition();
    Value difference{{},
                     bPositions ? s_pPosition : "",
                     rA.Groups,
                     rA.bUnitScalingOff || rB.bUnitScalingOff,
                     {},
                     {},
                     m_Compilation.Builder().Subtract(m_Compilation.RowsOf(rA), *b),
                     {}};
    return difference;
}

VCompiler::Result VCompiler::CompileComponent(const Node& i_rNode, Arguments io_Arguments)
{
    Value& rValue = io_Arguments[0];
    const std::size_t component = FindComponent(rValue, i_rNode.Name);
    if (component == rValue.Width())
        return m_Compilation.Fail(Quote(rValue.Text) + " is " + Describe(rValue) + " and has no component " +
                                  Quote(i_rNode.Name) + ".");
    Value number = m_Compilation.Number("", {}, VProgramBuilder::Part(m_Compilation.RowsOf(rValue), component, 1));
    number.Groups = {rValue.Groups[component]};
    number.bUnitScalingOff = rValue.bUnitScalingOff;
    return number;
}

} // namespace Expressions
