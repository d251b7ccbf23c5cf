#pragma once

#include <compare>
#include <cstdint>
#include <string>

namespace TQL
{

/// Names one channel: the data context that it belongs to, its type, and what it is a channel of.
/// operator< is a total order over all five fields and serves map keys. operator== leaves the context out: it asks
/// whether two ids name the same thing in two contexts (a live marker and the same marker in a recording).
struct IChannelInstanceId
{
    std::string DataContextName;
    std::string TypeName;
    std::uint64_t First = 0;  ///< depends on the type, for example a subject number
    std::uint64_t Second = 0; ///< depends on the type, for example a marker number
    std::string Text;         ///< depends on the type, for example a device output's name

    friend bool operator==(const IChannelInstanceId& i_rA, const IChannelInstanceId& i_rB) noexcept
    {
        return i_rA.First == i_rB.First && i_rA.Second == i_rB.Second && i_rA.TypeName == i_rB.TypeName &&
               i_rA.Text == i_rB.Text;
    }

    friend std::strong_ordering operator<=>(const IChannelInstanceId& i_rA, const IChannelInstanceId& i_rB) noexcept
    {
        if (const auto order = i_rA.DataContextName <=> i_rB.DataContextName; order != 0)
            return order;
        if (const auto order = i_rA.TypeName <=> i_rB.TypeName; order != 0)
            return order;
        if (const auto order = i_rA.First <=> i_rB.First; order != 0)
            return order;
        if (const auto order = i_rA.Second <=> i_rB.Second; order != 0)
            return order;
        return i_rA.Text <=> i_rB.Text;
    }
};

/// Whether two ids are the same channel of the same context.
inline bool IsSameChannel(const IChannelInstanceId& i_rA, const IChannelInstanceId& i_rB) noexcept
{
    return (i_rA <=> i_rB) == 0;
}

} // namespace TQL
