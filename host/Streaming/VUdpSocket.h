#pragma once

#include "Streaming/VOscClock.h"
#include "TQL/IResult.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <span>
#include <string>

namespace Streaming
{

/// One datagram as it was received; valid until the next call of Receive.
struct Datagram
{
    std::span<const std::byte> Bytes;
    LocalTime Arrival{0};     ///< when the system got it, not when it was read
    std::uint64_t Sender = 0; ///< tells senders apart
};

/// A UDP socket that listens. It knows how many datagrams the system had to drop. One thread receives; any thread may
/// wake it.
class VUdpSocket
{
public:
    static constexpr std::size_t MostAtOnce = 64; ///< datagrams a call

    VUdpSocket();
    ~VUdpSocket();
    VUdpSocket(const VUdpSocket&) = delete;
    VUdpSocket& operator=(const VUdpSocket&) = delete;

    /// i_rAddress is numeric (IPv4 or IPv6) or "localhost". Port 0 takes any that is free. On failure o_rError is one
    /// line.
    [[nodiscard]] TQL::IResult Open(const std::string& i_rAddress, std::uint16_t i_Port, std::string& o_rError);

    std::uint16_t Port() const { return m_Port; }

    /// Waits until there is something to receive, the time is over, or Wake was called. False for the last, and after
    /// it for ever. A time below 0 waits without end. Without i_bData only for the other two.
    bool Wait(int i_Milliseconds, bool i_bData);

    /// What is there, at most MostAtOnce datagrams, without waiting. An error of the network counts as nothing.
    std::span<const Datagram> Receive();

    /// Datagrams that the system has dropped since the last call because they were not received in time.
    std::uint64_t TakeDropped();

    void Wake();

private:
    struct Buffers; ///< where the system writes to

    int m_Socket = -1;
    int m_WakeUp = -1;
    std::uint16_t m_Port = 0;
    std::uint32_t m_DroppedInAll = 0; ///< as the system counts, modulo 2^32
    std::uint64_t m_Dropped = 0;
    std::unique_ptr<Buffers> m_pBuffers;
};

} // namespace Streaming
