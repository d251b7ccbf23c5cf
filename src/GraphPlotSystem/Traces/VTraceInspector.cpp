#include "GraphPlotSystem/Traces/VTraceInspector.h"

#include "ChannelSystem/IChannelBlock.h"

#include <algorithm>

namespace GraphPlotUI
{

using TQL::TickRange;

TQL::IResult ReadComponentRange(const ChannelSystem::IChannelBlock& i_rBlock, std::uint32_t i_Component,
                                TickRange& i_rRange, std::vector<float>& o_rSamples)
{
    const ChannelSystem::ChannelBlockShape& rShape = i_rBlock.GetShape();
    if (!rShape.pLayout || i_Component >= rShape.pLayout->ComponentCount || rShape.SamplePeriod <= 0)
        return TQL::Result::InvalidArgument;
    i_rRange = {TQL::AlignUp(i_rRange.First, rShape.SamplePeriod, rShape.GridOffset),
                TQL::AlignDown(i_rRange.Last, rShape.SamplePeriod, rShape.GridOffset)};
    if (i_rRange.First >= i_rRange.Last)
    {
        o_rSamples.clear();
        return TQL::Result::OkButNoEffect;
    }
    o_rSamples.resize(static_cast<std::size_t>((i_rRange.Last - i_rRange.First) / rShape.SamplePeriod));
    return i_rBlock.ReadComponent(i_rRange, o_rSamples, i_Component);
}

bool VTraceInspector::UpdateValue(const ChannelSystem::IChannelBlock& i_rBlock, std::uint32_t i_Component,
                                  std::int64_t i_Tick, std::vector<float>& i_rScratch)
{
    const ChannelSystem::ChannelBlockShape& rShape = i_rBlock.GetShape();
    const std::int64_t period = rShape.SamplePeriod;
    if (m_ValueTick == i_Tick || period <= 0)
        return false;
    const std::int64_t rounded = i_Tick + period / 2;
    const std::int64_t first = TQL::AlignDown(rounded, period) + rShape.GridOffset;
    const bool bHalfWay = first == rounded + rShape.GridOffset;
    TickRange range = {first, bHalfWay ? first : first + period};
    if (ReadComponentRange(i_rBlock, i_Component, range, i_rScratch).IsError() || i_rScratch.empty())
        return false;
    m_ValueTick = i_Tick;
    m_Value = i_rScratch.front();
    return true;
}

bool VTraceInspector::UpdateWindow(const ChannelSystem::IChannelBlock& i_rBlock, std::uint32_t i_Component,
                                   std::int64_t i_WindowSamples, std::vector<float>& i_rScratch)
{
    TickRange available;
    i_rBlock.GetRange(available);
    // The statistics take samples in at their newer end only, so that older ones ask for a new beginning.
    const bool bRestart = !m_pStatistics || m_WindowSamples != i_WindowSamples || m_Window.Last > available.Last ||
                          available.First < m_Window.First;
    if (!bRestart && m_Window == available)
        return false;
    TickRange range;
    range.First = bRestart ? available.First : std::max(m_Window.Last, available.First);
    range.Last = std::min(available.Last, range.First + std::max(TicksPerAdvance, i_rBlock.GetShape().SamplePeriod));
    if (range.First >= range.Last || ReadComponentRange(i_rBlock, i_Component, range, i_rScratch).IsError() ||
        i_rScratch.empty())
        return false;
    if (bRestart || range.First != m_Window.Last)
    {
        m_pStatistics = std::make_unique<RollingStatistics>(i_WindowSamples);
        m_WindowSamples = i_WindowSamples;
        m_Window.First = available.First;
    }
    m_pStatistics->Push(i_rScratch);
    m_Mean = m_pStatistics->Mean();
    m_StandardDeviation = m_pStatistics->StandardDeviation();
    m_Window = {std::max(m_Window.First, available.First), range.Last};
    m_Span = available.Last - m_Window.First; // a live block grows while its past is taken in
    return true;
}

double VTraceInspector::Progress() const
{
    return m_Span > 0 ? static_cast<double>(m_Window.Last - m_Window.First) / static_cast<double>(m_Span) : 1.0;
}

} // namespace GraphPlotUI
