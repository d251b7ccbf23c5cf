#pragma once

#include "Streaming/OscAddress.h"
#include "Streaming/OscPacket.h"
#include "Streaming/VOscClock.h"
#include "Streaming/VOscTroubles.h"
#include "Streaming/VUdpSocket.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <span>
#include <string>
#include <thread>
#include <vector>

namespace Streaming
{

/// Samples in the order in which they came.
struct OscSamples
{
    struct Sample
    {
        LocalTime Time{0};
        std::uint32_t Channel = 0;
        std::size_t FirstValue = 0; ///< in Values; as many as the channel has components
    };

    std::vector<Sample> Samples;
    std::vector<float> Values;

    void Clear()
    {
        Samples.clear();
        Values.clear();
    }
};

/// A channel as its first message described it. They are numbered from 0 in the order of appearance.
struct OscChannel
{
    OscChannelName Name;
    std::size_t Components = 1;
};

/// Listens for Open Sound Control messages over UDP on a thread of its own, and keeps their samples until they are
/// taken. An address becomes a channel with its first message; its components are the numbers of that message. What
/// cannot be kept is counted in the troubles: messages with anything but numbers, with another number of values than
/// the first of their address, of addresses beyond MostChannels; samples that find as many waiting as the options
/// allow. Any thread may take.
class VOscReceiver
{
public:
    struct Options
    {
        std::string Address = "127.0.0.1";
        std::uint16_t Port = 0; ///< 0: any that is free
        std::size_t MostChannels = 4096;
        std::size_t MostWaiting = 2048;    ///< samples a channel
        std::size_t MostInAll = 1'000'000; ///< samples of all channels that wait
    };

    static constexpr std::size_t MostComponents = 64;

    explicit VOscReceiver(const Options& i_rOptions);
    ~VOscReceiver();
    VOscReceiver(const VOscReceiver&) = delete;
    VOscReceiver& operator=(const VOscReceiver&) = delete;

    /// Begins to listen. On failure o_rError is one line that says what to do.
    [[nodiscard]] TQL::IResult Start(std::string& o_rError);

    std::uint16_t Port() const { return m_Socket.Port(); }

    /// All waiting samples, in place of what o_rSamples held, whose memory is used on. Channels that appeared since the
    /// last call are appended to io_rChannels, which only this function changes.
    void Take(OscSamples& o_rSamples, std::vector<OscChannel>& io_rChannels);

    /// When the oldest waiting sample came, and how many wait for the channel with most. False when none waits.
    bool Waiting(LocalTime& o_rOldest, std::size_t& o_rMost) const;

    std::uint64_t MessageCount() const; ///< that became samples, taken or not

    VOscTroubles& Troubles() { return m_Troubles; }

private:
    struct Inlet
    {
        std::uint32_t Channel = 0;
        std::size_t Components = 1;
    };

    void Listen();
    void TakeMessage(const OscMessage& i_rMessage, const Datagram& i_rDatagram);
    const Inlet* FindInlet(const OscMessage& i_rMessage);

    const Options m_Options;
    VOscTroubles m_Troubles;
    VUdpSocket m_Socket;
    VOscPacketReader m_Reader;                          // thread only
    VOscClock m_Clock;                                  // thread only
    std::map<std::string, Inlet, std::less<>> m_Inlets; // thread only; by address
    std::map<std::string, std::size_t> m_Names;         // thread only; how often each was given
    mutable std::mutex m_Mutex;
    OscSamples m_Waiting;               // guarded by m_Mutex
    std::vector<std::size_t> m_InQueue; // guarded by m_Mutex; samples that wait, by channel
    std::size_t m_MostInQueue = 0;      // guarded by m_Mutex
    LocalTime m_OldestArrival{0};       // guarded by m_Mutex; of what waits
    std::vector<OscChannel> m_Appeared; // guarded by m_Mutex; since the last Take
    std::uint64_t m_Messages = 0;       // guarded by m_Mutex
    std::thread m_Thread;
};

} // namespace Streaming
