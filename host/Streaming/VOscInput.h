#pragma once

#include "Streaming/VOscFeed.h"
#include "Streaming/VOscReceiver.h"
#include "TQL/IResult.h"

#include <atomic>
#include <condition_variable>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

namespace Streaming
{

/// Live input over Open Sound Control: listens, finds the rate if none is stated, and fills a live context on a thread
/// of its own until it is destroyed. Owned by whoever shows or records the data; any thread, but not its own.
class VOscInput
{
public:
    struct Options
    {
        VOscReceiver::Options Receiver;
        double Rate = 0.0; ///< frames a second; 0: the context waits until the rate was measured on the first messages
    };

    /// All but the first call of MakeContext with a stated rate come on the input's thread.
    struct Callbacks
    {
        /// Makes the context, once; frames have the period.
        std::function<std::shared_ptr<Channels::VLiveContext>(double i_Rate, std::int64_t i_FramePeriod)> MakeContext;
        std::function<void()> ChannelsAdded;             ///< may be empty; at most twice a second
        std::function<void(const std::string&)> Note;    ///< may be empty; a sentence on what was found out
        std::function<void(const std::string&)> Trouble; ///< may be empty; a sentence on what was left out
    };

    static constexpr double LowestRate = 0.1;
    static constexpr double HighestRate = 100'000.0;

    VOscInput(const Options& i_rOptions, Callbacks i_Callbacks);
    ~VOscInput();
    VOscInput(const VOscInput&) = delete;
    VOscInput& operator=(const VOscInput&) = delete;

    /// On failure o_rError is one line that says what to do.
    [[nodiscard]] TQL::IResult Start(std::string& o_rError);

    /// Messages that come during a pause are left out, and take no time.
    void SetPaused(bool i_bPaused) { m_bPaused.store(i_bPaused); }
    bool IsPaused() const { return m_bPaused.load(); }

    std::uint16_t Port() const { return m_Receiver.Port(); }
    std::uint64_t MessageCount() const { return m_Receiver.MessageCount(); }
    VOscTroubles& Troubles() { return m_Receiver.Troubles(); }

private:
    void Work();
    TQL::IResult Step(LocalTime i_Now);
    TQL::IResult Begin();
    bool IsRateKnown(LocalTime i_Now) const;
    void MakeFeed(double i_Rate);
    void TellTroubles(LocalTime i_Now);

    const Options m_Options;
    const Callbacks m_Callbacks;
    VOscReceiver m_Receiver;
    std::unique_ptr<VOscFeed> m_pFeed;  // made in Start or on the thread, then thread only
    OscSamples m_Samples;               // thread only
    std::vector<OscChannel> m_Channels; // thread only
    std::size_t m_Announced = 0;        // thread only; channels
    LocalTime m_AnnouncedAt{0};         // thread only
    std::atomic<bool> m_bPaused{false};
    std::mutex m_Mutex;
    std::condition_variable m_Wake;
    bool m_bStopping = false; // guarded by m_Mutex
    std::thread m_Thread;
};

} // namespace Streaming
