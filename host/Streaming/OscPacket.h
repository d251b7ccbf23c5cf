#pragma once

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string_view>
#include <vector>

namespace Streaming
{

/// One message of a packet; valid while the sink that gets it runs.
struct OscMessage
{
    std::string_view Address;
    std::optional<std::uint64_t> TimeTag; ///< seconds since 1900 in 32.32 bits; none outside bundles and for "at once"
    std::span<const float> Values;        ///< its arguments: 32 and 64 bit integers and reals
    char WrongType = 0;                   ///< the first argument that is no number; there are no values then
    std::size_t OutOfRange = 0;           ///< values that a float cannot hold, infinities among them: they are missing
};

/// Takes packets of Open Sound Control apart: single messages, and bundles of bundles and messages. Keeps memory for
/// the next packet. One thread at a time.
class VOscPacketReader
{
public:
    static constexpr int DeepestBundle = 8; ///< bundles in bundles

    using Sink = std::function<void(const OscMessage&)>;

    /// Hands the messages on in their order. False when any part of the packet is no message and no bundle; the parts
    /// before it, and those beside it in a bundle, are handed on all the same.
    bool Read(std::span<const std::byte> i_Packet, const Sink& i_rSink);

private:
    bool ReadPart(std::span<const std::byte> i_Part, std::optional<std::uint64_t> i_TimeTag, int i_Depth,
                  const Sink& i_rSink);
    bool ReadBundle(std::span<const std::byte> i_Bundle, int i_Depth, const Sink& i_rSink);
    bool ReadMessage(std::span<const std::byte> i_Message, std::optional<std::uint64_t> i_TimeTag, const Sink& i_rSink);

    std::vector<float> m_Values;
    std::vector<std::byte> m_Copy; // the library asks for bytes that it may write
};

} // namespace Streaming
