#include "Expressions/VCompilation.h"

#include <algorithm>
#include <cassert>
#include <utility>
#include <vector>

namespace Expressions
{

namespace
{

bool UnitsEqual(const TQL::ComponentGroup& i_rA, const TQL::ComponentGroup& i_rB)
{
    return i_rA.Factors == i_rB.Factors;
}

} // namespace

VCompilation::VCompilation(std::span<const TQL::ComponentDescription> i_Inputs, const IUnitTable& i_rUnits)
    : m_Inputs(i_Inputs), m_rUnits(i_rUnits), m_Builder(i_Inputs)
{
}

bool VCompilation::FindRadian()
{
    const std::optional<std::uint16_t> radian = FindUnit("radian", m_rUnits);
    m_Radian = radian.value_or(0);
    if (!radian)
        Fail("There is no unit \"radian\" to give angles in.");
    return radian.has_value();
}

Operand VCompilation::RowsOf(Value& io_rValue)
{
    if (io_rValue.Is.Kind == EShape::Numbers)
        return io_rValue.Rows;
    const Operand rotation = RotationRowsOf(io_rValue);
    return io_rValue.Is.Kind == EShape::Rotation ? rotation : m_Builder.Join(rotation, io_rValue.Rows);
}

Operand VCompilation::RotationRowsOf(Value& io_rValue)
{
    if (io_rValue.RotationRows.Place == EPlace::None)
        io_rValue.RotationRows = m_Builder.StoreRotations(io_rValue.Is.Form, io_rValue.Rotations);
    return io_rValue.RotationRows;
}

Operand VCompilation::RotationsOf(Value& io_rValue)
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

std::optional<Operand> VCompilation::Convert(const Operand& i_rRows, std::span<const TQL::ComponentGroup> i_Groups,
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

std::optional<Operand> VCompilation::VectorOf(const Node& i_rNode, Value& io_rValue)
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

std::optional<Operand> VCompilation::PositionOf(const Node& i_rNode, const Value& i_rPose,
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

Value VCompilation::Number(std::string_view i_Format, Unit i_Unit, const Operand& i_rRows) const
{
    Value number;
    number.Format = i_Format;
    number.Groups.push_back({true, std::move(i_Unit)});
    number.Rows = i_rRows;
    return number;
}

Unit VCompilation::Radian() const
{
    return {{m_Radian, boost::rational<std::int8_t>(1)}};
}

/// Those of a few components, each once.
std::string VCompilation::ListUnits(std::span<const TQL::ComponentGroup> i_Groups) const
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

std::nullopt_t VCompilation::Fail(std::string i_Sentence)
{
    m_Error = std::move(i_Sentence);
    return std::nullopt;
}

std::nullopt_t VCompilation::FailNeeds(const Node& i_rNode, std::string_view i_What, const Value& i_rValue)
{
    return Fail(Quote(i_rNode.Name) + " needs " + std::string(i_What) + ", but " + Quote(i_rValue.Text) + " is " +
                Describe(i_rValue) + ".");
}

} // namespace Expressions
