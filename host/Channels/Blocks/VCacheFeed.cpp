#include "Channels/Blocks/VCacheFeed.h"

#include "Channels/Blocks/VSampleBlock.h"

#include <algorithm>
#include <limits>
#include <utility>

namespace Channels
{

namespace
{

constexpr std::int64_t SliceRows = 4096; ///< read from the input at a time

std::int64_t FirstTickOf(const ISampleSource& i_rSource)
{
    const TQL::TickRange range = i_rSource.GetRange();
    return range.IsEmpty() ? i_rSource.GetGrid().Offset : range.First;
}

} // namespace

VCacheFeed::VCacheFeed(std::shared_ptr<const ISampleSource> i_pInput, std::optional<RotationPart> i_Rotation,
                       std::shared_ptr<const BlockWindow> i_pWindow)
    : m_pInput(std::move(i_pInput))
    , m_Rotation(std::move(i_Rotation))
    , m_pWindow(std::move(i_pWindow))
    , m_Period(m_pInput->GetGrid().Period)
    , m_Components(m_pInput->GetGrid().Components)
    , m_pSamples(std::make_shared<VSampleStore>(m_Period, FirstTickOf(*m_pInput), m_pInput->GetGrid().Components))
{
}

void VCacheFeed::CatchUp()
{
    CatchUp(std::numeric_limits<std::int64_t>::max());
}

void VCacheFeed::CatchUpByStep()
{
    CatchUp(2 * SliceRows * m_Period);
}

void VCacheFeed::CatchUp(std::int64_t i_MostTicks)
{
    const std::lock_guard lock(m_Mutex);
    const TQL::TickRange input = m_pInput->GetRange();
    if (input.IsEmpty())
        return;
    std::int64_t wanted = input.First;
    const std::int64_t window = m_pWindow ? m_pWindow->Ticks.load(std::memory_order_relaxed) : 0;
    if (window > 0 && window < input.Last - input.First)
        wanted = TQL::AlignDown(input.Last - window, m_Period, input.First);
    TQL::TickRange held = m_pSamples->GetRange();
    if (!m_bStarted || held.Last < input.First) // nobody asked for so long that samples in between are gone
    {
        StartLocked(wanted);
        held = m_pSamples->GetRange();
    }
    if (held.Last < input.Last)
        AppendLocked({held.Last, held.Last + std::min(i_MostTicks, input.Last - held.Last)});
    if (wanted < held.First)
        PrependLocked({held.First - std::min(i_MostTicks, held.First - wanted), held.First});
    constexpr std::int64_t slack = VSampleRows::Chunks::ChunkRows;
    if (wanted - held.First > slack * m_Period)
        m_pSamples->TrimBefore(wanted);
}

void VCacheFeed::StartLocked(std::int64_t i_Tick)
{
    if (!m_bStarted)
        m_pSamples->StartAt(i_Tick);
    else
        (void)m_pSamples->ReplaceAll(i_Tick, {}); // on the grid of the input, which is that of the store
    if (m_Rotation)
        m_Unwrapper.emplace(*m_Rotation);
    m_bStarted = true;
}

/// Fills the scratch with the rows of a range. False when the input has lost them meanwhile.
bool VCacheFeed::ReadLocked(const TQL::TickRange& i_rRange)
{
    m_Scratch.resize(static_cast<std::size_t>((i_rRange.Last - i_rRange.First) / m_Period) * m_Components);
    return m_pInput->Read(i_rRange, m_Scratch).IsSuccess();
}

void VCacheFeed::AppendLocked(const TQL::TickRange& i_rRange)
{
    for (std::int64_t first = i_rRange.First; first < i_rRange.Last;)
    {
        const std::int64_t last = std::min(first + SliceRows * m_Period, i_rRange.Last);
        if (!ReadLocked({first, last}))
            return; // trimmed while we read; the next time starts behind it
        if (m_Unwrapper)
            m_Unwrapper->Forwards(m_Scratch, m_Components);
        m_pSamples->Append(m_Scratch);
        first = last;
    }
}

/// From the newest slice to the oldest, so that each touches what is held.
void VCacheFeed::PrependLocked(const TQL::TickRange& i_rRange)
{
    std::optional<VRotationUnwrapper> backwards;
    if (m_Rotation)
        backwards = BackwardsUnwrapperLocked();
    for (std::int64_t last = i_rRange.Last; last > i_rRange.First;)
    {
        const std::int64_t first = std::max(last - SliceRows * m_Period, i_rRange.First);
        if (!ReadLocked({first, last}))
            return;
        if (backwards)
            backwards->Backwards(m_Scratch, m_Components);
        m_pSamples->Prepend(m_Scratch);
        // Nothing valid was held yet: what comes next follows the newest rotation of the time before.
        for (std::size_t row = m_Scratch.size(); m_Unwrapper && !m_Unwrapper->HasPrevious() && row > 0;)
        {
            row -= m_Components;
            (void)m_Unwrapper->Follow(std::span<const float>(m_Scratch).subspan(row, m_Components));
        }
        last = first;
    }
}

/// Goes on from the oldest rotation that is held; where none is, from the one that the next to come will follow.
VRotationUnwrapper VCacheFeed::BackwardsUnwrapperLocked()
{
    VRotationUnwrapper backwards(*m_Unwrapper);
    const TQL::TickRange held = m_pSamples->GetRange();
    for (std::int64_t first = held.First; first < held.Last && backwards.HasPrevious();)
    {
        const std::int64_t last = std::min(first + SliceRows * m_Period, held.Last);
        m_Scratch.resize(static_cast<std::size_t>((last - first) / m_Period) * m_Components);
        if (m_pSamples->ReadSamples({first, last}, m_Scratch).IsError())
            break; // cannot be: nobody else forgets what is held
        for (std::size_t row = 0; row < m_Scratch.size(); row += m_Components)
            if (backwards.Follow(std::span<const float>(m_Scratch).subspan(row, m_Components)))
                return backwards;
        first = last;
    }
    return backwards;
}

} // namespace Channels
