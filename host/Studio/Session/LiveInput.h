#pragma once

#include <chrono>
#include <cstdint>
#include <deque>
#include <optional>
#include <string>
#include <utility>

namespace Studio
{

enum class ELiveInput
{
    None, ///< there was none yet
    Simulation,
    Replay,
    Osc
};

/// A live input as it stands.
struct LiveInput
{
    ELiveInput Kind = ELiveInput::None;
    std::uint64_t Number = 0; ///< counts the inputs of a session
    bool bRunning = false;    ///< or paused
    bool bPaused = false;
    std::string Address = {}; ///< where it listens for messages
    std::uint16_t Port = 0;
    std::uint64_t Messages = 0;
};

/// What to tell of it.
struct LiveStatusText
{
    std::string Text; ///< one line; empty when there is nothing to tell
    bool bWarning = false;
    bool bEnded = false; ///< it ended since the last time

    bool operator==(const LiveStatusText&) const = default;
};

/// Watches a live input and puts into words how it is: how many messages came and how fast, for how long none did, that
/// it ended. Asked now and then with the time of a clock that only goes forwards. A value with a memory of a few
/// seconds.
class VLiveStatus
{
public:
    using Time = std::chrono::milliseconds;

    static constexpr Time LongestSilence = std::chrono::seconds(3);

    LiveStatusText Tell(const LiveInput& i_rInput, Time i_Now);

private:
    void Restart(const LiveInput& i_rInput, Time i_Now);
    std::string TellMessages(const LiveInput& i_rInput, Time i_Now, bool& o_rbWarning);

    std::uint64_t m_Number = 0;
    bool m_bWasRunning = false;
    Time m_LastAt{0};                                    ///< when the count of messages grew
    std::deque<std::pair<Time, std::uint64_t>> m_Counts; ///< of the last seconds
};

} // namespace Studio
