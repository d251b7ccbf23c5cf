#include "Channels/Derived/VOperationRows.h"

#include <algorithm>
#include <limits>
#include <utility>

namespace Channels
{

namespace
{

constexpr std::int64_t SliceRows = 1024; ///< computed at a time, so that the rows of the inputs stay in the cache

} // namespace

VOperationRows::VOperationRows(std::shared_ptr<const Expressions::IRowOperation> i_pOperation,
                               std::vector<std::shared_ptr<const ISampleSource>> i_Inputs, bool i_bLive)
    : m_pOperation(std::move(i_pOperation))
    , m_Inputs(std::move(i_Inputs))
    , m_Grid{m_Inputs.front()->GetGrid().Period, m_Inputs.front()->GetGrid().Offset,
             static_cast<std::uint32_t>(m_pOperation->GetDescription().Groups.size())}
    , m_Margin(static_cast<std::int64_t>(m_pOperation->GetMargin()) * m_Grid.Period)
    , m_bLive(i_bLive)
{
}

TQL::TickRange VOperationRows::GetRange() const
{
    TQL::TickRange range = m_Inputs.front()->GetRange();
    for (const auto& rpInput : std::span(m_Inputs).subspan(1))
    {
        const TQL::TickRange other = rpInput->GetRange();
        range = {std::max(range.First, other.First), std::min(range.Last, other.Last)};
    }
    if (m_bLive)
        range = {range.First + m_Margin, range.Last - m_Margin};
    return {range.First, std::max(range.First, range.Last)};
}

TQL::IResult VOperationRows::Read(const TQL::TickRange& i_rRange, std::span<float> o_Rows) const
{
    std::unique_ptr<Scratch> pScratch = TakeScratch();
    TQL::IResult result = TQL::Result::Ok;
    for (std::int64_t first = i_rRange.First; first < i_rRange.Last && result.IsSuccess();)
    {
        const std::int64_t last = std::min(first + SliceRows * m_Grid.Period, i_rRange.Last);
        const std::size_t values = static_cast<std::size_t>((last - first) / m_Grid.Period) * m_Grid.Components;
        result = Compute({first, last}, o_Rows.first(values), *pScratch);
        o_Rows = o_Rows.subspan(values);
        first = last;
    }
    GiveBack(std::move(pScratch));
    return result;
}

TQL::IResult VOperationRows::Compute(const TQL::TickRange& i_rRange, std::span<float> o_Rows,
                                     Scratch& io_rScratch) const
{
    for (std::size_t i = 0; i < m_Inputs.size(); ++i)
    {
        const TQL::IResult result =
            Gather(i, {i_rRange.First - m_Margin, i_rRange.Last + m_Margin}, io_rScratch.Rows[i]);
        if (result.IsError())
            return result;
        io_rScratch.Spans[i] = io_rScratch.Rows[i];
    }
    const auto rows = static_cast<std::size_t>((i_rRange.Last - i_rRange.First) / m_Grid.Period);
    m_pOperation->Run(io_rScratch.Spans, rows, o_Rows, *io_rScratch.pWorkspace);
    return TQL::Result::Ok;
}

/// The rows of one input, missing where it has none.
TQL::IResult VOperationRows::Gather(std::size_t i_Input, const TQL::TickRange& i_rRange,
                                    std::vector<float>& o_rRows) const
{
    const ISampleSource& rInput = *m_Inputs[i_Input];
    const std::size_t width = rInput.GetGrid().Components;
    const auto valuesIn = [&](std::int64_t i_Ticks)
    {
        return static_cast<std::size_t>(i_Ticks / m_Grid.Period) * width;
    };
    o_rRows.resize(valuesIn(i_rRange.Last - i_rRange.First));
    if (m_Margin == 0)
        return rInput.Read(i_rRange, o_rRows);
    const TQL::TickRange all = rInput.GetRange();
    const std::int64_t first = std::clamp(all.First, i_rRange.First, i_rRange.Last);
    const std::int64_t last = std::clamp(all.Last, first, i_rRange.Last);
    if (m_bLive && (first != i_rRange.First || last != i_rRange.Last))
        return TQL::Result::InvalidArgument; // forgotten meanwhile
    const std::span<float> rows(o_rRows);
    constexpr float missing = std::numeric_limits<float>::quiet_NaN();
    const std::size_t begin = valuesIn(first - i_rRange.First);
    const std::size_t end = valuesIn(last - i_rRange.First);
    std::ranges::fill(rows.first(begin), missing);
    std::ranges::fill(rows.subspan(end), missing);
    return first == last ? TQL::IResult(TQL::Result::Ok) : rInput.Read({first, last}, rows.subspan(begin, end - begin));
}

std::unique_ptr<VOperationRows::Scratch> VOperationRows::TakeScratch() const
{
    {
        const std::lock_guard lock(m_Mutex);
        if (!m_Idle.empty())
        {
            std::unique_ptr<Scratch> pScratch = std::move(m_Idle.back());
            m_Idle.pop_back();
            return pScratch;
        }
    }
    auto pScratch = std::make_unique<Scratch>();
    pScratch->pWorkspace = m_pOperation->MakeWorkspace();
    pScratch->Rows.resize(m_Inputs.size());
    pScratch->Spans.resize(m_Inputs.size());
    return pScratch;
}

void VOperationRows::GiveBack(std::unique_ptr<Scratch> i_pScratch) const
{
    const std::lock_guard lock(m_Mutex);
    m_Idle.push_back(std::move(i_pScratch));
}

} // namespace Channels
