#include "Streaming/VUdpSocket.h"

#include "TQL/HashMix.h"

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <string_view>
#include <utility>
#include <vector>

#include <netdb.h>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/socket.h>
#include <time.h>
#include <unistd.h>

namespace Streaming
{

namespace
{

constexpr std::size_t LargestDatagram = 65536;
constexpr std::size_t ControlBytes = 256;
constexpr int WantedBuffer = 8 << 20; // bytes in the system, for times when this program is not scheduled
constexpr LocalTime LongestInSystem = std::chrono::seconds(10);

LocalTime ReadClock(clockid_t i_Clock)
{
    timespec time{};
    ::clock_gettime(i_Clock, &time);
    return std::chrono::seconds(time.tv_sec) + LocalTime(time.tv_nsec);
}

struct AddressDeleter
{
    void operator()(addrinfo* i_pAddress) const { ::freeaddrinfo(i_pAddress); }
};

std::string WhyNotBound(int i_Error, const std::string& i_rAddress, std::uint16_t i_Port)
{
    const std::string port = "port " + std::to_string(i_Port) + " of " + i_rAddress;
    switch (i_Error)
    {
    case EADDRINUSE:
        return port + " is in use by another program; end that, or listen at another port";
    case EACCES:
        return port + " needs the rights of the administrator; listen at a port above 1023";
    case EADDRNOTAVAIL:
        return "this machine has no address " + i_rAddress + "; give one of its own, or 0.0.0.0 for all of them";
    default:
        return "cannot listen at " + port + ": " + std::strerror(i_Error);
    }
}

std::uint16_t PortOf(int i_Socket)
{
    sockaddr_storage address{};
    socklen_t length = sizeof(address);
    ::getsockname(i_Socket, reinterpret_cast<sockaddr*>(&address), &length);
    std::array<char, 8> port{};
    ::getnameinfo(reinterpret_cast<const sockaddr*>(&address), length, nullptr, 0, port.data(), port.size(),
                  NI_NUMERICSERV);
    return static_cast<std::uint16_t>(std::strtoul(port.data(), nullptr, 10));
}

} // namespace

struct VUdpSocket::Buffers
{
    Buffers() : Bytes(MostAtOnce * LargestDatagram)
    {
        for (std::size_t i = 0; i < MostAtOnce; ++i)
        {
            Pieces[i] = {Bytes.data() + i * LargestDatagram, LargestDatagram};
            Headers[i].msg_hdr.msg_iov = &Pieces[i];
            Headers[i].msg_hdr.msg_iovlen = 1;
            Headers[i].msg_hdr.msg_name = &Senders[i];
            Headers[i].msg_hdr.msg_control = Control[i].Bytes.data();
        }
    }

    /// The system overwrites the lengths with what it wrote.
    void ResetLengths()
    {
        for (mmsghdr& rHeader : Headers)
        {
            rHeader.msg_hdr.msg_namelen = sizeof(sockaddr_storage);
            rHeader.msg_hdr.msg_controllen = ControlBytes;
        }
    }

    struct alignas(cmsghdr) ControlBlock
    {
        std::array<std::byte, ControlBytes> Bytes{};
    };

    std::vector<std::byte> Bytes;
    std::array<iovec, MostAtOnce> Pieces{};
    std::array<mmsghdr, MostAtOnce> Headers{};
    std::array<sockaddr_storage, MostAtOnce> Senders{};
    std::array<ControlBlock, MostAtOnce> Control{};
    std::array<Datagram, MostAtOnce> Datagrams{};
};

VUdpSocket::VUdpSocket() : m_WakeUp(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK)), m_pBuffers(std::make_unique<Buffers>())
{
}

VUdpSocket::~VUdpSocket()
{
    if (m_Socket >= 0)
        ::close(m_Socket);
    if (m_WakeUp >= 0)
        ::close(m_WakeUp);
}

