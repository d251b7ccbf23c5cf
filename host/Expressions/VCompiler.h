#pragma once

#include "Expressions/IUnitTable.h"
#include "Expressions/SyntaxTree.h"
#include "Expressions/Units.h"
#include "Expressions/VProgramBuilder.h"
#include "Expressions/Value.h"

#include <cstddef>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

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
    const std::string& GetError() const { return m_Error; }

private:
    /// Components that one value may have.
    static constexpr std::size_t MostComponents = 1024;

    using Arguments = std::span<Value>;
    using Result = std::optional<Value>;

    Result CompileNode(const Node& i_rNode, Arguments io_Arguments);
    Result CompileInput(const Node& i_rNode);
    Result CompileCall(const Node& i_rNode, Arguments io_Arguments);
    Result CompileSubtract(const Node& i_rNode, Arguments io_Arguments);
    Result CompileComponent(const Node& i_rNode, Arguments io_Arguments);

    Result CompilePosition(const Node& i_rNode, Arguments io_Arguments);
    Result CompileRotation(const Node& i_rNode, const RotationForm& i_rForm, Value& io_rValue);
    Result CompileAngle(const Node& i_rNode, Arguments io_Arguments);
    Result CompileMagnitude(const Node& i_rNode, Arguments io_Arguments);
    Result CompileDot(const Node& i_rNode, Arguments io_Arguments);
    Result CompileAngleBetween(const Node& i_rNode, Arguments io_Arguments);
    Result CompileLeftQuotient(const Node& i_rNode, Arguments io_Arguments);
    Result CompileJoin(const Node& i_rNode, Arguments io_Arguments);
    Result CompileUnit(const Node& i_rNode, std::uint16_t i_Unit, Value& io_rValue);

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
    Unit Radian() const;
    std::string ListUnits(std::span<const TQL::ComponentGroup> i_Groups) const;
    std::nullopt_t Fail(std::string i_Sentence);
    std::nullopt_t FailNeeds(const Node& i_rNode, std::string_view i_What, const Value& i_rValue);

    struct Function;
    static const Function* FindFunction(std::string_view i_Name);

    const std::span<const TQL::ComponentDescription> m_Inputs;
    const IUnitTable& m_rUnits;
    std::uint16_t m_Radian = 0;
    VProgramBuilder m_Builder;
    std::string m_Error;
};

} // namespace Expressions
