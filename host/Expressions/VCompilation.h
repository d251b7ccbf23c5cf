#pragma once

#include "Expressions/IUnitTable.h"
#include "Expressions/SyntaxTree.h"
#include "Expressions/Units.h"
#include "Expressions/VProgramBuilder.h"
#include "Expressions/Value.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>

namespace Expressions
{

/// What the compiler and the functions of the language share while one expression is compiled: the program so far, the
/// units, the error, and the steps that bring values into the shape and the units that a function needs. Every
/// operation that can fail gives nothing and leaves the sentence in the error.
class VCompilation
{
public:
    /// Components that one value may have.
    static constexpr std::size_t MostComponents = 1024;

    VCompilation(std::span<const TQL::ComponentDescription> i_Inputs, const IUnitTable& i_rUnits);

    /// Finds the unit that angles are given in; before anything else.
    [[nodiscard]] bool FindRadian();

    std::span<const TQL::ComponentDescription> Inputs() const { return m_Inputs; }
    const IUnitTable& Units() const { return m_rUnits; }
    std::uint16_t RadianId() const { return m_Radian; }
    Unit Radian() const;
    VProgramBuilder& Builder() { return m_Builder; }

    /// The components of a value one after another, in floats.
    Operand RowsOf(Value& io_rValue);
    Operand RotationRowsOf(Value& io_rValue);
    Operand RotationsOf(Value& io_rValue);

    /// Rows in the units of i_Wanted; nothing when they measure something else.
    std::optional<Operand> Convert(const Operand& i_rRows, std::span<const TQL::ComponentGroup> i_Groups,
                                   std::span<const TQL::ComponentGroup> i_Wanted);

    /// The components of a vector, all in the unit of the first.
    std::optional<Operand> VectorOf(const Node& i_rNode, Value& io_rValue);
    std::optional<Operand> PositionOf(const Node& i_rNode, const Value& i_rPose, const TQL::ComponentGroup& i_rWanted);

    Value Number(std::string_view i_Format, Unit i_Unit, const Operand& i_rRows) const;
    std::string ListUnits(std::span<const TQL::ComponentGroup> i_Groups) const;

    const std::string& GetError() const { return m_Error; }
    std::nullopt_t Fail(std::string i_Sentence);
    std::nullopt_t FailNeeds(const Node& i_rNode, std::string_view i_What, const Value& i_rValue);

private:
    const std::span<const TQL::ComponentDescription> m_Inputs;
    const IUnitTable& m_rUnits;
    std::uint16_t m_Radian = 0;
    VProgramBuilder m_Builder;
    std::string m_Error;
};

} // namespace Expressions
