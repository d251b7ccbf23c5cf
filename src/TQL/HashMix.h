#pragma once

#include <cstdint>
#include <string_view>

namespace TQL
{

/// One round of a 64-bit Murmur-style mix: folds the word i_Value into the running hash i_Hash.
constexpr std::uint64_t HashMix(std::uint64_t i_Hash, std::uint64_t i_Value) noexcept
{
    constexpr std::uint64_t multiplier = 0xc6a4a7935bd1e995ull;
    i_Value *= multiplier;
    i_Value ^= i_Value >> 47;
    i_Value *= multiplier;
    i_Hash ^= i_Value;
    i_Hash *= multiplier;
    return i_Hash + 0xe6546b64ull;
}

/// The word that stands for a text in HashMix: its UTF-8 bytes folded one by one from 0; 0 for the empty text.
/// The value is written to files, so it never changes.
constexpr std::uint64_t HashText(std::string_view i_Text) noexcept
{
    std::uint64_t hash = 0;
    for (const char c : i_Text)
        hash = HashMix(hash, static_cast<unsigned char>(c));
    return hash;
}

} // namespace TQL
