#include "Streaming/VOscReceiver.h"

#include <algorithm>
#include <utility>

namespace Streaming
{

namespace
{

/// Datagrams gather this long before they are read together: a wake-up for each would cost more than its reading.
constexpr int GatherMilliseconds = 2;

} // namespace

VOscReceiver::VOscReceiver(const Options& i_rOptions) : m_Options(i_rOptions) {}

VOscReceiver::~VOscReceiver()
{
    if (!m_Thread.joinable())
        return;
    m_Socket.Wake();
    m_Thread.join();
}

TQL::IResult VOscReceiver::Start(std::string& o_rError)
{
    if (const TQL::IResult result = m_Socket.Open(m_Options.Address, m_Options.Port, o_rError); result.IsError())
        return result;
    m_Thread = std::thread([this] { Listen(); });
    return TQL::Result::Ok;
}

void VOscReceiver::Listen()
{
    while (m_Socket.Wait(-1, true))
    {
        const std::span<const Datagram> datagrams = m_Socket.Receive();
        for (const Datagram& rDatagram : datagrams)
            if (!m_Reader.Read(rDatagram.Bytes,
                               [&](const OscMessage& i_rMessage) { TakeMessage(i_rMessage, rDatagram); }))
                m_Troubles.Add(EOscTrouble::Malformed);
        m_Troubles.Add(EOscTrouble::LostBefore, m_Socket.TakeDropped());
        if (datagrams.size() < VUdpSocket::MostAtOnce && !m_Socket.Wait(GatherMilliseconds, false))
            return;
    }
}

/// The channel of a message, made with its first one; null when it cannot be taken.
const VOscReceiver::Inlet* VOscReceiver::FindInlet(const OscMessage& i_rMessage)
{
    if (i_rMessage.WrongType != 0)
    {
        m_Troubles.Add(EOscTrouble::WrongKind, 1,
                       std::string(i_rMessage.Address.substr(0, 255)) + ", type " + i_rMessage.WrongType);
        return nullptr;
    }
    const auto known = m_Inlets.find(i_rMessage.Address);
    if (known != m_Inlets.end() && known->second.Components == i_rMessage.Values.size())
        return &known->second;
    const auto refuse = [&](EOscTrouble i_Trouble) -> const Inlet*
    {
        m_Troubles.Add(i_Trouble, 1, i_Trouble == EOscTrouble::BadAddress ? "" : i_rMessage.Address);
        return nullptr;
    };
    if (!IsUsableAddress(i_rMessage.Address))
        return refuse(EOscTrouble::BadAddress);
    if (i_rMessage.Values.empty() || i_rMessage.Values.size() > MostComponents)
        return refuse(EOscTrouble::NoValues);
    if (known != m_Inlets.end())
        return refuse(EOscTrouble::ComponentsChanged);
    if (m_Inlets.size() >= m_Options.MostChannels)
        return refuse(EOscTrouble::TooManyChannels);

    OscChannel channel{NameOfAddress(i_rMessage.Address, i_rMessage.Values.size()), i_rMessage.Values.size()};
    if (const std::size_t times = ++m_Names[channel.Name.Name]; times > 1)
        channel.Name.Name.append("#").append(std::to_string(times));
    const Inlet inlet{static_cast<std::uint32_t>(m_Inlets.size()), channel.Components};
    const std::lock_guard lock(m_Mutex);
    m_Appeared.push_back(std::move(channel));
    m_InQueue.push_back(0);
    return &m_Inlets.emplace(i_rMessage.Address, inlet).first->second;
}

void VOscReceiver::TakeMessage(const OscMessage& i_rMessage, const Datagram& i_rDatagram)
{
    const Inlet* pInlet = FindInlet(i_rMessage);
    if (!pInlet)
        return;
    const std::uint64_t restarts = m_Clock.Restarts();
    const LocalTime time = m_Clock.TimeOf(i_rMessage.TimeTag, i_rDatagram.Arrival, i_rDatagram.Sender);
    m_Troubles.Add(EOscTrouble::OutOfRange, i_rMessage.OutOfRange, i_rMessage.Address);
    m_Troubles.Add(EOscTrouble::ClockSet, m_Clock.Restarts() - restarts);
    {
        const std::lock_guard lock(m_Mutex);
        if (m_InQueue[pInlet->Channel] < m_Options.MostWaiting && m_Waiting.Samples.size() < m_Options.MostInAll)
        {
            if (m_Waiting.Samples.empty())
                m_OldestArrival = i_rDatagram.Arrival;
            m_MostInQueue = std::max(m_MostInQueue, ++m_InQueue[pInlet->Channel]);
            m_Waiting.Samples.push_back({time, pInlet->Channel, m_Waiting.Values.size()});
            m_Waiting.Values.insert(m_Waiting.Values.end(), i_rMessage.Values.begin(), i_rMessage.Values.end());
            ++m_Messages;
            return;
        }
    }
    m_Troubles.Add(EOscTrouble::QueueFull, 1, i_rMessage.Address);
}

void VOscReceiver::Take(OscSamples& o_rSamples, std::vector<OscChannel>& io_rChannels)
{
    o_rSamples.Clear();
    const std::lock_guard lock(m_Mutex);
    std::swap(o_rSamples, m_Waiting);
    std::ranges::fill(m_InQueue, std::size_t{0});
    m_MostInQueue = 0;
    io_rChannels.insert(io_rChannels.end(), std::make_move_iterator(m_Appeared.begin()),
                        std::make_move_iterator(m_Appeared.end()));
    m_Appeared.clear();
}

bool VOscReceiver::Waiting(LocalTime& o_rOldest, std::size_t& o_rMost) const
{
    const std::lock_guard lock(m_Mutex);
    o_rOldest = m_OldestArrival;
    o_rMost = m_MostInQueue;
    return m_MostInQueue != 0;
}

std::uint64_t VOscReceiver::MessageCount() const
{
    const std::lock_guard lock(m_Mutex);
    return m_Messages;
}

} // namespace Streaming
