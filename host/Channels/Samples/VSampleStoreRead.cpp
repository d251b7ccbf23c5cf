#include "Channels/Samples/VSampleStore.h"

#include <algorithm>
#include <array>

// The reading side of the store: what its readers on other threads call.
namespace Channels
{

TQL::TickRange VSampleStore::GetRange() const
{
    const std::shared_lock lock(m_TableMutex);
    return {TickOf(m_First.load(std::memory_order_acquire)), TickOf(m_End.load(std::memory_order_acquire))};
}

bool VSampleStore::IsEmpty() const
{
    return GetRange().IsEmpty();
}

/// The rows of a range that has to be on the grid and held, and a span that has to have their size.
bool VSampleStore::FindRows(const TQL::TickRange& i_rRange, std::size_t i_RowWidth, std::size_t i_SpanSize,
                            Rows& o_rRows) const
{
    if (!IsOnGrid(i_rRange.First) || !IsOnGrid(i_rRange.Last) || i_rRange.First > i_rRange.Last)
        return false;
    o_rRows = {RowAtOrAfter(i_rRange.First), RowAtOrAfter(i_rRange.Last)};
    const std::int64_t first = m_First.load(std::memory_order_acquire);
    return o_rRows.First >= first && o_rRows.End <= m_End.load(std::memory_order_acquire) &&
           i_SpanSize == static_cast<std::size_t>(o_rRows.End - o_rRows.First) * i_RowWidth;
}

TQL::IResult VSampleStore::ReadSamples(const TQL::TickRange& i_rRange, std::span<float> o_Samples) const
{
    const std::shared_lock lock(m_TableMutex);
    Rows rows{};
    if (!FindRows(i_rRange, m_Components, o_Samples.size(), rows))
        return TQL::Result::InvalidArgument;
    float* pTarget = o_Samples.data();
    m_Rows.ForEachRun(rows.First, rows.End,
                      [&](const float* i_pRows, std::int64_t, std::int64_t i_Count)
                      { pTarget = std::copy_n(i_pRows, static_cast<std::size_t>(i_Count) * m_Components, pTarget); });
    return TQL::Result::Ok;
}

TQL::IResult VSampleStore::ReadComponent(const TQL::TickRange& i_rRange, std::span<float> o_Samples,
                                         std::uint32_t i_Component) const
{
    const std::shared_lock lock(m_TableMutex);
    Rows rows{};
    if (i_Component >= m_Components || !FindRows(i_rRange, 1, o_Samples.size(), rows))
        return TQL::Result::InvalidArgument;
    float* pTarget = o_Samples.data();
    m_Rows.ForEachRun(rows.First, rows.End,
                      [&](const float* i_pRows, std::int64_t, std::int64_t i_Count)
                      {
                          for (std::int64_t i = 0; i < i_Count; ++i)
                              *pTarget++ = i_pRows[static_cast<std::size_t>(i) * m_Components + i_Component];
                      });
    return TQL::Result::Ok;
}

VSampleStore::Rows VSampleStore::HeldRows(std::int64_t i_FloorTick) const
{
    const std::int64_t first = m_First.load(std::memory_order_acquire);
    const std::int64_t end = m_End.load(std::memory_order_acquire);
    return {i_FloorTick > TickOf(first) ? std::min(RowAtOrAfter(i_FloorTick), end) : first, end};
}

/// One record a component over existing rows.
void VSampleStore::GatherRows(std::int64_t i_From, std::int64_t i_To, std::span<LodRecord> o_Records) const
{
    constexpr std::size_t batch = 8; // components at a time, so that nothing has to be allocated
    for (std::size_t c = 0; c < m_Components; c += batch)
    {
        std::array<Accumulator, batch> accumulators;
        const std::span used(accumulators.data(), std::min(batch, m_Components - c));
        if (m_pPyramid)
            m_pPyramid->Gather(m_Rows, i_From, i_To, c, used);
        else
            m_Rows.ForEachRun(i_From, i_To,
                              [&](const float* i_pRows, std::int64_t, std::int64_t i_Count)
                              { Reduce(i_pRows + c, static_cast<std::size_t>(i_Count), m_Components, used); });
        for (std::size_t i = 0; i < used.size(); ++i)
            o_Records[c + i] = used[i].Result();
    }
}

TQL::IResult VSampleStore::Summarise(const TQL::TickRange& i_rRange, std::span<LodRecord> o_Records,
                                     std::int64_t i_FloorTick) const
{
    if (o_Records.size() != m_Components || i_rRange.First > i_rRange.Last)
        return TQL::Result::InvalidArgument;
    const std::shared_lock lock(m_TableMutex);
    const Rows held = HeldRows(i_FloorTick);
    const std::int64_t from = i_rRange.First > TickOf(held.First) ? RowAtOrAfter(i_rRange.First) : held.First;
    const std::int64_t to = i_rRange.Last < TickOf(held.End) ? RowAtOrAfter(i_rRange.Last) : held.End;
    GatherRows(from, std::max(from, to), o_Records);
    return TQL::Result::Ok;
}

std::size_t VSampleStore::ReadSummary(const TQL::TickRange& i_rRange, std::uint32_t i_Level,
                                      std::span<LodRecord> o_Records, std::int64_t i_FloorTick) const
{
    const std::shared_lock lock(m_TableMutex);
    if (i_Level >= VSummaryPyramid::LevelCount || (i_Level > 0 && !m_pPyramid) || i_rRange.First >= i_rRange.Last ||
        !IsOnGrid(i_rRange.First))
        return 0;
    const Rows held = HeldRows(i_FloorTick);
    const std::uint32_t shift = i_Level + 1;
    const std::int64_t binRows = std::int64_t{1} << shift;
    const std::int64_t firstRow = RowAtOrAfter(i_rRange.First);
    const Rows bins{firstRow >> shift, (RowAtOrAfter(i_rRange.Last) + binRows - 1) >> shift};
    const Rows touched{held.First >> shift, (held.End + binRows - 1) >> shift};
    const std::size_t count = static_cast<std::size_t>(bins.End - bins.First) * m_Components;
    if ((firstRow & (binRows - 1)) != 0 || held.First >= held.End || bins.First < touched.First ||
        bins.End > touched.End || o_Records.size() < count)
        return 0;
    const Rows whole{std::max(bins.First, (held.First + binRows - 1) >> shift), std::min(bins.End, held.End >> shift)};
    for (std::int64_t bin = bins.First; bin < bins.End;)
    {
        const std::span target = o_Records.subspan(static_cast<std::size_t>(bin - bins.First) * m_Components);
        if (bin >= whole.First && bin < whole.End)
        {
            ReadWholeBins(i_Level, bin, whole.End, target.data());
            bin = whole.End;
            continue;
        }
        GatherRows(std::max(bin << shift, held.First), std::min((bin + 1) << shift, held.End),
                   target.first(m_Components));
        ++bin;
    }
    return count;
}

void VSampleStore::ReadWholeBins(std::uint32_t i_Level, std::int64_t i_First, std::int64_t i_End,
                                 LodRecord* o_pRecords) const
{
    if (i_Level >= VSummaryPyramid::FirstLevel)
        return m_pPyramid->Read(i_Level, i_First, i_End, o_pRecords);
    const std::int64_t binRows = std::int64_t{2} << i_Level;
    m_Rows.ForEachRun(binRows * i_First, binRows * i_End,
                      [&](const float* i_pRows, std::int64_t, std::int64_t i_Count)
                      {
                          const auto records = static_cast<std::size_t>(i_Count / binRows);
                          SummariseFew(i_pRows, m_Components, static_cast<std::size_t>(binRows), records, o_pRecords);
                          o_pRecords += records * m_Components;
                      });
}

} // namespace Channels