TQL::IResult VUdpSocket::Open(const std::string& i_rAddress, std::uint16_t i_Port, std::string& o_rError)
{
    addrinfo wanted{};
    wanted.ai_socktype = SOCK_DGRAM;
    wanted.ai_flags = AI_NUMERICHOST | AI_NUMERICSERV | AI_PASSIVE;
    addrinfo* pFound = nullptr;
    const std::string numeric = i_rAddress == "localhost" ? "127.0.0.1" : i_rAddress;
    if (::getaddrinfo(numeric.c_str(), std::to_string(i_Port).c_str(), &wanted, &pFound) != 0)
    {
        o_rError = "\"" + i_rAddress + "\" is no address of a machine in numbers, such as 127.0.0.1";
        return TQL::Result::InvalidArgument;
    }
    const std::unique_ptr<addrinfo, AddressDeleter> pAddress(pFound);
    m_Socket = ::socket(pAddress->ai_family, SOCK_DGRAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0);
    if (m_Socket < 0 || m_WakeUp < 0 || ::bind(m_Socket, pAddress->ai_addr, pAddress->ai_addrlen) != 0)
    {
        o_rError = WhyNotBound(errno, i_rAddress, i_Port);
        return TQL::Result::Failed;
    }
    // Helpful, not needed: a large buffer, the times of arrival, and the number of dropped datagrams.
    const int on = 1;
    if (::setsockopt(m_Socket, SOL_SOCKET, SO_RCVBUFFORCE, &WantedBuffer, sizeof(WantedBuffer)) != 0)
        (void)::setsockopt(m_Socket, SOL_SOCKET, SO_RCVBUF, &WantedBuffer, sizeof(WantedBuffer));
    (void)::setsockopt(m_Socket, SOL_SOCKET, SO_TIMESTAMPNS, &on, sizeof(on));
    (void)::setsockopt(m_Socket, SOL_SOCKET, SO_RXQ_OVFL, &on, sizeof(on));
    m_Port = PortOf(m_Socket);
    return TQL::Result::Ok;
}

bool VUdpSocket::Wait(int i_Milliseconds, bool i_bData)
{
    std::array<pollfd, 2> waited{{{m_WakeUp, POLLIN, 0}, {m_Socket, POLLIN, 0}}};
    (void)::poll(waited.data(), i_bData ? 2 : 1, i_Milliseconds);
    return (waited[0].revents & POLLIN) == 0;
}

void VUdpSocket::Wake()
{
    const std::uint64_t one = 1;
    (void)!::write(m_WakeUp, &one, sizeof(one));
}

std::span<const Datagram> VUdpSocket::Receive()
{
    Buffers& rBuffers = *m_pBuffers;
    rBuffers.ResetLengths();
    const int count = ::recvmmsg(m_Socket, rBuffers.Headers.data(), MostAtOnce, MSG_DONTWAIT, nullptr);
    const LocalTime now = ReadClock(CLOCK_MONOTONIC);
    const LocalTime wall = ReadClock(CLOCK_REALTIME);
    for (std::size_t i = 0; i < static_cast<std::size_t>(std::max(count, 0)); ++i)
    {
        msghdr& rHeader = rBuffers.Headers[i].msg_hdr;
        Datagram& rDatagram = rBuffers.Datagrams[i];
        rDatagram.Bytes = std::span(rBuffers.Bytes).subspan(i * LargestDatagram, rBuffers.Headers[i].msg_len);
        rDatagram.Sender = TQL::HashText({reinterpret_cast<const char*>(&rBuffers.Senders[i]), rHeader.msg_namelen});
        rDatagram.Arrival = now;
        for (cmsghdr* pPart = CMSG_FIRSTHDR(&rHeader); pPart; pPart = CMSG_NXTHDR(&rHeader, pPart))
            if (pPart->cmsg_level == SOL_SOCKET && pPart->cmsg_type == SCM_TIMESTAMPNS)
            {
                timespec time{};
                std::memcpy(&time, CMSG_DATA(pPart), sizeof(time));
                const LocalTime age = wall - std::chrono::seconds(time.tv_sec) - LocalTime(time.tv_nsec);
                rDatagram.Arrival = now - std::clamp(age, LocalTime(0), LongestInSystem);
            }
            else if (pPart->cmsg_level == SOL_SOCKET && pPart->cmsg_type == SO_RXQ_OVFL)
            {
                std::uint32_t dropped = 0;
                std::memcpy(&dropped, CMSG_DATA(pPart), sizeof(dropped));
                m_Dropped += dropped - m_DroppedInAll;
                m_DroppedInAll = dropped;
            }
    }
    return std::span<const Datagram>(rBuffers.Datagrams).first(static_cast<std::size_t>(std::max(count, 0)));
}

std::uint64_t VUdpSocket::TakeDropped()
{
    return std::exchange(m_Dropped, std::uint64_t{0});
}

} // namespace Streaming
