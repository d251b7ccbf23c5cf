#include "OscSupport.h"
#include "Streaming/VOscInput.h"
#include "support/LogGuard.h"

#include <atomic>
#include <random>

#include <arpa/inet.h>
#include <sys/socket.h>
#include <unistd.h>

namespace StreamingTest
{

namespace
{

using Streaming::EOscTrouble;
using Streaming::OscChannel;
using Streaming::OscSamples;
using Streaming::VOscReceiver;

/// Sends packets as they are to a port of the loopback.
class Sender
{
public:
    explicit Sender(std::uint16_t i_Port)
    {
        m_Socket = ::socket(AF_INET, SOCK_DGRAM, 0);
        sockaddr_in address{};
        address.sin_family = AF_INET;
        address.sin_port = htons(i_Port);
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        EXPECT_EQ(::connect(m_Socket, reinterpret_cast<const sockaddr*>(&address), sizeof(address)), 0);
    }
    ~Sender() { ::close(m_Socket); }
    Sender(const Sender&) = delete;
    Sender& operator=(const Sender&) = delete;

    void Send(const Bytes& i_rPacket) const { (void)!::send(m_Socket, i_rPacket.data(), i_rPacket.size(), 0); }

private:
    int m_Socket = -1;
};

class OscReceiver : public testing::Test
{
protected:
    void Start(std::size_t i_MostChannels = 100, std::size_t i_MostWaiting = 1000)
    {
        VOscReceiver::Options options;
        options.MostChannels = i_MostChannels;
        options.MostWaiting = i_MostWaiting;
        m_pReceiver = std::make_unique<VOscReceiver>(options);
        std::string error;
        ASSERT_TRUE(m_pReceiver->Start(error).IsSuccess()) << error;
        m_pSender = std::make_unique<Sender>(m_pReceiver->Port());
    }

    /// Everything sent so far has been dealt with when this marker has.
    void Settle()
    {
        const std::uint64_t before = m_pReceiver->Troubles().Count(EOscTrouble::Malformed);
        m_pSender->Send(Bytes(3));
        ASSERT_TRUE(Eventually([&] { return m_pReceiver->Troubles().Count(EOscTrouble::Malformed) > before; }));
    }

    std::string Take()
    {
        m_pReceiver->Take(m_Samples, m_Channels);
        std::ostringstream text;
        for (const OscSamples::Sample& rSample : m_Samples.Samples)
        {
            text << m_Channels[rSample.Channel].Name.Name;
            for (std::size_t i = 0; i < m_Channels[rSample.Channel].Components; ++i)
                text << " " << m_Samples.Values[rSample.FirstValue + i];
            text << "; ";
        }
        return text.str();
    }

