#pragma once

#include "Channels/Blocks/ISampleSource.h"
#include "Expressions/IRowOperation.h"

#include <memory>
#include <mutex>
#include <span>
#include <vector>

namespace Channels
{

/// The rows that an operation gives for the rows of its inputs at the same times, computed whenever they are read and
/// kept by nobody here. They stand on the grid that all inputs share, where all of them have samples. Where inputs grow
/// and forget, a row is given only when its neighbours that the operation looks at are there too, so that it never
/// changes once it was read; of a recording every row is given, with what lies beyond its ends missing. Thread-safe.
class VOperationRows : public ISampleSource
{
public:
    /// The inputs stand on the same grid, at least one; i_bLive: some of them grow.
    VOperationRows(std::shared_ptr<const Expressions::IRowOperation> i_pOperation,
                   std::vector<std::shared_ptr<const ISampleSource>> i_Inputs, bool i_bLive);

    const SampleGrid& GetGrid() const override { return m_Grid; }
    TQL::TickRange GetRange() const override;
    TQL::IResult Read(const TQL::TickRange& i_rRange, std::span<float> o_Rows) const override;

private:
    /// What one computation needs, kept for the next one.
    struct Scratch
    {
        std::unique_ptr<Expressions::IWorkspace> pWorkspace;
        std::vector<std::vector<float>> Rows; ///< of each input
        std::vector<std::span<const float>> Spans;
    };

    std::unique_ptr<Scratch> TakeScratch() const;
    void GiveBack(std::unique_ptr<Scratch> i_pScratch) const;
    TQL::IResult Gather(std::size_t i_Input, const TQL::TickRange& i_rRange, std::vector<float>& o_rRows) const;
    TQL::IResult Compute(const TQL::TickRange& i_rRange, std::span<float> o_Rows, Scratch& io_rScratch) const;

    const std::shared_ptr<const Expressions::IRowOperation> m_pOperation;
    const std::vector<std::shared_ptr<const ISampleSource>> m_Inputs;
    const SampleGrid m_Grid;
    const std::int64_t m_Margin; ///< ticks before and after a row that it depends on
    const bool m_bLive;
    mutable std::mutex m_Mutex;
    mutable std::vector<std::unique_ptr<Scratch>> m_Idle; // guarded by m_Mutex
};

} // namespace Channels
