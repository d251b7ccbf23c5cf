#pragma once

#include "Expressions/IRowOperation.h"
#include "Expressions/Shape.h"

#include <Eigen/Geometry>

#include <cstddef>
#include <vector>

namespace Expressions
{

/// What a derivative is made of.
struct DerivativePlan
{
    TQL::ComponentDescription Description; ///< of the output
    std::size_t InputWidth = 0;
    int Order = 1;               ///< 1 or 2
    double RowsPerUnit = 1.0;    ///< rows a second, or 1 by frame
    Shape Is;                    ///< of the input
    std::vector<double> Radians; ///< of the components of a rotation
    double Turn = 0.0;           ///< a full turn of the numbers where they are angles that jump, else 0
};

/// Differentiates rows by time or by frame. Everything starts from the steps between neighbouring rows: differences of
/// numbers, and of rotations the vector of the turn that leads from one to the next. A step from or to a missing row is
/// missing. Immutable; any thread.
class VDerivative final : public IRowOperation
{
public:
    explicit VDerivative(DerivativePlan i_Plan);

    const TQL::ComponentDescription& GetDescription() const override { return m_Plan.Description; }
    std::size_t GetMargin() const override { return 1; }
    bool IsIdentity() const override { return false; }
    std::unique_ptr<IWorkspace> MakeWorkspace() const override;
    void Run(std::span<const std::span<const float>> i_Inputs, std::size_t i_Rows, std::span<float> o_Output,
             IWorkspace& io_rWorkspace) const override;

private:
    struct Workspace;

    /// i_pRows: one row more than there are steps.
    void MakeSteps(const float* i_pRows, std::size_t i_Steps, Workspace& io_rWorkspace) const;
    void MakeTurns(const float* i_pRows, std::size_t i_Steps, Workspace& io_rWorkspace) const;
    void StepNumbers(const float* i_pRows, std::size_t i_Steps, Workspace& io_rWorkspace) const;
    void WriteRow(const double* i_pBefore, const double* i_pAfter, float* o_pRow) const;
    std::size_t GetWidth() const { return m_Plan.Description.Groups.size(); }

    const DerivativePlan m_Plan;
};

} // namespace Expressions
