#pragma once

#include "Expressions/Program.h"

#include <cstddef>
#include <optional>
#include <span>

namespace Expressions
{

/// Writes a program step by step. Its operations give the operand where their result stands; those that have nothing
/// to do add no step and give what they got. Belongs to one compilation.
class VProgramBuilder
{
public:
    explicit VProgramBuilder(std::span<const TQL::ComponentDescription> i_Inputs);

    /// All components of an input.
    Operand Input(std::size_t i_Index) const;

    static Operand Part(const Operand& i_rWhole, std::size_t i_Offset, std::size_t i_Width);

    Operand Scale(const Operand& i_rRows, std::span<const double> i_Factors);
    Operand Join(const Operand& i_rA, const Operand& i_rB);
    Operand Subtract(const Operand& i_rA, const Operand& i_rB);

    /// Magnitude, Dot, AngleBetween: one number a row.
    Operand Reduce(EStep i_Kind, const Operand& i_rA, const Operand& i_rB = {});

    Operand LoadRotations(const RotationForm& i_rForm, const Operand& i_rRows, std::span<const double> i_Radians);
    Operand StoreRotations(const RotationForm& i_rForm, const Operand& i_rRotations);
    Operand StoreAngles(const Operand& i_rRotations);
    Operand LeftQuotientRotations(const Operand& i_rA, const Operand& i_rB);
    Operand LeftQuotientPositions(const Operand& i_rA, const Operand& i_rB, const Operand& i_rRotationB);

    /// The program whose output is that operand, without the steps that nothing of it needs. Nothing when it would take
    /// more room than is sensible.
    std::optional<Program> Finish(const Operand& i_rResult, TQL::ComponentDescription i_Description);

private:
    Operand NewRows(std::size_t i_Width);
    Operand NewRotations();
    Operand Add(Step i_Step);
    std::uint32_t AddFactors(std::span<const double> i_Factors);
    void LeadToOutput(const Operand& i_rResult);
    void DropUnneeded();
    void NumberRegistersAnew();

    const std::span<const TQL::ComponentDescription> m_Inputs;
    Program m_Program;
};

} // namespace Expressions
