#include "Expressions/VProgram.h"

#include "Expressions/RotationKernels.h"
#include "Expressions/VectorKernels.h"

#include <algorithm>
#include <cassert>
#include <utility>

namespace Expressions
{

namespace
{

constexpr std::size_t BlockRows = 256;

} // namespace

struct VProgram::Workspace final : IWorkspace
{
    std::vector<std::vector<float>> Registers;
    std::vector<std::vector<Eigen::Quaterniond>> Rotations;
};

/// Some rows on their way through the steps.
struct VProgram::Block
{
    std::span<const std::span<const float>> Inputs;
    std::span<float> Output;
    Workspace& rWorkspace;
    const Program& rProgram;
    std::size_t First = 0;
    std::size_t Count = 0;

    ConstRows Read(const Operand& i_rOperand) const
    {
        if (i_rOperand.Place == EPlace::Input)
        {
            const std::size_t width = rProgram.InputWidths[i_rOperand.Index];
            return {Inputs[i_rOperand.Index].data() + First * width + i_rOperand.Offset, width};
        }
        const Rows rows = Write(i_rOperand);
        return {rows.pFirst, rows.Stride};
    }

    Rows Write(const Operand& i_rOperand) const
    {
        if (i_rOperand.Place == EPlace::Output)
        {
            const std::size_t width = rProgram.Description.Groups.size();
            return {Output.data() + First * width + i_rOperand.Offset, width};
        }
        return {rWorkspace.Registers[i_rOperand.Index].data() + i_rOperand.Offset,
                rProgram.RegisterWidths[i_rOperand.Index]};
    }

    std::span<Eigen::Quaterniond> Rotations(const Operand& i_rOperand) const
    {
        return std::span(rWorkspace.Rotations[i_rOperand.Index]).first(Count);
    }

    std::span<const double> Factors(const Step& i_rStep) const
    {
        return std::span(rProgram.Factors).subspan(i_rStep.FirstFactor, i_rStep.Sources[0].Width);
    }
};

VProgram::VProgram(Program i_Program) : m_Program(std::move(i_Program)) {}

std::unique_ptr<IWorkspace> VProgram::MakeWorkspace() const
{
    auto pWorkspace = std::make_unique<Workspace>();
    for (const std::uint32_t width : m_Program.RegisterWidths)
        pWorkspace->Registers.emplace_back(width * BlockRows);
    pWorkspace->Rotations.resize(m_Program.RotationRegisters, std::vector<Eigen::Quaterniond>(BlockRows));
    return pWorkspace;
}

void VProgram::Run(std::span<const std::span<const float>> i_Inputs, std::size_t i_Rows, std::span<float> o_Output,
                   IWorkspace& io_rWorkspace) const
{
    assert(i_Inputs.size() == m_Program.InputWidths.size());
    assert(o_Output.size() == i_Rows * m_Program.Description.Groups.size());
    Block block{i_Inputs, o_Output, static_cast<Workspace&>(io_rWorkspace), m_Program};
    const std::size_t width = m_Program.Description.Groups.size();
    for (; block.First < i_Rows; block.First += BlockRows)
    {
        block.Count = std::min(BlockRows, i_Rows - block.First);
        for (const Step& rStep : m_Program.Steps)
            RunStep(rStep, block);
        if (width > 1)
            SpreadMissing({o_Output.data() + block.First * width, width}, block.Count, width);
    }
}

void VProgram::RunStep(const Step& i_rStep, const Block& i_rBlock) const
{
    if (i_rStep.Kind < EStep::LoadRotations)
        RunVectorStep(i_rStep, i_rBlock);
    else
        RunRotationStep(i_rStep, i_rBlock);
}

void VProgram::RunVectorStep(const Step& i_rStep, const Block& i_rBlock) const
{
    const Rows target = i_rBlock.Write(i_rStep.Target);
    const ConstRows first = i_rBlock.Read(i_rStep.Sources[0]);
    const std::size_t width = i_rStep.Sources[0].Width;
    const auto second = [&]
    {
        return i_rBlock.Read(i_rStep.Sources[1]);
    };
    switch (i_rStep.Kind)
    {
    case EStep::Copy:
        return CopyRows(first, i_rBlock.Count, width, target);
    case EStep::Scale:
        return ScaleRows(first, i_rBlock.Count, i_rBlock.Factors(i_rStep), target);
    case EStep::Subtract:
        return SubtractRows(first, second(), i_rBlock.Count, width, target);
    case EStep::Magnitude:
        return MagnitudeOfRows(first, i_rBlock.Count, width, target);
    case EStep::Dot:
        return DotRows(first, second(), i_rBlock.Count, width, target);
    case EStep::AngleBetween:
        return AngleBetweenRows(first, second(), i_rBlock.Count, width, target);
    default:
        assert(false);
    }
}

void VProgram::RunRotationStep(const Step& i_rStep, const Block& i_rBlock) const
{
    const auto& [rFirst, rSecond, rThird] = i_rStep.Sources;
    switch (i_rStep.Kind)
    {
    case EStep::LoadRotations:
        return LoadRotations(i_rStep.Form, i_rBlock.Read(rFirst), i_rBlock.Factors(i_rStep),
                             i_rBlock.Rotations(i_rStep.Target));
    case EStep::StoreRotations:
        return StoreRotations(i_rStep.Form, i_rBlock.Rotations(rFirst), i_rBlock.Write(i_rStep.Target));
    case EStep::StoreAngles:
        return StoreAngles(i_rBlock.Rotations(rFirst), i_rBlock.Write(i_rStep.Target));
    case EStep::LeftQuotientRotations:
        return LeftQuotientRotations(i_rBlock.Rotations(rFirst), i_rBlock.Rotations(rSecond),
                                     i_rBlock.Rotations(i_rStep.Target));
    case EStep::LeftQuotientPositions:
        return LeftQuotientPositions(i_rBlock.Read(rFirst), i_rBlock.Read(rSecond), i_rBlock.Rotations(rThird),
                                     i_rBlock.Write(i_rStep.Target));
    default:
        assert(false);
    }
}

} // namespace Expressions
