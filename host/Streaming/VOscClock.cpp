#include "Streaming/VOscClock.h"

namespace Streaming
{

namespace
{

LocalTime FromTag(std::uint64_t i_TimeTag)
{
    const std::uint64_t fraction = ((i_TimeTag & 0xFFFF'FFFFu) * 1'000'000'000u) >> 32;
    return std::chrono::seconds(i_TimeTag >> 32) + LocalTime(static_cast<std::int64_t>(fraction));
}

} // namespace

LocalTime VOscClock::TimeOf(std::optional<std::uint64_t> i_TimeTag, LocalTime i_Arrival, std::uint64_t i_Sender)
{
    if (!i_TimeTag)
        return i_Arrival;
    const LocalTime tag = FromTag(*i_TimeTag);
    auto offset = m_Offsets.find(i_Sender);
    if (offset == m_Offsets.end())
    {
        if (m_Offsets.size() >= MostSenders)
            return i_Arrival;
        offset = m_Offsets.emplace(i_Sender, i_Arrival - tag).first;
    }
    const LocalTime stray = tag + offset->second - i_Arrival;
    if (stray > LongestStray || stray < -LongestStray)
    {
        offset->second = i_Arrival - tag;
        ++m_Restarts;
    }
    return tag + offset->second;
}

} // namespace Streaming
