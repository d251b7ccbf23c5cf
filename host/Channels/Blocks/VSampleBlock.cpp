#include "Channels/Blocks/VSampleBlock.h"

#include "Channels/Blocks/VCacheFeed.h"

#include <algorithm>
#include <limits>
#include <utility>

namespace Channels
{

namespace
{

constexpr std::uint32_t FloatSamples = 1; ///< the one format of samples in this host
constexpr std::int64_t NoTick = std::numeric_limits<std::int64_t>::min();
constexpr std::uint32_t LooksEnough = 4; ///< a reader may look twice before it reads

} // namespace

VSampleBlock::VSampleBlock(std::shared_ptr<VSampleStore> i_pSamples, std::uint32_t i_Levels,
                           std::shared_ptr<const BlockWindow> i_pWindow, std::shared_ptr<VCacheFeed> i_pFeed,
                           EFollow i_Follow)
    : m_pSamples(std::move(i_pSamples))
    , m_pStore(m_pSamples)
    , m_pWindow(std::move(i_pWindow))
    , m_pFeed(std::move(i_pFeed))
    , m_Follow(i_Follow)
    , m_ReportedFirst(NoTick)
{
    m_Shape.FormatTag = FloatSamples;
    m_Shape.SamplePeriod = m_pSamples->Period();
    m_Shape.GridOffset = m_pSamples->GridOffset();
    m_Shape.pLayout = std::make_shared<const ChannelSystem::ChannelLayout>(
        ChannelSystem::ChannelLayout{FloatSamples, m_pSamples->Components()});
    constexpr std::int64_t longest = std::numeric_limits<std::int64_t>::max() / 4;
    for (std::uint32_t k = 0; k < i_Levels && m_Shape.SamplePeriod <= longest >> (k + 1); ++k)
        m_Shape.SummaryPeriods.push_back(m_Shape.SamplePeriod << (k + 1));
}

std::shared_ptr<VCacheFeed> VSampleBlock::GetContinuous(const RotationPart& i_rRotation)
{
    const std::lock_guard lock(m_Mutex);
    std::shared_ptr<VCacheFeed> pFeed = m_pContinuous.lock();
    if (!pFeed)
        pFeed = std::make_shared<VCacheFeed>(SourceOf(shared_from_this()), i_rRotation, nullptr);
    m_pContinuous = pFeed;
    return pFeed;
}

void VSampleBlock::Follow() const
{
    if (m_pFeed && m_Follow == EFollow::Everything)
        m_pFeed->CatchUp();
    else if (m_pFeed)
        m_pFeed->CatchUpByStep();
}

void VSampleBlock::GetRange(TQL::TickRange& o_rRange) const
{
    Follow();
    m_LooksSinceRead.fetch_add(1, std::memory_order_relaxed);
    o_rRange = m_pSamples->GetRange();
    if (!m_pWindow)
        return;
    const std::int64_t window = m_pWindow->Ticks.load(std::memory_order_relaxed);
    if (window > 0 && window < o_rRange.Last - o_rRange.First)
        o_rRange.First = TQL::AlignDown(o_rRange.Last - window, m_Shape.SamplePeriod, m_Shape.GridOffset);
    m_ReportedFirst.store(o_rRange.First, std::memory_order_relaxed);
}

void VSampleBlock::NoteRead() const
{
    m_bWasRead.store(true, std::memory_order_relaxed);
    m_LooksSinceRead.store(0, std::memory_order_relaxed);
}

bool VSampleBlock::IsReadEnough() const
{
    const TQL::TickRange range = m_pSamples->GetRange();
    return m_LooksSinceRead.load(std::memory_order_relaxed) >= LooksEnough &&
           (m_bWasRead.load(std::memory_order_relaxed) || range.First >= range.Last);
}

/// What lies before is not to be read.
std::int64_t VSampleBlock::Floor() const
{
    if (!m_pWindow)
        return NoTick;
    const std::int64_t reported = m_ReportedFirst.load(std::memory_order_relaxed);
    if (reported != NoTick)
        return reported;
    TQL::TickRange range;
    GetRange(range);
    return range.First;
}

TQL::IResult VSampleBlock::ReadSamples(const TQL::TickRange& i_rRange, std::span<float> o_Samples, std::uint32_t) const
{
    NoteRead();
    return i_rRange.First < Floor() ? TQL::Result::InvalidArgument : m_pSamples->ReadSamples(i_rRange, o_Samples);
}

std::size_t VSampleBlock::ReadSummary(const TQL::TickRange& i_rRange, std::uint32_t i_Level,
                                      std::span<LodRecord> o_Records, std::uint32_t) const
{
    NoteRead();
    if (i_Level >= m_Shape.SummaryPeriods.size())
        return 0;
    return m_pSamples->ReadSummary(i_rRange, i_Level, o_Records, Floor());
}

TQL::IResult VSampleBlock::ReadComponent(const TQL::TickRange& i_rRange, std::span<float> o_Samples,
                                         std::uint32_t i_Component, std::uint32_t) const
{
    NoteRead();
    if (i_rRange.First < Floor())
        return TQL::Result::InvalidArgument;
    return m_pSamples->ReadComponent(i_rRange, o_Samples, i_Component);
}

TQL::IResult VSampleBlock::Summarise(const TQL::TickRange& i_rRange, std::span<LodRecord> o_Records) const
{
    NoteRead();
    return m_pSamples->Summarise(i_rRange, o_Records, Floor());
}

} // namespace Channels
