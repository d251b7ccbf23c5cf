#pragma once

#include "TQL/HashMix.h"
#include "TQL/IChannelInstanceId.h"

#include <cstddef>
#include <utility>

namespace TQL
{

/// Names one trace: one component of one channel. The hash is computed once, when the id is made.
class ITraceId
{
public:
    ITraceId() = default;
    ITraceId(IChannelInstanceId i_Channel, std::uint8_t i_Component)
        : m_Channel(std::move(i_Channel)), m_Component(i_Component), m_Hash(ComputeHash())
    {
    }

    const IChannelInstanceId& Channel() const noexcept { return m_Channel; }
    std::uint8_t Component() const noexcept { return m_Component; }
    std::uint64_t Hash() const noexcept { return m_Hash; }

    /// All five fields of the channel and the component.
    friend bool operator==(const ITraceId& i_rA, const ITraceId& i_rB) noexcept
    {
        return i_rA.m_Component == i_rB.m_Component && i_rA.m_Hash == i_rB.m_Hash &&
               IsSameChannel(i_rA.m_Channel, i_rB.m_Channel);
    }

    friend std::strong_ordering operator<=>(const ITraceId& i_rA, const ITraceId& i_rB) noexcept
    {
        const auto order = i_rA.m_Channel <=> i_rB.m_Channel;
        return order != 0 ? order : i_rA.m_Component <=> i_rB.m_Component;
    }

private:
    std::uint64_t ComputeHash() const noexcept
    {
        std::uint64_t hash = HashMix(0, HashText(m_Channel.DataContextName));
        hash = HashMix(hash, m_Channel.First);
        hash = HashMix(hash, m_Channel.Second);
        hash = HashMix(hash, HashText(m_Channel.TypeName));
        hash = HashMix(hash, HashText(m_Channel.Text));
        return HashMix(hash, m_Component);
    }

    IChannelInstanceId m_Channel;
    std::uint8_t m_Component = 0;
    std::uint64_t m_Hash = 0;
};

struct TraceIdHash
{
    std::size_t operator()(const ITraceId& i_rId) const noexcept { return i_rId.Hash(); }
};

} // namespace TQL
