#pragma once

#include <cstdint>
#include <string_view>

namespace TQL
{

inline constexpr std::uint64_t HashMultiplier = 0xc6a4a7935bd1e995ull;

/// The half of a round of HashMix that depends on the word alone, so that it can be looked up for a byte.
constexpr std::uint64_t HashSpread(std::uint64_t i_Value) noexcept
{
    i_Value *= HashMultiplier;
    i_Value ^= i_Value >> 47;
    return i_Value * HashMultiplier;
}

/// The other half: folds a spread word into the running hash.
constexpr std::uint64_t HashFold(std::uint64_t i_Hash, std::uint64_t i_Spread) noexcept
{
    return (i_Hash ^ i_Spread) * HashMultiplier + 0xe6546b64ull;
}

/// One round of a 64-bit Murmur-style mix: folds the word i_Value into the running hash i_Hash.
constexpr std::uint64_t HashMix(std::uint64_t i_Hash, std::uint64_t i_Value) noexcept
{
    return HashFold(i_Hash, HashSpread(i_Value));
}

/// The word that stands for a text in HashMix: its UTF-8 bytes as signed numbers, folded one by one from 0; 0 for the
/// empty text.
/// The value is written to files, so it never changes.
constexpr std::uint64_t HashText(std::string_view i_Text) noexcept
{
    std::uint64_t hash = 0;
    for (const char c : i_Text)
        hash = HashMix(hash, static_cast<std::uint64_t>(std::int64_t{static_cast<signed char>(c)}));
    return hash;
}

} // namespace TQL
