#pragma once

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <unordered_map>

namespace Streaming
{

/// A time of this machine: nanoseconds on a clock that only goes forwards.
using LocalTime = std::chrono::nanoseconds;

/// Puts the time tags of senders on the clock of this machine. The first tag of a sender is taken to mean its arrival,
/// the others lie relative to it; so it does not matter how the sender's clock is set. A tag that comes to lie further
/// than LongestStray from its arrival starts anew (the clock was set, or the tag is nonsense). Messages without a tag
/// have their arrival as their time. One thread at a time.
class VOscClock
{
public:
    static constexpr LocalTime LongestStray = std::chrono::seconds(2);
    static constexpr std::size_t MostSenders = 256; ///< the tags of more are not heeded

    /// i_Sender is any number that tells senders apart.
    LocalTime TimeOf(std::optional<std::uint64_t> i_TimeTag, LocalTime i_Arrival, std::uint64_t i_Sender);

    /// How often a sender's tags started anew.
    std::uint64_t Restarts() const { return m_Restarts; }

private:
    std::unordered_map<std::uint64_t, LocalTime> m_Offsets; // arrival less tag, by sender
    std::uint64_t m_Restarts = 0;
};

} // namespace Streaming
