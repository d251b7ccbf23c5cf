#include "Expressions/VDerivative.h"

#include "Expressions/RotationKernels.h"
#include "Expressions/RotationMaths.h"

#include <algorithm>
#include <cassert>
#include <cmath>
#include <limits>
#include <utility>

namespace Expressions
{

namespace
{

constexpr std::size_t BlockRows = 256;
constexpr double Missing = std::numeric_limits<double>::quiet_NaN();

} // namespace

struct VDerivative::Workspace final : IWorkspace
{
    std::vector<double> Steps; ///< row by row, as wide as the output
    std::vector<Eigen::Quaterniond> Rotations;
};

VDerivative::VDerivative(DerivativePlan i_Plan) : m_Plan(std::move(i_Plan)) {}

std::unique_ptr<IWorkspace> VDerivative::MakeWorkspace() const
{
    auto pWorkspace = std::make_unique<Workspace>();
    pWorkspace->Steps.resize((BlockRows + 1) * GetWidth());
    pWorkspace->Rotations.resize(m_Plan.Is.Kind == EShape::Numbers ? 0 : BlockRows + 2);
    return pWorkspace;
}

void VDerivative::Run(std::span<const std::span<const float>> i_Inputs, std::size_t i_Rows, std::span<float> o_Output,
                      IWorkspace& io_rWorkspace) const
{
    const std::size_t width = GetWidth();
    assert(i_Inputs.size() == 1 && i_Inputs[0].size() == (i_Rows + 2) * m_Plan.InputWidth);
    assert(o_Output.size() == i_Rows * width);
    Workspace& rWorkspace = static_cast<Workspace&>(io_rWorkspace);
    for (std::size_t first = 0; first < i_Rows; first += BlockRows)
    {
        const std::size_t count = std::min(BlockRows, i_Rows - first);
        MakeSteps(i_Inputs[0].data() + first * m_Plan.InputWidth, count + 1, rWorkspace);
        for (std::size_t row = 0; row < count; ++row)
        {
            const double* pBefore = rWorkspace.Steps.data() + row * width;
            WriteRow(pBefore, pBefore + width, o_Output.data() + (first + row) * width);
        }
    }
}

void VDerivative::MakeSteps(const float* i_pRows, std::size_t i_Steps, Workspace& io_rWorkspace) const
{
    if (m_Plan.Is.Kind != EShape::Numbers)
        MakeTurns(i_pRows, i_Steps, io_rWorkspace);
    StepNumbers(i_pRows, i_Steps, io_rWorkspace);
    const std::size_t width = GetWidth();
    for (std::size_t step = 0; step < i_Steps; ++step)
    {
        const auto values = std::span(io_rWorkspace.Steps).subspan(step * width, width);
        if (std::ranges::any_of(values, [](double i_Value) { return std::isnan(i_Value); }))
            std::ranges::fill(values, Missing);
    }
}

void VDerivative::MakeTurns(const float* i_pRows, std::size_t i_Steps, Workspace& io_rWorkspace) const
{
    std::vector<Eigen::Quaterniond>& rRotations = io_rWorkspace.Rotations;
    LoadRotations(m_Plan.Is.Form, {i_pRows, m_Plan.InputWidth}, m_Plan.Radians,
                  std::span(rRotations).first(i_Steps + 1));
    for (std::size_t step = 0; step < i_Steps; ++step)
    {
        const Eigen::Vector3d turn = VectorOfRotation(rRotations[step + 1] * rRotations[step].conjugate());
        std::copy_n(turn.data(), 3, io_rWorkspace.Steps.data() + step * GetWidth());
    }
}

/// All components that are no rotation; they stand last, before and after.
void VDerivative::StepNumbers(const float* i_pRows, std::size_t i_Steps, Workspace& io_rWorkspace) const
{
    const std::size_t skipped = m_Plan.Is.RotationWidth();
    const std::size_t count = m_Plan.InputWidth - skipped;
    for (std::size_t step = 0; step < i_Steps; ++step)
    {
        const float* pRow = i_pRows + step * m_Plan.InputWidth + skipped;
        double* pStep = io_rWorkspace.Steps.data() + (step + 1) * GetWidth() - count;
        for (std::size_t i = 0; i < count; ++i)
        {
            const double difference = double{pRow[i + m_Plan.InputWidth]} - double{pRow[i]};
            pStep[i] = m_Plan.Turn == 0.0 ? difference : std::remainder(difference, m_Plan.Turn);
        }
    }
}

void VDerivative::WriteRow(const double* i_pBefore, const double* i_pAfter, float* o_pRow) const
{
    const bool bBefore = !std::isnan(i_pBefore[0]);
    const bool bAfter = !std::isnan(i_pAfter[0]);
    const double rate = m_Plan.RowsPerUnit;
    for (std::size_t i = 0; i < GetWidth(); ++i)
    {
        double value = Missing;
        if (bBefore && bAfter)
            value = m_Plan.Order == 1 ? 0.5 * (i_pBefore[i] + i_pAfter[i]) * rate
                                      : (i_pAfter[i] - i_pBefore[i]) * rate * rate;
        else if (m_Plan.Order == 1 && (bBefore || bAfter))
            value = (bBefore ? i_pBefore[i] : i_pAfter[i]) * rate;
        o_pRow[i] = static_cast<float>(value);
    }
}

} // namespace Expressions
