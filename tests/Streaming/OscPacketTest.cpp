#include "Streaming/OscPacket.h"
#include "OscSupport.h"
#include "Streaming/OscAddress.h"
#include "Streaming/OscRate.h"
#include "Streaming/VOscClock.h"

#include <random>

namespace StreamingTest
{

namespace
{

using Streaming::OscMessage;
using Streaming::VOscPacketReader;

std::string Read(const Bytes& i_rPacket)
{
    VOscPacketReader reader;
    std::ostringstream text;
    const auto sink = [&](const OscMessage& i_rMessage)
    {
        text << i_rMessage.Address;
        if (i_rMessage.TimeTag)
            text << "@" << (*i_rMessage.TimeTag >> 32) - 4'000'000'000u;
        for (const float value : i_rMessage.Values)
            text << " " << value;
        if (i_rMessage.OutOfRange != 0)
            text << "!" << i_rMessage.OutOfRange;
        if (i_rMessage.WrongType != 0)
            text << " !" << i_rMessage.WrongType;
        text << "; ";
    };
    const bool bWhole = reader.Read(i_rPacket, sink);
    return (bWhole ? "" : "bad ") + text.str();
}

Bytes FromText(std::string_view i_Text)
{
    const auto bytes = std::as_bytes(std::span(i_Text));
    return {bytes.begin(), bytes.end()};
}

Bytes Serialise(lo_bundle i_Bundle)
{
    std::size_t size = 0;
    void* pBytes = lo_bundle_serialise(i_Bundle, nullptr, &size);
    Bytes packet(static_cast<std::byte*>(pBytes), static_cast<std::byte*>(pBytes) + size);
    std::free(pBytes);
    lo_bundle_free_recursive(i_Bundle);
    return packet;
}

lo_bundle Bundle(lo_timetag i_Tag, const char* i_pAddress, float i_Value)
{
    lo_message message = lo_message_new();
    lo_message_add_float(message, i_Value);
    lo_bundle bundle = lo_bundle_new(i_Tag);
    lo_bundle_add_message(bundle, i_pAddress, message);
    return bundle;
}

Bytes MixedMessage(const char* i_pTypes)
{
    lo_message message = lo_message_new();
    for (; *i_pTypes; ++i_pTypes)
        switch (*i_pTypes)
        {
        case 'f':
            lo_message_add_float(message, 1.5f);
            break;
        case 'i':
            lo_message_add_int32(message, -7);
            break;
        case 'd':
            lo_message_add_double(message, 0.25);
            break;
        case 'h':
            lo_message_add_int64(message, 1ll << 40);
            break;
        case 'D':
            lo_message_add_double(message, 1e300);
            break;
        case 's':
            lo_message_add_string(message, "text");
            break;
        default:
            lo_message_add_true(message);
        }
    std::size_t size = 0;
    void* pBytes = lo_message_serialise(message, "/a", nullptr, &size);
    Bytes packet(static_cast<std::byte*>(pBytes), static_cast<std::byte*>(pBytes) + size);
    std::free(pBytes);
    lo_message_free(message);
    return packet;
}

} // namespace

TEST(OscPacket, MessagesAndBundlesAreTakenApart)
{
    EXPECT_EQ(Read(MixedMessage("fidh")), "/a 1.5 -7 0.25 1.09951e+12; ");
    EXPECT_EQ(Read(MixedMessage("D")), "/a nan!1; ") << "a float cannot hold it, and it is counted";
    EXPECT_EQ(Read(MixedMessage("fsf")), "/a !s; ");
    EXPECT_EQ(Read(MixedMessage("T")), "/a !T; ");
    EXPECT_EQ(Read(MixedMessage("")), "/a; ");

    lo_bundle outer = Bundle(TagAt(5), "/outer", 1);
    lo_bundle_add_bundle(outer, Bundle(TagAt(6), "/inner", 2));
    lo_bundle_add_bundle(outer, Bundle(LO_TT_IMMEDIATE, "/now", 3));
    EXPECT_EQ(Read(Serialise(outer)), "/outer@5 1; /inner@6 2; /now 3; ");

    lo_bundle deep = Bundle(TagAt(1), "/deepest", 1);
    for (int i = 0; i < 20; ++i)
    {
        lo_bundle around = Bundle(TagAt(1), "/around", 0);
        lo_bundle_add_bundle(around, deep);
        deep = around;
    }
    const std::string text = Read(Serialise(deep));
    EXPECT_TRUE(text.starts_with("bad /around@1 0; ")) << text;
    EXPECT_EQ(text.find("/deepest"), std::string::npos);
}

TEST(OscPacket, WhatIsNoPacketIsRefusedInPartOrWhole)
{
    using namespace std::string_view_literals;
    static constexpr struct
    {
        std::string_view Packet;
        const char* pExpected;
    } rows[] = {
        {""sv, "bad "},
        {"/"sv, "bad "},
        {"/a\0\0"sv, "bad "},
        {"/a\0\0,f\0\0"sv, "bad "},
        {"/a\0\0,f\0\0\x3f\x80"sv, "bad "},
        {"/a\0\0,f\0\0\x3f\x80\0\0"sv, "/a 1; "},
        {"/a\0\0,f\0\0\x3f\x80\0\0\0\0\0\0"sv, "bad "},
        {"/a\0\0f\0\0\0\x3f\x80\0\0"sv, "bad "},
        {"/aaaa"sv, "bad "},
        {"a\0\0\0,f\0\0\x3f\x80\0\0"sv, "bad "},
        {"/a\0\0,b\0\0"sv, "/a !b; "},
        {"/a\0\0,b\0\0\xff\xff\xff\xff"sv, "/a !b; "},
        {"#bundle\0"sv, "bad "},
        {"#bundle\0\0\0\0\0\0\0\0\1"sv, ""},
        {"#bundle\0\0\0\0\0\0\0\0\1\xff\xff\xff\xff"sv, "bad "},
        {"#bundle\0\0\0\0\0\0\0\0\1\0\0\0\x0c/a\0\0,f\0\0\x3f\x80\0\0\0\0"sv, "bad /a 1; "},
        {"#bundle\0\0\0\0\0\0\0\0\1\0\0\0\x04junk\0\0\0\x0c/a\0\0,f\0\0\x3f\x80\0\0"sv, "bad /a 1; "},
    };
    for (const auto& rRow : rows)
        EXPECT_EQ(Read(FromText(rRow.Packet)), rRow.pExpected) << testing::PrintToString(rRow.Packet);
}

TEST(OscPacket, RandomAndDamagedBytesDoNoHarm)
{
    std::mt19937 random(1);
    const Bytes good[] = {MixedMessage("fidhs"), Serialise(Bundle(TagAt(5), "/some/address", 1))};
    std::size_t messages = 0;
    VOscPacketReader reader;
    for (int turn = 0; turn < 20'000; ++turn)
    {
        Bytes packet = good[turn % 2];
        if (turn % 4 == 3)
            packet.assign(random() % 80, std::byte{0});
        for (std::size_t changes = random() % 4 + (turn % 4 == 3 ? packet.size() : 0); changes > 0 && !packet.empty();
             --changes)
            packet[random() % packet.size()] = static_cast<std::byte>(random() % 256);
        packet.resize(packet.size() - std::min<std::size_t>(packet.size(), random() % 3 == 0 ? random() % 16 : 0));
        packet.shrink_to_fit(); // so that a sanitizer sees a read behind the end
        reader.Read(packet, [&](const OscMessage& i_rMessage) { messages += i_rMessage.Address.empty() ? 0 : 1; });
    }
    EXPECT_GT(messages, 1000u);
}

TEST(OscAddress, AddressesBecomeNames)
{
    static constexpr struct
    {
        const char* pAddress;
        std::size_t Components;
        const char* pExpected;
    } rows[] = {
        {"/emg/left/vastus", 1, "emg/left/vastus"},
        {"//emg//left/", 2, "emg/left"},
        {"/walker/position/LFHD", 3, "marker walker: walker:LFHD"},
        {"/Markers/walker/foot/left", 3, "marker walker: walker:foot/left"},
        {"/hand/Position", 3, "marker : hand"},
        {"/position", 3, "position"},
        {"/hand/position", 2, "hand/position"},
        {"/hand/composition", 3, "hand/composition"},
    };
    for (const auto& rRow : rows)
    {
        const auto name = Streaming::NameOfAddress(rRow.pAddress, rRow.Components);
        EXPECT_EQ((name.bMarker ? "marker " + name.Subject + ": " : "") + name.Name, rRow.pExpected) << rRow.pAddress;
    }
    for (const std::string& rBad : {std::string(), std::string("a"), std::string("/"), std::string("//"),
                                    "/" + std::string(255, 'a'), std::string("/a\nb"), std::string("/\xc3\xa4")})
        EXPECT_FALSE(Streaming::IsUsableAddress(rBad)) << rBad;
    EXPECT_TRUE(Streaming::IsUsableAddress("/" + std::string(254, 'a')));
}

TEST(OscAddress, EndpointsAreUnderstood)
{
    static constexpr struct
    {
        const char* pText;
        const char* pExpected;
    } rows[] = {{"9000", "127.0.0.1 9000"},
                {"0.0.0.0:1", "0.0.0.0 1"},
                {"[::1]:65535", "::1 65535"},
                {"host:7", "host 7"},
                {"0", ""},
                {"65536", ""},
                {"9000x", ""},
                {"", ""},
                {":9000", ""},
                {"::1:9000", ""},
                {"[1]:9000", ""},
                {"-1", ""}};
    for (const auto& rRow : rows)
    {
        std::string address = "127.0.0.1";
        std::uint16_t port = 0;
        const bool bRead = Streaming::ReadOscEndpoint(rRow.pText, address, port);
        EXPECT_EQ(bRead ? address + " " + std::to_string(port) : "", rRow.pExpected) << rRow.pText;
    }
}

TEST(OscClock, TagsLieRelativeToTheFirstOfTheirSender)
{
    using std::chrono::milliseconds;
    Streaming::VOscClock clock;
    const auto at = [&](double i_Tag, int i_Arrival, std::uint64_t i_Sender)
    {
        const lo_timetag tag = TagAt(i_Tag);
        const auto time =
            clock.TimeOf(std::uint64_t{tag.sec} << 32 | tag.frac, milliseconds(i_Arrival), i_Sender) + milliseconds(0);
        return std::chrono::round<milliseconds>(time).count();
    };
    EXPECT_EQ(at(5.0, 1000, 1), 1000);
    EXPECT_EQ(at(5.25, 1900, 1), 1250) << "late on the way";
    EXPECT_EQ(at(900.0, 1950, 2), 1950) << "another clock";
    EXPECT_EQ(at(5.5, 1510, 1), 1500);
    EXPECT_EQ(clock.Restarts(), 0u);
    EXPECT_EQ(at(100.0, 2000, 1), 2000) << "the clock was set";
    EXPECT_EQ(at(100.5, 2490, 1), 2500);
    EXPECT_EQ(clock.Restarts(), 1u);
    EXPECT_EQ(clock.TimeOf(std::nullopt, milliseconds(7), 1), milliseconds(7));
    for (std::uint64_t sender = 10; sender < 1000; ++sender)
        at(static_cast<double>(sender), 3000, sender);
    EXPECT_EQ(at(2000.5, 3100, 5000), 3100) << "too many senders";
}

TEST(OscRate, TheFastestChannelTellsIt)
{
    static constexpr struct
    {
        double Rate;
        double Jitter; ///< seconds
        double Expected;
    } rows[] = {{100.0, 0.004, 100.0},    {119.88, 0.0, 120.0},    {59.94, 0.003, 60.0}, {33.3, 0.001, 33.3},
                {100.0 / 3.0, 0.0, 33.3}, {1000.0, 0.002, 1000.0}, {12.5, 0.01, 12.5},   {7.0, 0.0, 7.0}};
    for (const auto& rRow : rows)
    {
        std::mt19937 random(3);
        std::uniform_real_distribution<double> late(0.0, rRow.Jitter);
        Streaming::OscSamples samples;
        for (int i = 0; i < static_cast<int>(2.0 * rRow.Rate); ++i)
            for (std::uint32_t channel = 0; channel < 2; ++channel)
                if (channel == 0 || i % 4 == 0)
                    samples.Samples.push_back(
                        {std::chrono::duration_cast<Streaming::LocalTime>(
                             std::chrono::duration<double>(i / rRow.Rate + (rRow.Jitter > 0 ? late(random) : 0.0))),
                         channel, 0});
        EXPECT_NEAR(Streaming::MeasureRate(samples, 2), rRow.Expected, 1e-9) << rRow.Rate;
    }
    Streaming::OscSamples few;
    EXPECT_EQ(Streaming::MeasureRate(few, 0), 0.0);
    few.Samples.assign(5, {Streaming::LocalTime(5), 0, 0});
    EXPECT_EQ(Streaming::MeasureRate(few, 1), 0.0) << "all at once";
}

} // namespace StreamingTest
