#include "Expressions/VProgramBuilder.h"

#include <algorithm>
#include <cstdint>
#include <map>
#include <set>
#include <utility>

namespace Expressions
{

namespace
{

/// Floats and rotations a row that a program may keep between its steps: some megabytes a workspace.
constexpr std::size_t MostFloats = 4096;
constexpr std::size_t MostRotations = 256;

/// Registers in use, old number to new: from 0 on, in their order.
using Numbering = std::map<std::uint32_t, std::uint32_t>;

void NumberFromNought(Numbering& io_rNumbers)
{
    std::uint32_t next = 0;
    for (auto& [rOld, rNew] : io_rNumbers)
        rNew = next++;
}

} // namespace

VProgramBuilder::VProgramBuilder(std::span<const TQL::ComponentDescription> i_Inputs) : m_Inputs(i_Inputs)
{
    for (const TQL::ComponentDescription& rInput : i_Inputs)
        m_Program.InputWidths.push_back(static_cast<std::uint32_t>(rInput.Groups.size()));
}

Operand VProgramBuilder::Input(std::size_t i_Index) const
{
    return {EPlace::Input, static_cast<std::uint32_t>(i_Index), 0, m_Program.InputWidths[i_Index]};
}

Operand VProgramBuilder::Part(const Operand& i_rWhole, std::size_t i_Offset, std::size_t i_Width)
{
    Operand part = i_rWhole;
    part.Offset += static_cast<std::uint32_t>(i_Offset);
    part.Width = static_cast<std::uint32_t>(i_Width);
    return part;
}

Operand VProgramBuilder::Scale(const Operand& i_rRows, std::span<const double> i_Factors)
{
    if (std::ranges::all_of(i_Factors, [](double i_Factor) { return i_Factor == 1.0; }))
        return i_rRows;
    return Add({EStep::Scale, {i_rRows}, NewRows(i_rRows.Width), {}, AddFactors(i_Factors)});
}

Operand VProgramBuilder::Join(const Operand& i_rA, const Operand& i_rB)
{
    if (i_rA.Place == i_rB.Place && i_rA.Index == i_rB.Index && i_rA.Offset + i_rA.Width == i_rB.Offset)
        return Part(i_rA, 0, i_rA.Width + i_rB.Width);
    const Operand joined = NewRows(i_rA.Width + i_rB.Width);
    Add({EStep::Copy, {i_rA}, Part(joined, 0, i_rA.Width), {}, 0});
    Add({EStep::Copy, {i_rB}, Part(joined, i_rA.Width, i_rB.Width), {}, 0});
    return joined;
}

Operand VProgramBuilder::Subtract(const Operand& i_rA, const Operand& i_rB)
{
    return Add({EStep::Subtract, {i_rA, i_rB}, NewRows(i_rA.Width), {}, 0});
}

Operand VProgramBuilder::Reduce(EStep i_Kind, const Operand& i_rA, const Operand& i_rB)
{
    return Add({i_Kind, {i_rA, i_rB}, NewRows(1), {}, 0});
}

Operand VProgramBuilder::LoadRotations(const RotationForm& i_rForm, const Operand& i_rRows,
                                       std::span<const double> i_Radians)
{
    return Add({EStep::LoadRotations, {i_rRows}, NewRotations(), i_rForm, AddFactors(i_Radians)});
}

Operand VProgramBuilder::StoreRotations(const RotationForm& i_rForm, const Operand& i_rRotations)
{
    return Add({EStep::StoreRotations, {i_rRotations}, NewRows(ComponentNamesOf(i_rForm.Form).size()), i_rForm, 0});
}

Operand VProgramBuilder::StoreAngles(const Operand& i_rRotations)
{
    return Add({EStep::StoreAngles, {i_rRotations}, NewRows(1), {}, 0});
}

Operand VProgramBuilder::LeftQuotientRotations(const Operand& i_rA, const Operand& i_rB)
{
    return Add({EStep::LeftQuotientRotations, {i_rA, i_rB}, NewRotations(), {}, 0});
}

Operand VProgramBuilder::LeftQuotientPositions(const Operand& i_rA, const Operand& i_rB, const Operand& i_rRotationB)
{
    return Add({EStep::LeftQuotientPositions, {i_rA, i_rB, i_rRotationB}, NewRows(3), {}, 0});
}

Operand VProgramBuilder::NewRows(std::size_t i_Width)
{
    const auto width = static_cast<std::uint32_t>(i_Width);
    m_Program.RegisterWidths.push_back(width);
    return {EPlace::Register, static_cast<std::uint32_t>(m_Program.RegisterWidths.size() - 1), 0, width};
}

Operand VProgramBuilder::NewRotations()
{
    return {EPlace::Rotations, m_Program.RotationRegisters++, 0, 0};
}

Operand VProgramBuilder::Add(Step i_Step)
{
    m_Program.Steps.push_back(i_Step);
    return i_Step.Target;
}

std::uint32_t VProgramBuilder::AddFactors(std::span<const double> i_Factors)
{
    const std::size_t first = m_Program.Factors.size();
    m_Program.Factors.insert(m_Program.Factors.end(), i_Factors.begin(), i_Factors.end());
    return static_cast<std::uint32_t>(first);
}

std::optional<Program> VProgramBuilder::Finish(const Operand& i_rResult, TQL::ComponentDescription i_Description)
{
    m_Program.bIdentity =
        i_rResult == Operand{EPlace::Input, 0, 0, i_rResult.Width} && i_Description == m_Inputs.front();
    m_Program.Description = std::move(i_Description);
    LeadToOutput(i_rResult);
    DropUnneeded();
    NumberRegistersAnew();
    std::size_t floats = 0;
    for (const std::uint32_t width : m_Program.RegisterWidths)
        floats += width;
    if (floats > MostFloats || m_Program.RotationRegisters > MostRotations)
        return std::nullopt;
    return std::move(m_Program);
}

/// A register that is the result as it stands is the output itself; anything else is copied there.
void VProgramBuilder::LeadToOutput(const Operand& i_rResult)
{
    if (i_rResult.Place != EPlace::Register || i_rResult.Width != m_Program.RegisterWidths[i_rResult.Index])
    {
        Add({EStep::Copy, {i_rResult}, {EPlace::Output, 0, 0, i_rResult.Width}, {}, 0});
        return;
    }
    const auto lead = [&](Operand& io_rOperand)
    {
        if (io_rOperand.Place == EPlace::Register && io_rOperand.Index == i_rResult.Index)
        {
            io_rOperand.Place = EPlace::Output;
            io_rOperand.Index = 0;
        }
    };
    for (Step& rStep : m_Program.Steps)
    {
        std::ranges::for_each(rStep.Sources, lead);
        lead(rStep.Target);
    }
}

void VProgramBuilder::DropUnneeded()
{
    std::set<std::pair<EPlace, std::uint32_t>> needed{{EPlace::Output, 0}};
    std::vector<Step> kept;
    for (auto step = m_Program.Steps.rbegin(); step != m_Program.Steps.rend(); ++step)
    {
        if (!needed.contains({step->Target.Place, step->Target.Index}))
            continue;
        for (const Operand& rSource : step->Sources)
            needed.emplace(rSource.Place, rSource.Index);
        kept.push_back(*step);
    }
    std::ranges::reverse(kept);
    m_Program.Steps = std::move(kept);
}

void VProgramBuilder::NumberRegistersAnew()
{
    Numbering registers;
    Numbering rotations;
    for (const Step& rStep : m_Program.Steps)
    {
        if (rStep.Target.Place == EPlace::Register)
            registers[rStep.Target.Index] = 0;
        else if (rStep.Target.Place == EPlace::Rotations)
            rotations[rStep.Target.Index] = 0;
    }
    NumberFromNought(registers);
    NumberFromNought(rotations);
    const auto number = [&](Operand& io_rOperand)
    {
        if (io_rOperand.Place == EPlace::Register)
            io_rOperand.Index = registers.at(io_rOperand.Index);
        else if (io_rOperand.Place == EPlace::Rotations)
            io_rOperand.Index = rotations.at(io_rOperand.Index);
    };
    for (Step& rStep : m_Program.Steps)
    {
        std::ranges::for_each(rStep.Sources, number);
        number(rStep.Target);
    }
    std::vector<std::uint32_t> widths;
    for (const auto& [rOld, rNew] : registers)
        widths.push_back(m_Program.RegisterWidths[rOld]);
    m_Program.RegisterWidths = std::move(widths);
    m_Program.RotationRegisters = static_cast<std::uint32_t>(rotations.size());
}

} // namespace Expressions
