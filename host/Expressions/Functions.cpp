#include "Expressions/Functions.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <utility>
#include <vector>

namespace Expressions
{

namespace
{

using Arguments = std::span<Value>;

std::optional<Value> CompilePosition(VCompilation& io_rCompilation, const Node& i_rNode, Arguments io_Arguments)
{
    Value& rValue = io_Arguments[0];
    if (rValue.IsPosition())
        return std::move(rValue);
    if (rValue.Is.Kind != EShape::Pose)
        return io_rCompilation.FailNeeds(i_rNode, "a position or a pose", rValue);
    return Value{
        {},          s_pPosition, {rValue.Groups.end() - 3, rValue.Groups.end()}, rValue.bUnitScalingOff, {}, {},
        rValue.Rows, {}};
}

std::optional<Value> CompileAngle(VCompilation& io_rCompilation, const Node& i_rNode, Arguments io_Arguments)
{
    if (io_Arguments[0].Is.Kind == EShape::Numbers)
        return io_rCompilation.FailNeeds(i_rNode, "a rotation", io_Arguments[0]);
    return io_rCompilation.Number(s_pAngle, io_rCompilation.Radian(),
                                  io_rCompilation.Builder().StoreAngles(io_rCompilation.RotationsOf(io_Arguments[0])));
}

std::optional<Value> CompileMagnitude(VCompilation& io_rCompilation, const Node& i_rNode, Arguments io_Arguments)
{
    const std::optional<Operand> vector = io_rCompilation.VectorOf(i_rNode, io_Arguments[0]);
    if (!vector)
        return std::nullopt;
    Value magnitude = io_rCompilation.Number("", io_Arguments[0].Groups.front().Factors,
                                             io_rCompilation.Builder().Reduce(EStep::Magnitude, *vector));
    magnitude.bUnitScalingOff = io_Arguments[0].bUnitScalingOff;
    return magnitude;
}

std::optional<Value> CompileDot(VCompilation& io_rCompilation, const Node& i_rNode, Arguments io_Arguments)
{
    const Value& rA = io_Arguments[0];
    const Value& rB = io_Arguments[1];
    const std::optional<Operand> a = io_rCompilation.VectorOf(i_rNode, io_Arguments[0]);
    std::optional<Operand> b = a ? io_rCompilation.VectorOf(i_rNode, io_Arguments[1]) : std::nullopt;
    if (!a || !b)
        return std::nullopt;
    if (a->Width != b->Width)
        return io_rCompilation.Fail("dot needs vectors of one size, but has " + Describe(rA) + " and " + Describe(rB) +
                                    ".");
    Unit unit = rA.Groups.front().Factors;
    const std::vector<TQL::ComponentGroup> inOne(b->Width, rB.Groups.front());
    const std::vector<TQL::ComponentGroup> wanted(b->Width, rA.Groups.front());
    const std::optional<Operand> converted = io_rCompilation.Convert(*b, inOne, wanted);
    const Unit second = converted ? unit : rB.Groups.front().Factors;
    if (!MultiplyUnit(unit, second))
        return io_rCompilation.Fail("The unit of " + Quote(i_rNode.Text) + " has too high a power.");
    Value product = io_rCompilation.Number(
        "", std::move(unit), io_rCompilation.Builder().Reduce(EStep::Dot, *a, converted ? *converted : *b));
    product.bUnitScalingOff = rA.bUnitScalingOff || rB.bUnitScalingOff;
    return product;
}

std::optional<Value> CompileAngleBetween(VCompilation& io_rCompilation, const Node& i_rNode, Arguments io_Arguments)
{
    const std::optional<Operand> a = io_rCompilation.VectorOf(i_rNode, io_Arguments[0]);
    const std::optional<Operand> b = a ? io_rCompilation.VectorOf(i_rNode, io_Arguments[1]) : std::nullopt;
    if (!a || !b)
        return std::nullopt;
    if (a->Width != b->Width || a->Width < 2)
        return io_rCompilation.Fail("angleBetween needs two vectors of one size, but has " + Describe(io_Arguments[0]) +
                                    " and " + Describe(io_Arguments[1]) + ".");
    return io_rCompilation.Number(s_pAngle, io_rCompilation.Radian(),
                                  io_rCompilation.Builder().Reduce(EStep::AngleBetween, *a, *b));
}

std::optional<Value> CompileLeftQuotient(VCompilation& io_rCompilation, const Node& i_rNode, Arguments io_Arguments)
{
    Value& rA = io_Arguments[0];
    Value& rB = io_Arguments[1];
    for (const Value& rValue : io_Arguments)
        if (rValue.Is.Kind == EShape::Numbers || rValue.Is.Kind != rA.Is.Kind)
            return io_rCompilation.FailNeeds(i_rNode,
                                             rValue.Is.Kind == EShape::Numbers ? "two poses or two rotations"
                                             : rA.Is.Kind == EShape::Pose      ? "a second pose"
                                                                               : "a second rotation",
                                             rValue);
    const RotationForm form{ERotation::AngleAxis};
    Value quotient{{rA.Is.Kind, form},
                   NameOfForm(form),
                   GroupsOfRotation(form.Form, io_rCompilation.RadianId()),
                   rA.bUnitScalingOff || rB.bUnitScalingOff,
                   {},
                   {},
                   {},
                   {}};
    const Operand rotationB = io_rCompilation.RotationsOf(rB);
    quotient.Rotations = io_rCompilation.Builder().LeftQuotientRotations(io_rCompilation.RotationsOf(rA), rotationB);
    if (rA.Is.Kind == EShape::Rotation)
        return quotient;
    const TQL::ComponentGroup unit = rA.Groups[rA.Is.RotationWidth()];
    const std::optional<Operand> a = io_rCompilation.PositionOf(i_rNode, rA, unit);
    const std::optional<Operand> b = a ? io_rCompilation.PositionOf(i_rNode, rB, unit) : std::nullopt;
    if (!a || !b)
        return std::nullopt;
    quotient.Rows = io_rCompilation.Builder().LeftQuotientPositions(*a, *b, rotationB);
    quotient.Groups.insert(quotient.Groups.end(), 3, unit);
    quotient.Format = s_pPose;
    return quotient;
}

std::optional<Value> CompileJoin(VCompilation& io_rCompilation, const Node& i_rNode, Arguments io_Arguments)
{
    Value& rA = io_Arguments[0];
    Value& rB = io_Arguments[1];
    if (rA.Width() + rB.Width() > VCompilation::MostComponents)
        return io_rCompilation.Fail(Quote(i_rNode.Text) + " has too many components.");
    Value joined{{}, "", rA.Groups, rA.bUnitScalingOff || rB.bUnitScalingOff, {}, {}, {}, {}};
    joined.Groups.insert(joined.Groups.end(), rB.Groups.begin(), rB.Groups.end());
    // Euler angles in front of a position would read as the vector of a rotation.
    if (rA.Is.Kind != EShape::Rotation || rA.Is.Form.Form == ERotation::Euler || !rB.IsPosition())
    {
        joined.Rows = io_rCompilation.Builder().Join(io_rCompilation.RowsOf(rA), io_rCompilation.RowsOf(rB));
        return joined;
    }
    joined.Is = {EShape::Pose, rA.Is.Form};
    joined.Format = s_pPose;
    joined.RotationRows = rA.RotationRows;
    joined.Rotations = rA.Rotations;
    joined.Rows = rB.Rows;
    // By this the angle behind an axis is told from the fourth part of a quaternion.
    if (rA.Is.Form.Form == ERotation::AxisAndAngle && joined.Groups[3].Factors.empty())
        joined.Groups[3].Factors = io_rCompilation.Radian();
    return joined;
}

/// The language's functions. One more is a line here and its body above.
constexpr std::array<Function, 7> s_Functions{{
    {"Position", 1, CompilePosition},
    {"Angle", 1, CompileAngle},
    {"mag", 1, CompileMagnitude},
    {"dot", 2, CompileDot},
    {"angleBetween", 2, CompileAngleBetween},
    {"leftQuotient", 2, CompileLeftQuotient},
    {"join", 2, CompileJoin},
}};

} // namespace

const Function* FindFunction(std::string_view i_Name)
{
    const auto function = std::ranges::find(s_Functions, i_Name, &Function::Name);
    return function == s_Functions.end() ? nullptr : &*function;
}

std::optional<Value> CompileRotation(VCompilation& io_rCompilation, const Node& i_rNode, const RotationForm& i_rForm,
                                     Value& io_rValue)
{
    if (io_rValue.Is.Kind == EShape::Numbers)
        return io_rCompilation.FailNeeds(i_rNode, "a rotation", io_rValue);
    Value rotation{{EShape::Rotation, i_rForm}, NameOfForm(i_rForm), {}, io_rValue.bUnitScalingOff, {}, {}, {}, {}};
    if (io_rValue.Is.Form == i_rForm && io_rValue.RotationRows.Place != EPlace::None)
    {
        const std::size_t width = io_rValue.Is.RotationWidth();
        rotation.Groups.assign(io_rValue.Groups.begin(), io_rValue.Groups.begin() + static_cast<std::ptrdiff_t>(width));
        rotation.RotationRows = io_rValue.RotationRows;
        rotation.Rotations = io_rValue.Rotations;
        return rotation;
    }
    rotation.Groups = GroupsOfRotation(i_rForm.Form, io_rCompilation.RadianId());
    rotation.Rotations = io_rCompilation.RotationsOf(io_rValue);
    return rotation;
}

std::optional<Value> CompileUnit(VCompilation& io_rCompilation, const Node& i_rNode, std::uint16_t i_Unit,
                                 Value& io_rValue)
{
    if (io_rValue.bUnitScalingOff)
        return io_rCompilation.Fail("The units of " + Quote(io_rValue.Text) + " are not to be converted.");
    std::vector<double> factors(io_rValue.Width(), 1.0);
    bool bFound = false;
    Value converted = io_rValue;
    for (std::size_t i = 0; i < factors.size(); ++i)
        if (const std::optional<double> factor =
                ReplaceUnit(converted.Groups[i].Factors, i_Unit, io_rCompilation.Units()))
        {
            factors[i] = *factor;
            bFound = true;
        }
    if (!bFound)
        return io_rCompilation.Fail(Quote(io_rValue.Text) + " cannot be given in " + Quote(i_rNode.Name) + "; it has " +
                                    io_rCompilation.ListUnits(io_rValue.Groups) + ".");
    const std::span<const double> all(factors);
    const std::size_t rotation = io_rValue.Is.RotationWidth();
    if (std::ranges::any_of(all.first(rotation), [](double i_Factor) { return i_Factor != 1.0; }))
        converted.RotationRows =
            io_rCompilation.Builder().Scale(io_rCompilation.RotationRowsOf(io_rValue), all.first(rotation));
    converted.Rows = io_rCompilation.Builder().Scale(io_rValue.Rows, all.subspan(rotation));
    return converted;
}

} // namespace Expressions
