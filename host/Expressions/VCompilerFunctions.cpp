#include "Expressions/VCompiler.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <utility>

namespace Expressions
{

struct VCompiler::Function
{
    std::string_view Name;
    std::size_t Arguments;
    Result (VCompiler::*pCompile)(const Node&, VCompiler::Arguments);
};

const VCompiler::Function* VCompiler::FindFunction(std::string_view i_Name)
{
    static constexpr std::array<Function, 7> functions{{
        {"Position", 1, &VCompiler::CompilePosition},
        {"Angle", 1, &VCompiler::CompileAngle},
        {"mag", 1, &VCompiler::CompileMagnitude},
        {"dot", 2, &VCompiler::CompileDot},
        {"angleBetween", 2, &VCompiler::CompileAngleBetween},
        {"leftQuotient", 2, &VCompiler::CompileLeftQuotient},
        {"join", 2, &VCompiler::CompileJoin},
    }};
    const auto function = std::ranges::find(functions, i_Name, &Function::Name);
    return function == functions.end() ? nullptr : &*function;
}

VCompiler::Result VCompiler::CompileCall(const Node& i_rNode, Arguments io_Arguments)
{
    const std::string name(Quote(i_rNode.Name));
    const Function* pFunction = FindFunction(i_rNode.Name);
    const std::optional<RotationForm> form = FindRotationForm(i_rNode.Name);
    const std::optional<std::uint16_t> unit = FindUnit(i_rNode.Name, m_rUnits);
    if (!pFunction && !form && !unit)
        return Fail("There is no function and no unit \"" + name + "\".");
    const std::size_t wanted = pFunction ? pFunction->Arguments : 1;
    if (io_Arguments.size() != wanted)
        return Fail(name + " takes " + (wanted == 1 ? "one argument" : "two arguments") + ", not " +
                    std::to_string(io_Arguments.size()) + ".");
    if (pFunction)
        return (this->*pFunction->pCompile)(i_rNode, io_Arguments);
    return form ? CompileRotation(i_rNode, *form, io_Arguments[0]) : CompileUnit(i_rNode, *unit, io_Arguments[0]);
}

VCompiler::Result VCompiler::CompilePosition(const Node& i_rNode, Arguments io_Arguments)
{
    Value& rValue = io_Arguments[0];
    if (rValue.IsPosition())
        return std::move(rValue);
    if (rValue.Is.Kind != EShape::Pose)
        return FailNeeds(i_rNode, "a position or a pose", rValue);
    return Value{
        {},          s_pPosition, {rValue.Groups.end() - 3, rValue.Groups.end()}, rValue.bUnitScalingOff, {}, {},
        rValue.Rows, {}};
}

VCompiler::Result VCompiler::CompileRotation(const Node& i_rNode, const RotationForm& i_rForm, Value& io_rValue)
{
    if (io_rValue.Is.Kind == EShape::Numbers)
        return FailNeeds(i_rNode, "a rotation", io_rValue);
    Value rotation{{EShape::Rotation, i_rForm}, NameOfForm(i_rForm), {}, io_rValue.bUnitScalingOff, {}, {}, {}, {}};
    if (io_rValue.Is.Form == i_rForm && io_rValue.RotationRows.Place != EPlace::None)
    {
        const std::size_t width = io_rValue.Is.RotationWidth();
        rotation.Groups.assign(io_rValue.Groups.begin(), io_rValue.Groups.begin() + static_cast<std::ptrdiff_t>(width));
        rotation.RotationRows = io_rValue.RotationRows;
        rotation.Rotations = io_rValue.Rotations;
        return rotation;
    }
    rotation.Groups = GroupsOfRotation(i_rForm.Form, m_Radian);
    rotation.Rotations = RotationsOf(io_rValue);
    return rotation;
}

VCompiler::Result VCompiler::CompileAngle(const Node& i_rNode, Arguments io_Arguments)
{
    if (io_Arguments[0].Is.Kind == EShape::Numbers)
        return FailNeeds(i_rNode, "a rotation", io_Arguments[0]);
    return Number(s_pAngle, Radian(), m_Builder.StoreAngles(RotationsOf(io_Arguments[0])));
}

VCompiler::Result VCompiler::CompileMagnitude(const Node& i_rNode, Arguments io_Arguments)
{
    const std::optional<Operand> vector = VectorOf(i_rNode, io_Arguments[0]);
    if (!vector)
        return std::nullopt;
    Value magnitude = Number("", io_Arguments[0].Groups.front().Factors, m_Builder.Reduce(EStep::Magnitude, *vector));
    magnitude.bUnitScalingOff = io_Arguments[0].bUnitScalingOff;
    return magnitude;
}

VCompiler::Result VCompiler::CompileDot(const Node& i_rNode, Arguments io_Arguments)
{
    const Value& rA = io_Arguments[0];
    const Value& rB = io_Arguments[1];
    const std::optional<Operand> a = VectorOf(i_rNode, io_Arguments[0]);
    std::optional<Operand> b = a ? VectorOf(i_rNode, io_Arguments[1]) : std::nullopt;
    if (!a || !b)
        return std::nullopt;
    if (a->Width != b->Width)
        return Fail("dot needs vectors of one size, but has " + Describe(rA) + " and " + Describe(rB) + ".");
    Unit unit = rA.Groups.front().Factors;
    const std::vector<TQL::ComponentGroup> inOne(b->Width, rB.Groups.front());
    const std::vector<TQL::ComponentGroup> wanted(b->Width, rA.Groups.front());
    const std::optional<Operand> converted = Convert(*b, inOne, wanted);
    const Unit second = converted ? unit : rB.Groups.front().Factors;
    if (!MultiplyUnit(unit, second))
        return Fail("The unit of " + Quote(i_rNode.Text) + " has too high a power.");
    Value product = Number("", std::move(unit), m_Builder.Reduce(EStep::Dot, *a, converted ? *converted : *b));
    product.bUnitScalingOff = rA.bUnitScalingOff || rB.bUnitScalingOff;
    return product;
}

VCompiler::Result VCompiler::CompileAngleBetween(const Node& i_rNode, Arguments io_Arguments)
{
    const std::optional<Operand> a = VectorOf(i_rNode, io_Arguments[0]);
    const std::optional<Operand> b = a ? VectorOf(i_rNode, io_Arguments[1]) : std::nullopt;
    if (!a || !b)
        return std::nullopt;
    if (a->Width != b->Width || a->Width < 2)
        return Fail("angleBetween needs two vectors of one size, but has " + Describe(io_Arguments[0]) + " and " +
                    Describe(io_Arguments[1]) + ".");
    return Number(s_pAngle, Radian(), m_Builder.Reduce(EStep::AngleBetween, *a, *b));
}

VCompiler::Result VCompiler::CompileLeftQuotient(const Node& i_rNode, Arguments io_Arguments)
{
    Value& rA = io_Arguments[0];
    Value& rB = io_Arguments[1];
    for (const Value& rValue : io_Arguments)
        if (rValue.Is.Kind == EShape::Numbers || rValue.Is.Kind != rA.Is.Kind)
            return FailNeeds(i_rNode,
                             rValue.Is.Kind == EShape::Numbers ? "two poses or two rotations"
                             : rA.Is.Kind == EShape::Pose      ? "a second pose"
                                                               : "a second rotation",
                             rValue);
    const RotationForm form{ERotation::AngleAxis};
    Value quotient{{rA.Is.Kind, form},
                   NameOfForm(form),
                   GroupsOfRotation(form.Form, m_Radian),
                   rA.bUnitScalingOff || rB.bUnitScalingOff,
                   {},
                   {},
                   {},
                   {}};
    const Operand rotationB = RotationsOf(rB);
    quotient.Rotations = m_Builder.LeftQuotientRotations(RotationsOf(rA), rotationB);
    if (rA.Is.Kind == EShape::Rotation)
        return quotient;
    const TQL::ComponentGroup unit = rA.Groups[rA.Is.RotationWidth()];
    const std::optional<Operand> a = PositionOf(i_rNode, rA, unit);
    const std::optional<Operand> b = a ? PositionOf(i_rNode, rB, unit) : std::nullopt;
    if (!a || !b)
        return std::nullopt;
    quotient.Rows = m_Builder.LeftQuotientPositions(*a, *b, rotationB);
    quotient.Groups.insert(quotient.Groups.end(), 3, unit);
    quotient.Format = s_pPose;
    return quotient;
}

VCompiler::Result VCompiler::CompileJoin(const Node& i_rNode, Arguments io_Arguments)
{
    Value& rA = io_Arguments[0];
    Value& rB = io_Arguments[1];
    if (rA.Width() + rB.Width() > MostComponents)
        return Fail(Quote(i_rNode.Text) + " has too many components.");
    Value joined{{}, "", rA.Groups, rA.bUnitScalingOff || rB.bUnitScalingOff, {}, {}, {}, {}};
    joined.Groups.insert(joined.Groups.end(), rB.Groups.begin(), rB.Groups.end());
    // Euler angles in front of a position would read as the vector of a rotation.
    if (rA.Is.Kind != EShape::Rotation || rA.Is.Form.Form == ERotation::Euler || !rB.IsPosition())
    {
        joined.Rows = m_Builder.Join(RowsOf(rA), RowsOf(rB));
        return joined;
    }
    joined.Is = {EShape::Pose, rA.Is.Form};
    joined.Format = s_pPose;
    joined.RotationRows = rA.RotationRows;
    joined.Rotations = rA.Rotations;
    joined.Rows = rB.Rows;
    // By this the angle behind an axis is told from the fourth part of a quaternion.
    if (rA.Is.Form.Form == ERotation::AxisAndAngle && joined.Groups[3].Factors.empty())
        joined.Groups[3].Factors = Radian();
    return joined;
}

VCompiler::Result VCompiler::CompileUnit(const Node& i_rNode, std::uint16_t i_Unit, Value& io_rValue)
{
    if (io_rValue.bUnitScalingOff)
        return Fail("The units of " + Quote(io_rValue.Text) + " are not to be converted.");
    std::vector<double> factors(io_rValue.Width(), 1.0);
    bool bFound = false;
    Value converted = io_rValue;
    for (std::size_t i = 0; i < factors.size(); ++i)
        if (const std::optional<double> factor = ReplaceUnit(converted.Groups[i].Factors, i_Unit, m_rUnits))
        {
            factors[i] = *factor;
            bFound = true;
        }
    if (!bFound)
        return Fail(Quote(io_rValue.Text) + " cannot be given in " + Quote(i_rNode.Name) + "; it has " +
                    ListUnits(io_rValue.Groups) + ".");
    const std::span<const double> all(factors);
    const std::size_t rotation = io_rValue.Is.RotationWidth();
    if (std::ranges::any_of(all.first(rotation), [](double i_Factor) { return i_Factor != 1.0; }))
        converted.RotationRows = m_Builder.Scale(RotationRowsOf(io_rValue), all.first(rotation));
    converted.Rows = m_Builder.Scale(io_rValue.Rows, all.subspan(rotation));
    return converted;
}

} // namespace Expressions
