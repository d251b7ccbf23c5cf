#pragma once

#include "Expressions/IRowOperation.h"
#include "Expressions/Program.h"

namespace Expressions
{

/// Runs a program over rows, a block at a time, each step over the whole block, so that what stands between two steps
/// stays in the nearest memory. Immutable; any thread.
class VProgram final : public IRowOperation
{
public:
    explicit VProgram(Program i_Program);

    const TQL::ComponentDescription& GetDescription() const override { return m_Program.Description; }
    std::size_t GetMargin() const override { return 0; }
    bool IsIdentity() const override { return m_Program.bIdentity; }
    std::unique_ptr<IWorkspace> MakeWorkspace() const override;
    void Run(std::span<const std::span<const float>> i_Inputs, std::size_t i_Rows, std::span<float> o_Output,
             IWorkspace& io_rWorkspace) const override;

private:
    struct Workspace;
    struct Block;

    void RunStep(const Step& i_rStep, const Block& i_rBlock) const;
    void RunVectorStep(const Step& i_rStep, const Block& i_rBlock) const;
    void RunRotationStep(const Step& i_rStep, const Block& i_rBlock) const;

    const Program m_Program;
};

} // namespace Expressions