    std::unique_ptr<VOscReceiver> m_pReceiver;
    std::unique_ptr<Sender> m_pSender;
    OscSamples m_Samples;
    std::vector<OscChannel> m_Channels;
};

} // namespace

TEST_F(OscReceiver, MessagesBecomeSamplesOfChannels)
{
    Start();
    m_pSender->Send(FloatMessage("/a", {1}));
    m_pSender->Send(FloatBundle(TagAt(100.0), "/w/position/m", {1, 2, 3}));
    m_pSender->Send(FloatBundle(TagAt(100.125), "/w/position/m", {4, 5, 6}));
    m_pSender->Send(FloatMessage("/position/w/m", {7, 8, 9}));
    Settle();
    EXPECT_EQ(Take(), "a 1; w:m 1 2 3; w:m 4 5 6; w:m#2 7 8 9; ");
    EXPECT_EQ((m_Samples.Samples[2].Time - m_Samples.Samples[1].Time).count(), 125'000'000);
    m_pSender->Send(FloatMessage("/a", {2}));
    Settle();
    EXPECT_EQ(Take(), "a 2; ");
    EXPECT_EQ(m_Channels.size(), 3u);
    EXPECT_EQ(m_pReceiver->MessageCount(), 5u);
}

TEST_F(OscReceiver, WhatCannotBeKeptIsCountedAndTold)
{
    Start(2, 3);
    lo_message text = lo_message_new();
    lo_message_add_string(text, "no number");
    std::size_t size = 0;
    void* pBytes = lo_message_serialise(text, "/text", nullptr, &size);
    m_pSender->Send({static_cast<std::byte*>(pBytes), static_cast<std::byte*>(pBytes) + size});
    std::free(pBytes);
    lo_message_free(text);
    for (int i = 0; i < 5; ++i)
        m_pSender->Send(FloatMessage("/a", {static_cast<float>(i)}));
    m_pSender->Send(FloatMessage("/a", {1, 2}));
    m_pSender->Send(FloatMessage("/b", {1}));
    m_pSender->Send(FloatMessage("/c", {1}));
    m_pSender->Send(FloatMessage("/none", {}));
    m_pSender->Send(FloatMessage("/many", std::vector<float>(65)));
    m_pSender->Send(FloatMessage("/b\x7f", {1}));
    Settle();
    EXPECT_EQ(Take(), "a 0; a 1; a 2; b 1; ");
    const std::vector<std::string> expected{
        "1 packet is no Open Sound Control and left out in whole or in part",
        "1 message is left out: an address has at most 255 printable ASCII characters",
        "1 message is left out: an argument is no number (the last: /text, type s)",
        "2 messages are left out: a channel has from 1 to 64 numbers (the last: /many)",
        "1 message is left out: the number of values is not that of the channel's first message (the last: /a)",
        "1 message is left out: there are too many channels already (the last: /c)",
        "2 samples were lost: they came faster than they were taken (the last: /a)",
    };
    EXPECT_EQ(m_pReceiver->Troubles().Summary(), expected);
    EXPECT_EQ(m_pReceiver->Troubles().TakeNews(std::chrono::seconds(10)), expected);
    m_pSender->Send(FloatMessage("/c", {1}));
    Settle();
    EXPECT_EQ(m_pReceiver->Troubles().TakeNews(std::chrono::seconds(14)).size(), 0u) << "not every time";
    EXPECT_EQ(m_pReceiver->Troubles().TakeNews(std::chrono::seconds(16)).size(), 2u);
    m_pSender->Send(FloatMessage("/a", {9}));
    Settle();
    EXPECT_EQ(Take(), "a 9; ") << "what was taken has made room";
}

TEST_F(OscReceiver, RandomPacketsLeaveItListening)
{
    Start();
    std::mt19937 random(7);
    for (int i = 0; i < 500; ++i)
    {
        Bytes packet(random() % 200);
        for (std::byte& rByte : packet)
            rByte = static_cast<std::byte>(random() % 256);
        m_pSender->Send(packet);
    }
    m_pSender->Send(Bytes(60'000, std::byte{'/'}));
    m_pSender->Send(FloatMessage("/a", {5}));
    EXPECT_TRUE(Eventually([&] { return m_pReceiver->MessageCount() == 1; }));
    EXPECT_EQ(Take(), "a 5; ");
    EXPECT_EQ(m_pReceiver->Troubles().Count(EOscTrouble::Malformed), 501u);
}

TEST_F(OscReceiver, AnAddressThatCannotBeHadIsToldInOneLine)
{
    Start();
    const std::string taken = std::to_string(m_pReceiver->Port());
    const struct
    {
        const char* pAddress;
        std::uint16_t Port;
        std::string Expected;
    } rows[] = {{"127.0.0.1", m_pReceiver->Port(),
                 "port " + taken + " of 127.0.0.1 is in use by another program; end that, or listen at another port"},
                {"no.such", 9000, "\"no.such\" is no address of a machine in numbers, such as 127.0.0.1"},
                {"203.0.113.7", 9000,
                 "this machine has no address 203.0.113.7; give one of its own, or 0.0.0.0 for all of them"}};
    for (const auto& rRow : rows)
    {
        VOscReceiver receiver({rRow.pAddress, rRow.Port});
        std::string error;
        EXPECT_TRUE(receiver.Start(error).IsError());
        EXPECT_EQ(error, rRow.Expected);
    }
    VOscReceiver six({"::1", 0});
    std::string error;
    if (six.Start(error).IsSuccess()) // else a machine without that network
    {
        EXPECT_NE(six.Port(), 0);
    }
}

TEST_F(OscReceiver, ItEndsWhilePacketsArrive)
{
    std::atomic<bool> bStop{false};
    std::atomic<std::uint16_t> port{0};
    std::thread flood(
        [&]
        {
            const Bytes packet = FloatMessage("/a", {1});
            while (!bStop.load())
                if (const std::uint16_t to = port.load(); to != 0)
                {
                    const Sender sender(to);
                    for (int i = 0; i < 50; ++i)
                        sender.Send(packet);
                }
                else
                    std::this_thread::yield();
        });
    for (int turn = 0; turn < 20; ++turn)
    {
        Start(100, 10);
        port.store(m_pReceiver->Port());
        EXPECT_TRUE(Eventually([&] { return m_pReceiver->MessageCount() > 0; }));
        Take();
        m_pReceiver.reset();
        m_Channels.clear();
    }
    bStop.store(true);
    flood.join();
}

namespace
{

/// An input and what its callbacks said.
class OscInput : public testing::Test
{
protected:
    void Start(double i_Rate)
    {
        Streaming::VOscInput::Options options;
        options.Rate = i_Rate;
        Streaming::VOscInput::Callbacks callbacks;
        callbacks.MakeContext = [this](double i_Frames, std::int64_t i_Period)
        {
            const std::lock_guard lock(m_Mutex);
            m_Rate = i_Frames;
            return m_pContext = MakeContext(i_Period);
        };
        callbacks.ChannelsAdded = [this]
        {
            ++m_Announcements;
        };
        m_pInput = std::make_unique<Streaming::VOscInput>(options, callbacks);
        std::string error;
        ASSERT_TRUE(m_pInput->Start(error).IsSuccess()) << error;
        m_pSender = std::make_unique<Sender>(m_pInput->Port());
    }

    std::shared_ptr<Channels::VLiveContext> Context()
    {
        const std::lock_guard lock(m_Mutex);
        return m_pContext;
    }

    std::mutex m_Mutex;
    std::shared_ptr<Channels::VLiveContext> m_pContext; // guarded by m_Mutex
    double m_Rate = 0.0;                                // guarded by m_Mutex
    std::atomic<int> m_Announcements{0};
    std::unique_ptr<Streaming::VOscInput> m_pInput;
    std::unique_ptr<Sender> m_pSender;
};

} // namespace

TEST_F(OscInput, FillsAContextWithTaggedFrames)
{
    Start(100.0);
    for (int i = 0; i < 30; ++i)
        if (i % 10 != 7)
            m_pSender->Send(FloatBundle(TagAt(50.0 + i / 100.0), "/a", {static_cast<float>(i)}));
    EXPECT_TRUE(Eventually([&] { return m_pInput->MessageCount() == 27 && m_Announcements > 0; }));
    m_pInput.reset(); // hands on what waits
    EXPECT_EQ(Describe(*Context()),
              "a@0: 0 1 2 3 4 5 6 - 8 9 10 11 12 13 14 15 16 - 18 19 20 21 22 23 24 25 26 - 28 29\n");
}

TEST_F(OscInput, MeasuresTheRateWhenManyWait)
{
    Start(0.0);
    for (int i = 0; i < 1100; ++i) // half of what may wait ends the measurement early
    {
        m_pSender->Send(FloatBundle(TagAt(50.0 + i / 600.0), "/a", {static_cast<float>(i)}));
        if (i % 100 == 0) // leaves the system's buffer time
        {
            ASSERT_TRUE(Eventually([&] { return m_pInput->MessageCount() >= static_cast<std::uint64_t>(i); }));
        }
    }
    ASSERT_TRUE(Eventually([&] { return Context() != nullptr; }));
    m_pInput.reset();
    EXPECT_EQ(m_Rate, 600.0);
    const auto pSamples = Context()->GetChannels()->front()->GetSamples();
    EXPECT_EQ(pSamples->GetRange(), (TQL::TickRange{0, 1100 * 225'000}));
}

TEST_F(OscInput, MessagesOfAPauseAreLeftOut)
{
    Start(100.0);
    m_pSender->Send(FloatMessage("/a", {1}));
    EXPECT_TRUE(Eventually([&] { return !Context()->GetTickRange().IsEmpty(); }));
    m_pInput->SetPaused(true);
    EXPECT_TRUE(m_pInput->IsPaused());
    m_pInput.reset();
    EXPECT_EQ(Describe(*Context()), "a@0: 1\n");
}

TEST_F(OscInput, ARateThatCannotBeIsRefused)
{
    for (const double rate : {-1.0, 1e9, std::nan("")})
    {
        Streaming::VOscInput input({{}, rate}, {});
        std::string error;
        EXPECT_TRUE(input.Start(error).IsError()) << rate;
        EXPECT_EQ(error, "the rate of the messages has to be from 0.1 to 100000 Hz");
    }
}

} // namespace StreamingTest
