#include "Channels/Samples/VSampleStore.h"

#include <algorithm>
#include <array>
#include <utility>

namespace Channels
{

VSampleStore::VSampleStore(std::int64_t i_Period, std::int64_t i_FirstTick, std::uint32_t i_Components)
    : m_Period(i_Period)
    , m_Offset(i_FirstTick - TQL::AlignDown(i_FirstTick, i_Period))
    , m_Components(i_Components)
    , m_Rows(i_Components)
    , m_First(RowAtOrAfter(i_FirstTick))
    , m_End(m_First.load())
    , m_Token(NewToken())
{
}

std::uint64_t VSampleStore::NewToken()
{
    static std::atomic<std::uint64_t> s_Last{0};
    return s_Last.fetch_add(1, std::memory_order_relaxed) + 1;
}

std::int64_t VSampleStore::RowAtOrAfter(std::int64_t i_Tick) const
{
    return TQL::FloorDivide(i_Tick - m_Offset + m_Period - 1, m_Period);
}

/// Memory for the rows [i_From, i_To) and the records that they complete, while [i_First, i_End) exist.
void VSampleStore::MakeRoom(std::int64_t i_From, std::int64_t i_To, std::int64_t i_First, std::int64_t i_End,
                            bool i_bMissing)
{
    const bool bRows =
        !m_Rows.IsShared() && (i_bMissing ? m_Rows.CoversMissing(i_From, i_To) : m_Rows.Covers(i_From, i_To));
    if (bRows && (!m_pPyramid || m_pPyramid->Covers(i_From, i_To, i_First, i_End)))
        return;
    const std::unique_lock lock(m_TableMutex);
    if (m_Rows.IsShared())
        m_Rows.TakeOver(m_First.load(), m_End.load());
    if (i_bMissing)
        m_Rows.EnsureMissing(i_From, i_To);
    else
        m_Rows.Ensure(i_From, i_To);
    if (m_pPyramid)
        m_pPyramid->Ensure(i_From, i_To, i_First, i_End);
}

template <typename TWrite>
void VSampleStore::AppendRows(std::int64_t i_Rows, bool i_bMissing, const TWrite& i_rWrite)
{
    if (i_Rows <= 0)
        return;
    const std::lock_guard lock(m_WriterMutex);
    const std::int64_t first = m_First.load(std::memory_order_relaxed);
    const std::int64_t from = m_End.load(std::memory_order_relaxed);
    const std::int64_t to = from + i_Rows;
    MakeRoom(from, to, first, to, i_bMissing);
    i_rWrite(from);
    if (m_pPyramid)
        m_pPyramid->Build(m_Rows, from, to, first, to);
    m_End.store(to, std::memory_order_release);
}

void VSampleStore::Append(std::span<const float> i_Values, std::size_t i_Stride)
{
    const std::size_t stride = i_Stride == 0 ? m_Components : i_Stride;
    const std::size_t rows = i_Values.size() < m_Components ? 0 : (i_Values.size() - m_Components) / stride + 1;
    const auto count = static_cast<std::int64_t>(rows);
    AppendRows(count, false, [&](std::int64_t i_Row) { m_Rows.Write(i_Row, count, i_Values.data(), stride); });
}

void VSampleStore::AppendMissing(std::int64_t i_Rows)
{
    AppendRows(i_Rows, true, [&](std::int64_t i_Row) { m_Rows.WriteMissing(i_Row, i_Rows); });
}

void VSampleStore::Prepend(std::span<const float> i_Values)
{
    const auto count = static_cast<std::int64_t>(i_Values.size() / m_Components);
    if (count == 0)
        return;
    const std::lock_guard lock(m_WriterMutex);
    const std::int64_t oldFirst = m_First.load(std::memory_order_relaxed);
    const std::int64_t first = oldFirst - count;
    const std::int64_t end = m_End.load(std::memory_order_relaxed);
    MakeRoom(first, oldFirst, first, end, false);
    const std::unique_lock table(m_TableMutex); // a border bin that readers gather becomes a record
    m_Rows.Write(first, count, i_Values.data(), m_Components);
    if (m_pPyramid)
        m_pPyramid->Build(m_Rows, first, oldFirst, first, end);
    m_First.store(first, std::memory_order_release);
}

void VSampleStore::TrimBefore(std::int64_t i_Tick)
{
    const std::lock_guard lock(m_WriterMutex);
    const std::int64_t first = std::min(RowAtOrAfter(i_Tick), m_End.load(std::memory_order_relaxed));
    if (first <= m_First.load(std::memory_order_relaxed))
        return;
    m_First.store(first, std::memory_order_release);
    if (!m_Rows.CanFreeBefore(first) && !(m_pPyramid && m_pPyramid->CanFreeBefore(first)))
        return;
    const std::unique_lock table(m_TableMutex);
    m_Rows.FreeBefore(first);
    if (m_pPyramid)
        m_pPyramid->FreeBefore(first);
}

void VSampleStore::StartAt(std::int64_t i_Tick)
{
    const std::lock_guard lock(m_WriterMutex);
    const std::unique_lock table(m_TableMutex);
    if (m_First.load(std::memory_order_relaxed) != m_End.load(std::memory_order_relaxed))
        return;
    const std::int64_t row = RowAtOrAfter(i_Tick);
    m_Rows.Clear();
    if (m_pPyramid)
        m_pPyramid->Clear();
    m_First.store(row, std::memory_order_release);
    m_End.store(row, std::memory_order_release);
}

/// Empties the store and gives it a new token. Under both mutexes.
void VSampleStore::Reset(std::int64_t i_FirstRow)
{
    m_Rows.Clear();
    if (m_pPyramid)
        m_pPyramid->Clear();
    m_First.store(i_FirstRow, std::memory_order_release);
    m_End.store(i_FirstRow, std::memory_order_release);
    m_Token.store(NewToken(), std::memory_order_release);
}

TQL::IResult VSampleStore::ReplaceAll(std::int64_t i_FirstTick, std::span<const float> i_Values)
{
    if (!IsOnGrid(i_FirstTick))
        return TQL::Result::InvalidArgument;
    const std::lock_guard lock(m_WriterMutex);
    const std::unique_lock table(m_TableMutex);
    const std::int64_t first = RowAtOrAfter(i_FirstTick);
    const std::int64_t end = first + static_cast<std::int64_t>(i_Values.size() / m_Components);
    Reset(first);
    m_Rows.Ensure(first, end);
    m_Rows.Write(first, end - first, i_Values.data(), m_Components);
    BuildAll(end);
    return TQL::Result::Ok;
}

TQL::IResult VSampleStore::ReplaceShared(std::int64_t i_FirstTick, std::shared_ptr<const void> i_pOwner,
                                         std::span<const float> i_Values)
{
    if (!IsOnGrid(i_FirstTick) || !i_pOwner)
        return TQL::Result::InvalidArgument;
    const std::lock_guard lock(m_WriterMutex);
    const std::unique_lock table(m_TableMutex);
    const std::int64_t first = RowAtOrAfter(i_FirstTick);
    Reset(first);
    m_Rows.Share(first, std::move(i_pOwner), i_Values);
    BuildAll(first + static_cast<std::int64_t>(i_Values.size() / m_Components));
    return TQL::Result::Ok;
}

/// Makes the rows up to i_End, which are written, visible with their records. Under both mutexes.
void VSampleStore::BuildAll(std::int64_t i_End)
{
    const std::int64_t first = m_First.load(std::memory_order_relaxed);
    if (m_pPyramid)
    {
        m_pPyramid->Ensure(first, i_End, first, i_End);
        m_pPyramid->Build(m_Rows, first, i_End, first, i_End);
    }
    m_End.store(i_End, std::memory_order_release);
}

void VSampleStore::EnableSummaries()
{
    const std::lock_guard lock(m_WriterMutex);
    if (m_pPyramid)
        return;
    // Readers go on meanwhile: nobody else knows the new pyramid, and rows that exist do not change.
    auto pPyramid = std::make_unique<VSummaryPyramid>(m_Components);
    const std::int64_t first = m_First.load(std::memory_order_relaxed);
    const std::int64_t end = m_End.load(std::memory_order_relaxed);
    pPyramid->Ensure(first, end, first, end);
    pPyramid->Build(m_Rows, first, end, first, end);
    const std::unique_lock table(m_TableMutex);
    m_pPyramid = std::move(pPyramid);
}

std::size_t VSampleStore::ByteCount() const
{
    const std::shared_lock lock(m_TableMutex);
    return m_Rows.ByteCount() + (m_pPyramid ? m_pPyramid->ByteCount() : 0);
}

std::uint64_t VSampleStore::AcquireLease(std::int64_t)
{
    return GetToken();
}

void VSampleStore::ReleaseLease(std::uint64_t)
{
    // The token only names the contents; nothing is held for the one who took it.
}

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
