#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace CoreGraphics
{

/// The hash of a shader variable's name, a type of its own so that it is not mistaken for a location.
enum class NameHash : std::uint32_t
{
};

namespace Detail
{

constexpr std::uint32_t MurmurScramble(std::uint32_t i_Word) noexcept
{
    return std::rotl(i_Word * 0xcc9e2d51u, 15) * 0x1b873593u;
}

/// Up to four bytes as a little-endian word, on every machine.
constexpr std::uint32_t LoadBytes(std::string_view i_Bytes) noexcept
{
    std::uint32_t word = 0;
    for (std::size_t i = 0; i < i_Bytes.size(); ++i)
        word |= static_cast<std::uint32_t>(static_cast<unsigned char>(i_Bytes[i])) << (8 * i);
    return word;
}

} // namespace Detail

/// MurmurHash3 (x86, 32 bits, seed 0) over the bytes of a name. Callers with a fixed set of uniforms compute the hashes
/// of their names at compile time and look the locations up without a text.
constexpr NameHash HashName(std::string_view i_Name) noexcept
{
    std::uint32_t hash = 0;
    const std::size_t wholeBytes = i_Name.size() & ~std::size_t{3};
    for (std::size_t i = 0; i < wholeBytes; i += 4)
    {
        hash ^= Detail::MurmurScramble(Detail::LoadBytes(i_Name.substr(i, 4)));
        hash = std::rotl(hash, 13) * 5u + 0xe6546b64u;
    }
    hash ^= Detail::MurmurScramble(Detail::LoadBytes(i_Name.substr(wholeBytes)));
    hash ^= static_cast<std::uint32_t>(i_Name.size());
    hash = (hash ^ (hash >> 16)) * 0x85ebca6bu;
    hash = (hash ^ (hash >> 13)) * 0xc2b2ae35u;
    return static_cast<NameHash>(hash ^ (hash >> 16));
}

} // namespace CoreGraphics
