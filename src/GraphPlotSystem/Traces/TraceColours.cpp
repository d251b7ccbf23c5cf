#include "GraphPlotSystem/Traces/TraceColours.h"

#include <algorithm>

namespace GraphPlotUI
{

TraceColours::TraceColours()
{
    m_Assigned.max_load_factor(1.0f);
}

bool TraceColours::SetPalette(std::span<const Colour4f> i_Colours)
{
    if (std::ranges::equal(i_Colours, m_Palette))
        return false;
    m_Palette.assign(i_Colours.begin(), i_Colours.end());
    Reset();
    return true;
}

void TraceColours::Reset()
{
    m_Assigned.clear();
    m_Free.clear();
    for (std::size_t index = 0; index < m_Palette.size(); ++index)
        m_Free.insert(m_Free.end(), index);
    ++m_Generation;
}

TQL::IResult TraceColours::AssignChannel(const TQL::ITraceId& i_rTrace, std::uint32_t i_ComponentCount)
{
    if (m_Assigned.contains(i_rTrace))
        return TQL::Result::OkButNoEffect;
    if (m_Free.empty())
        return TQL::Result::NotAvailable;
    const std::size_t index = *m_Free.begin();
    m_Free.erase(m_Free.begin());
    m_Assigned.emplace(i_rTrace, index);
    const std::uint32_t count = std::min(i_ComponentCount, 256u);
    for (std::uint32_t component = 1; component < count; ++component)
        m_Assigned.emplace(TQL::ITraceId(i_rTrace.Channel(), static_cast<std::uint8_t>(component)), index);
    ++m_Generation;
    return TQL::Result::Ok;
}

bool TraceColours::Release(const TQL::IChannelInstanceId& i_rChannel)
{
    const std::size_t released = std::erase_if(m_Assigned,
                                               [&](const auto& i_rEntry)
                                               {
                                                   if (!TQL::IsSameChannel(i_rEntry.first.Channel(), i_rChannel))
                                                       return false;
                                                   m_Free.insert(i_rEntry.second);
                                                   return true;
                                               });
    if (released != 0)
        ++m_Generation;
    return released != 0;
}

Colour4f TraceColours::Find(const TQL::ITraceId& i_rTrace) const
{
    const auto found = m_Assigned.find(i_rTrace);
    return found != m_Assigned.end() && found->second < m_Palette.size() ? m_Palette[found->second] : Unassigned;
}

} // namespace GraphPlotUI
