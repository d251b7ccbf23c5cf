#include "Expressions/VCompiler.h"

#include <algorithm>
#include <cassert>
#include <utility>

namespace Expressions
{

namespace
{

bool UnitsEqual(const TQL::ComponentGroup& i_rA, const TQL::ComponentGroup& i_rB)
{
    return i_rA.Factors == i_rB.Factors;
}

} // namespace

VCompiler::VCompiler(std::span<const TQL::ComponentDescription> i_Inputs, const IUnitTable& i_rUnits)
    : m_Inputs(i_Inputs), m_rUnits(i_rUnits), m_Builder(i_Inputs)
{
}

std::optional<Program> VCompiler::Compile(const SyntaxTree& i_rTree)
{
    const std::optional<std::uint16_t> radian = FindUnit("radian", m_rUnits);
    if (!radian)
        return Fail("There is no unit \"radian\" to give angles in.");
    m_Radian = *radian;
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
    const Operand rows = RowsOf(rWhole);
    std::optional<Program> program = m_Builder.Finish(rows, {rWhole.Groups, rWhole.bUnitScalingOff, rWhole.Format});
    return program ? std::move(program) : Fail("The expression is too large.");
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
    if (i_rNode.Input >= m_Inputs.size())
        return Fail("There is no input " + name + "; the inputs are " +
                    (m_Inputs.empty() ? "none." : "#0 to #" + std::to_string(m_Inputs.size() - 1) + "."));
    const TQL::ComponentDescription& rInput = m_Inputs[i_rNode.Input];
    if (rInput.Groups.empty() || rInput.Groups.size() > MostComponents)
        return Fail(name + (rInput.Groups.empty() ? " has no components." : " has too many components."));
    Value value{FindShape(rInput, m_rUnits), rInput.FormatName, rInput.Groups, rInput.bUnitScalingOff, {}, {}, {}, {}};
    const Operand rows = m_Builder.Input(i_rNode.Input);
    const std::size_t rotation = value.Is.RotationWidth();
    if (rotation != 0)
        value.RotationRows = VProgramBuilder::Part(rows, 0, rotation);
    value.Rows = VProgramBuilder::Part(rows, rotation, rows.Width - rotation);
    return value;
}

VCompiler::Result VCompiler::CompileSubtract(const Node& i_rNode, Arguments io_Arguments)
{
    Value& rA = io_Arguments[0];
    Value& rB = io_Arguments[1];
    for (const Value& rValue : io_Arguments)
        if (rValue.Is.Kind == EShape::Pose)
            return Fail("A pose has no difference to another, and " + Quote(rValue.Text) + " is a pose.");
    if (rA.Width() != rB.Width())
        return Fail(Quote(rA.Text) + " and " + Quote(rB.Text) + " have no difference: " + Describe(rA) + " and " +
                    Describe(rB) + ".");
    const std::optional<Operand> b = Convert(RowsOf(rB), rB.Groups, rA.Groups);
    if (!b)
        return Fail("The units of " + Quote(i_rNode.Text) + " do not go together: " + ListUnits(rA.Groups) + " and " +
                    ListUnits(rB.Groups) + ".");
    const bool bPositions = rA.IsPosition() && rB.IsPosition();
    Value difference{{}, bPositions ? s_pPosition : "",      rA.Groups, rA.bUnitScalingOff || rB.bUnitScalingOff, {},
                     {}, m_Builder.Subtract(RowsOf(rA), *b), {}};
    return difference;
}

VCompiler::Result VCompiler::CompileComponent(const Node& i_rNode, Arguments io_Arguments)
{
    Value& rValue = io_Arguments[0];
    const std::size_t component = FindComponent(rValue, i_rNode.Name);
    if (component == rValue.Width())
        return Fail(Quote(rValue.Text) + " is " + Describe(rValue) + " and has no component " + Quote(i_rNode.Name) +
                    ".");
    Value number = Number("", {}, VProgramBuilder::Part(RowsOf(rValue), component, 1));
    number.Groups = {rValue.Groups[component]};
    number.bUnitScalingOff = rValue.bUnitScalingOff;
    return number;
}

Operand VCompiler::RowsOf(Value& io_rValue)
{
    if (io_rValue.Is.Kind == EShape::Numbers)
        return io_rValue.Rows;
    const Operand rotation = RotationRowsOf(io_rValue);
    return io_rValue.Is.Kind == EShape::Rotation ? rotation : m_Builder.Join(rotation, io_rValue.Rows);
}

Operand VCompiler::RotationRowsOf(Value& io_rValue)
{
    if (io_rValue.RotationRows.Place == EPlace::None)
        io_rValue.RotationRows = m_Builder.StoreRotations(io_rValue.Is.Form, io_rValue.Rotations);
    return io_rValue.RotationRows;
}

Operand VCompiler::RotationsOf(Value& io_rValue)
{
    if (io_rValue.Rotations.Place == EPlace::None)
    {
        const std::size_t width = io_rValue.Is.RotationWidth();
        const auto radians = FindRadians(io_rValue.Is.Form.Form,
                                         std::span<const TQL::ComponentGroup>(io_rValue.Groups).first(width), m_rUnits);
        assert(radians); // otherwise it would not have been taken for a rotation
        io_rValue.Rotations = m_Builder.LoadRotations(io_rValue.Is.Form, io_rValue.RotationRows, *radians);
    }
    return io_rValue.Rotations;
}

std::optional<Operand> VCompiler::Convert(const Operand& i_rRows, std::span<const TQL::ComponentGroup> i_Groups,
                                          std::span<const TQL::ComponentGroup> i_Wanted)
{
    std::vector<double> factors;
    for (std::size_t i = 0; i < i_Groups.size(); ++i)
    {
        const std::optional<double> factor = FindConversion(i_Groups[i].Factors, i_Wanted[i].Factors, m_rUnits);
        if (!factor)
            return std::nullopt;
        factors.push_back(*factor);
    }
    return m_Builder.Scale(i_rRows, factors);
}

std::optional<Operand> VCompiler::VectorOf(const Node& i_rNode, Value& io_rValue)
{
    if (io_rValue.Is.Kind == EShape::Pose)
        return FailNeeds(i_rNode, "a vector", io_rValue);
    const std::vector<TQL::ComponentGroup> wanted(io_rValue.Width(), io_rValue.Groups.front());
    std::optional<Operand> vector = Convert(RowsOf(io_rValue), io_rValue.Groups, wanted);
    if (vector)
        return vector;
    return Fail(Quote(i_rNode.Name) + " needs components of one unit, but those of " + Quote(io_rValue.Text) +
                " have " + ListUnits(io_rValue.Groups) + ".");
}

std::optional<Operand> VCompiler::PositionOf(const Node& i_rNode, const Value& i_rPose,
                                             const TQL::ComponentGroup& i_rWanted)
{
    const auto groups = std::span(i_rPose.Groups).last(3);
    const std::vector<TQL::ComponentGroup> wanted(3, i_rWanted);
    std::optional<Operand> position = Convert(i_rPose.Rows, groups, wanted);
    if (position)
        return position;
    return Fail(Quote(i_rNode.Name) + " needs positions whose units go together, but " + Quote(i_rPose.Text) + " has " +
                ListUnits(groups) + " instead of " + TextOfUnit(i_rWanted.Factors, m_rUnits) + ".");
}

Value VCompiler::Number(std::string_view i_Format, Unit i_Unit, const Operand& i_rRows) const
{
    Value number;
    number.Format = i_Format;
    number.Groups.push_back({true, std::move(i_Unit)});
    number.Rows = i_rRows;
    return number;
}

Unit VCompiler::Radian() const
{
    return {{m_Radian, boost::rational<std::int8_t>(1)}};
}

/// Those of a few components, each once.
std::string VCompiler::ListUnits(std::span<const TQL::ComponentGroup> i_Groups) const
{
    constexpr std::size_t most = 3;
    std::vector<std::string> texts;
    for (std::size_t i = 0; i < i_Groups.size() && texts.size() < most; ++i)
        if (i == 0 || !UnitsEqual(i_Groups[i], i_Groups[i - 1]))
            if (std::string text = TextOfUnit(i_Groups[i].Factors, m_rUnits); std::ranges::count(texts, text) == 0)
                texts.push_back(std::move(text));
    std::string list = texts.front();
    for (std::size_t i = 1; i < texts.size(); ++i)
        list += (i + 1 == texts.size() ? " and " : ", ") + texts[i];
    return list;
}

std::nullopt_t VCompiler::Fail(std::string i_Sentence)
{
    m_Error = std::move(i_Sentence);
    return std::nullopt;
}

std::nullopt_t VCompiler::FailNeeds(const Node& i_rNode, std::string_view i_What, const Value& i_rValue)
{
    return Fail(Quote(i_rNode.Name) + " needs " + std::string(i_What) + ", but " + Quote(i_rValue.Text) + " is " +
                Describe(i_rValue) + ".");
}

} // namespace Expressions
