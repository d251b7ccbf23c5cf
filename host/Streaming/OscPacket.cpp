#include "Streaming/OscPacket.h"

#include <lo/lo.h>

#include <cmath>
#include <cstring>
#include <limits>
#include <memory>
#include <type_traits>

namespace Streaming
{

namespace
{

constexpr std::string_view BundleMark{"#bundle\0", 8};
constexpr std::uint64_t AtOnce = 1; ///< the time tag that says no time

/// The library's handle is a void pointer in one version and one to a struct in another.
struct MessageDeleter
{
    using pointer = lo_message;
    void operator()(lo_message i_Message) const { lo_message_free(i_Message); }
};
using Message = std::unique_ptr<std::remove_pointer_t<lo_message>, MessageDeleter>;

std::uint64_t BigEndian(std::span<const std::byte> i_Bytes)
{
    std::uint64_t value = 0;
    for (const std::byte byte : i_Bytes)
        value = value << 8 | std::to_integer<std::uint64_t>(byte);
    return value;
}

/// A value that a float cannot hold is missing. The library gives arguments that are aligned to four bytes only.
template <typename T>
float Load(const void* i_pArgument, std::size_t& io_rOutOfRange)
{
    T value{};
    std::memcpy(&value, i_pArgument, sizeof(T));
    const auto wide = static_cast<double>(value);
    if (std::abs(wide) <= double{std::numeric_limits<float>::max()})
        return static_cast<float>(wide);
    io_rOutOfRange += std::isnan(wide) ? 0u : 1u;
    return std::numeric_limits<float>::quiet_NaN();
}

/// False for an argument that is no number.
bool ReadArgument(char i_Type, const void* i_pArgument, float& o_rValue, std::size_t& io_rOutOfRange)
{
    switch (i_Type)
    {
    case LO_FLOAT:
        o_rValue = Load<float>(i_pArgument, io_rOutOfRange);
        return true;
    case LO_INT32:
        o_rValue = Load<std::int32_t>(i_pArgument, io_rOutOfRange);
        return true;
    case LO_DOUBLE:
        o_rValue = Load<double>(i_pArgument, io_rOutOfRange);
        return true;
    case LO_INT64:
        o_rValue = Load<std::int64_t>(i_pArgument, io_rOutOfRange);
        return true;
    default:
        return false;
    }
}

std::string_view TextAt(std::span<const std::byte> i_Bytes)
{
    const std::string_view all(reinterpret_cast<const char*>(i_Bytes.data()), i_Bytes.size());
    return all.substr(0, all.find('\0'));
}

/// The letters of the arguments' types, with their comma; empty when there is no such text. They are looked at before
/// the library is asked, so that it never meets the lengths that a sender writes before texts and blobs.
std::string_view TypesOf(std::span<const std::byte> i_Message)
{
    const std::size_t behindAddress = TextAt(i_Message).size() / 4 * 4 + 4;
    if (behindAddress >= i_Message.size())
        return {};
    const std::string_view types = TextAt(i_Message.subspan(behindAddress));
    const bool bEnds = behindAddress + types.size() < i_Message.size();
    return bEnds && types.starts_with(',') ? types : std::string_view();
}

} // namespace

bool VOscPacketReader::Read(std::span<const std::byte> i_Packet, const Sink& i_rSink)
{
    return ReadPart(i_Packet, std::nullopt, 0, i_rSink);
}

bool VOscPacketReader::ReadPart(std::span<const std::byte> i_Part, std::optional<std::uint64_t> i_TimeTag, int i_Depth,
                                const Sink& i_rSink)
{
    if (i_Part.size() >= BundleMark.size() && std::memcmp(i_Part.data(), BundleMark.data(), BundleMark.size()) == 0)
        return i_Depth < DeepestBundle && ReadBundle(i_Part.subspan(BundleMark.size()), i_Depth, i_rSink);
    return ReadMessage(i_Part, i_TimeTag, i_rSink);
}

bool VOscPacketReader::ReadBundle(std::span<const std::byte> i_Bundle, int i_Depth, const Sink& i_rSink)
{
    if (i_Bundle.size() < 8)
        return false;
    std::optional<std::uint64_t> tag = BigEndian(i_Bundle.first(8));
    if (*tag == AtOnce)
        tag.reset();
    bool bWhole = true;
    for (auto rest = i_Bundle.subspan(8); !rest.empty();)
    {
        if (rest.size() < 4)
            return false;
        const std::uint64_t size = BigEndian(rest.first(4));
        rest = rest.subspan(4);
        if (size > rest.size())
            return false;
        bWhole &= ReadPart(rest.first(size), tag, i_Depth + 1, i_rSink);
        rest = rest.subspan(size);
    }
    return bWhole;
}

bool VOscPacketReader::ReadMessage(std::span<const std::byte> i_Message, std::optional<std::uint64_t> i_TimeTag,
                                   const Sink& i_rSink)
{
    OscMessage message{TextAt(i_Message), i_TimeTag, {}, 0, 0};
    const std::string_view types = TypesOf(i_Message);
    if (!message.Address.starts_with('/') || types.empty())
        return false;
    const std::size_t wrong = types.find_first_not_of("fidh", 1);
    if (wrong != std::string_view::npos)
    {
        message.WrongType = types[wrong];
        i_rSink(message);
        return true;
    }
    m_Copy.assign(i_Message.begin(), i_Message.end());
    int error = 0;
    const Message pMessage(lo_message_deserialise(m_Copy.data(), m_Copy.size(), &error));
    if (!pMessage)
        return false;
    m_Values.clear();
    lo_arg** ppArguments = lo_message_get_argv(pMessage.get());
    for (std::size_t i = 1; i < types.size(); ++i)
        if (float value = 0.0f; ReadArgument(types[i], ppArguments[i - 1], value, message.OutOfRange))
            m_Values.push_back(value);
    message.Values = m_Values;
    i_rSink(message);
    return true;
}

} // namespace Streaming
