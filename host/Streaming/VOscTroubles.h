#pragma once

#include "Streaming/VOscClock.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <mutex>
#include <string>
#include <string_view>
#include <vector>

namespace Streaming
{

/// What can be wrong with what comes in.
enum class EOscTrouble : std::size_t
{
    Malformed,         ///< packets
    BadAddress,        ///< messages whose address cannot name a channel
    WrongKind,         ///< messages with an argument that is no number
    NoValues,          ///< messages without arguments, or with more than a channel can hold
    ComponentsChanged, ///< messages with another number of arguments than the first of their address
    TooManyChannels,   ///< messages of addresses beyond the bound
    LostBefore,        ///< packets that the system dropped because they were not read in time
    QueueFull,         ///< samples of a channel that were not taken in time
    TooLate,           ///< samples whose frames had been handed on
    SharedFrame,       ///< samples that replaced another of the same frame
    BeyondRate,        ///< the same where the rate was stated
    OutOfRange,        ///< numbers that a float cannot hold
    ClockSet,          ///< time tags that started anew
    Count
};

/// Counts what was left out and why, and puts it into words now and then. Thread-safe.
class VOscTroubles
{
public:
    /// The detail is kept as an example; keep it short.
    void Add(EOscTrouble i_Trouble, std::uint64_t i_Count = 1, std::string_view i_Detail = {});

    std::uint64_t Count(EOscTrouble i_Trouble) const;

    /// A sentence for each kind that has grown since it was last told, each kind at most once in five seconds.
    std::vector<std::string> TakeNews(LocalTime i_Now);

    /// A sentence for each kind that there was.
    std::vector<std::string> Summary() const;

private:
    struct Entry
    {
        std::uint64_t Count = 0;
        std::uint64_t Told = 0;
        LocalTime ToldAt{0};
        std::string Detail;
    };

    mutable std::mutex m_Mutex;
    std::array<Entry, static_cast<std::size_t>(EOscTrouble::Count)> m_Entries; // guarded by m_Mutex
};

} // namespace Streaming
