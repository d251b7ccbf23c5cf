#pragma once

#include <cstdint>

namespace Simulation
{

/// Scrambles a 64-bit counter: neighbouring counters give unrelated words.
constexpr std::uint64_t Scramble(std::uint64_t i_Counter) noexcept
{
    i_Counter += 0x9e3779b97f4a7c15ull;
    i_Counter = (i_Counter ^ (i_Counter >> 30)) * 0xbf58476d1ce4e5b9ull;
    i_Counter = (i_Counter ^ (i_Counter >> 27)) * 0x94d049bb133111ebull;
    return i_Counter ^ (i_Counter >> 31);
}

/// A random word that depends on its arguments alone, so that any frame can be asked for at any time.
constexpr std::uint64_t Word(std::uint64_t i_Seed, std::uint64_t i_Stream, std::int64_t i_Counter) noexcept
{
    return Scramble(Scramble(i_Seed * 0x632be59bd9b4e019ull + i_Stream) ^ static_cast<std::uint64_t>(i_Counter));
}

/// Evenly spread over [0, 1).
constexpr double Uniform(std::uint64_t i_Word) noexcept
{
    return static_cast<double>(i_Word >> 11) * 0x1.0p-53;
}

/// Bell-shaped with mean 0 and standard deviation 1, never beyond 3.47: the sum of the word's four quarters.
constexpr double Bell(std::uint64_t i_Word) noexcept
{
    constexpr double quarterMean = 32767.5;
    constexpr double deviation = 65536.0 * 0.5773502691896258; // of a sum of four even spreads: width x sqrt(4 / 12)
    const auto quarter = [i_Word](int i_Shift)
    {
        return static_cast<double>((i_Word >> i_Shift) & 0xffffu);
    };
    return (quarter(0) + quarter(16) + quarter(32) + quarter(48) - 4.0 * quarterMean) / deviation;
}

} // namespace Simulation
